// Encodings and policies as arguments.
#pragma once

#include <string>
#include <string_view>

#include "qxcore/stream/encoding/multi_format_support.h"

using Encodings = SAbstractIO::SMultiFormatSupport;
using Encoding = Encodings::Encoding;

// The encoding that the text names: all of it must be a name of the table and suffixes of the policy
// behind it. Throws Failure with the exit code for wrong usage; `option` says where the text stood.
Encoding EncodingOf(std::string_view text, const char* option);

// The policy for Unicode: by the published standards, or as the library does by itself.
inline Encoding UnicodePolicy(bool isFull) { return isFull ? Encodings::kFullUnicode : Encoding{0}; }

// Throws Failure when this machine lacks the encoding's code page.
void RequireOnThisMachine(Encoding encoding);

// What is shown for an encoding that was found: its name, "(XML)" behind it for such a file.
SString ShownName(Encoding encoding);

// The part of a selected encoding that says what the bytes are, without the policy of the request.
Encoding ShownValue(Encoding encoding);
