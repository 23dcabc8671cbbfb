// Texts on the clipboard, for controls that cut, copy and paste.
#pragma once

#include "qxcore/platform/posix/window/memory.h"

namespace platform::controls {

// Replaces the clipboard's content; false when another has it open or memory is out.
bool CopyToClipboard(HWND owner, const model::Text& text);
// The clipboard's text; empty without one. Throws std::bad_alloc.
model::Text TextOfClipboard(HWND reader);

}  // namespace platform::controls
