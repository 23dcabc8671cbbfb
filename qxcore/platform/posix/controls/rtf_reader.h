// Reads RTF 1.9.1, as Microsoft has published it, into a document.
//
// Bad input is read as far as it makes sense; nothing is refused. Groups may be nested to any depth: what is
// kept for open groups is a list on the heap, with one entry for any number of groups without formats of their
// own.
#pragma once

#include <string_view>

#include "qxcore/platform/posix/controls/document.h"

namespace platform::rich {

// Whether a text is RTF: it begins with "{\rtf" or "{\urtf".
bool IsRtf(std::u16string_view text);
bool IsRtf(std::string_view bytes);

// Replaces the document. Of a text of characters, those above 0x7F stand for themselves; bytes above 0x7F are in
// the code page of their font. Throws std::bad_alloc; the document is then undefined.
void ReadRtf(std::u16string_view text, Document& document);
void ReadRtf(std::string_view bytes, Document& document);

// Replaces the document by a plain text, as it is but for line ends, which become CR LF. Throws std::bad_alloc.
void ReadText(std::u16string_view text, Document& document);

}  // namespace platform::rich
