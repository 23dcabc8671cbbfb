// Folders that cannot be searched, in words for the user.
#pragma once

#include <string>

#include "qxcore/string/string.h"

// The whole path of a folder that is to be searched. Throws Failure when there is no such folder, and when its path is
// too long for a search.
SString FolderToSearch(const SString& given);

// Why a search could not read a folder: a sentence for a path that is too long, else what the system says.
std::string WhyNotSearched(const SString& folder, unsigned long error);

// A path as the system spells it; without its middle when it is longer than a line.
std::string ShortenedPath(const SString& path);
