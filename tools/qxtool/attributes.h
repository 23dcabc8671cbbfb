// File attributes as the tool writes and reads them.
#pragma once

#include <string>
#include <string_view>
#include <vector>

// The attributes that the text names: letters in any case (r read-only, h hidden, s system, d folder,
// a archive, v device, l link) or one number, "0x" in front of it for hexadecimal. Throws Failure with the exit
// code for wrong usage; `option` says where the text stood.
unsigned long AttributesOf(std::string_view text, const char* option);

// The names of the attributes that are set, in the order of their values.
std::vector<std::string> AttributeNames(unsigned long attributes);
