#include "qxcore/platform/posix/user_folders.h"

#include <pwd.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>

namespace platform {
namespace {

std::string Home() {
  const char* home = std::getenv("HOME");
  if (home != nullptr && *home != 0) return home;
  passwd entry;
  passwd* found = nullptr;
  char texts[4096];
  return getpwuid_r(geteuid(), &entry, texts, sizeof texts, &found) == 0 && found != nullptr ? found->pw_dir : "";
}

std::string Folder(const char* variable, const char* inHome) {
  const char* folder = std::getenv(variable);
  return folder != nullptr && folder[0] == '/' ? folder : Home() + inHome;
}

}  // namespace

std::string UserDataFolder() { return Folder("XDG_DATA_HOME", "/.local/share"); }

std::string UserConfigurationFolder() { return Folder("XDG_CONFIG_HOME", "/.config"); }

void MakeFoldersOf(const std::string& path) {
  for (std::size_t slash = path.find('/', 1); slash != std::string::npos; slash = path.find('/', slash + 1))
    mkdir(path.substr(0, slash).c_str(), 0700);
}

}  // namespace platform
