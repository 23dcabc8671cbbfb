// Writes a document as RTF 1.9.1, as Microsoft has published it: ASCII alone, characters above it as
// \u with the substitute "?".
#pragma once

#include <string>

#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {

// Replaces `rtf`. Throws std::bad_alloc.
void WriteRtf(const Document& document, std::string& rtf);

}  // namespace platform::rich
