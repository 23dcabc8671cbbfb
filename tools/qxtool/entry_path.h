// Where an entry of an archive may be written: below a folder, whatever its name says.
#pragma once

#include <string>
#include <vector>

#include "qxcore/string/string.h"

// The parts of an entry's name in UTF-8, folders first; none for a name of no parts ("./"). Slashes and backslashes
// separate parts, "." and empty parts are left out. Throws Failure for what could lead elsewhere, on any
// system: a name that begins with a separator; a part that is "..", or of dots and spaces only, which some
// systems cut off; a colon, which names a drive or a hidden stream; a name that a system keeps for a device.
std::vector<std::string> PartsOfEntry(const SString& name);

// The path of a folder for the first parts below `root`, made where it is missing. Throws Failure when a link or
// a file is in the way.
std::string FolderForParts(const std::string& root, const std::vector<std::string>& parts, std::size_t count);

// Throws Failure when the path cannot become a plain file: a link or a folder is there, or, unless files may be
// replaced, anything.
void RequireFileCanBeAt(const std::string& path, bool mayReplace);

// A name of an archive for the screen: control characters, which could steer it, become "?".
std::string Shown(const SString& name);
