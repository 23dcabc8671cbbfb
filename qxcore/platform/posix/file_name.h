// From names of Windows to those of the file system, and back.
//
// Names are UTF-8. A byte that belongs to no valid sequence, or that Windows allows in no name (control
// characters and "*:<>?|\), stands in a Windows name as U+F000 plus the byte and is turned back; so is
// every byte of a real character U+F000 to U+F0FF. An unpaired surrogate is written as its three bytes.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>

#include "qxcore/platform/win32.h"

namespace platform {

// One name, without separators.
std::string ToFileSystemName(std::u16string_view name);
std::u16string ToWindowsName(std::string_view name);
// The same into a buffer with room for as many characters as the name has bytes. Returns the length.
std::size_t ToWindowsName(std::string_view name, WCHAR* buffer);
// Appends a name in the file system's bytes.
void AppendName(std::string& bytes, std::u16string_view name);

// True for the characters of ASCII that a name of either kind holds as they are.
bool StandsForItself(char16_t c);

}  // namespace platform
