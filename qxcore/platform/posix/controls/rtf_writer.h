// Writes a document as RTF, version 1.9.1 of the published specification: ASCII alone, characters above it as
// \u with the substitute "?".
#pragma once

#include <string>

#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {

// Replaces `rtf`. Throws std::bad_alloc.
void WriteRtf(const Document& document, std::string& rtf);

}  // namespace platform::rich
