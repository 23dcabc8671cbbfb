// Where a user's programs keep things, as the XDG base directories have it.
#pragma once

#include <string>

namespace platform {

// $XDG_DATA_HOME and $XDG_CONFIG_HOME where they are absolute, else .local/share and .config in the user's
// home, which is $HOME or what the user database says. Without a slash at the end; they need not exist.
std::string UserDataFolder();
std::string UserConfigurationFolder();

// Makes the folders on the way to a file that are missing, for the user alone. Whether they are there then is for
// the next step to find out.
void MakeFoldersOf(const std::string& path);

}  // namespace platform
