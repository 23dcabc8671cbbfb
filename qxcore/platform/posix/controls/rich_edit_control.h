// What a rich-edit control keeps in its window, and what its messages do. One file for each group of them.
//
// Positions of messages count the end of a paragraph as one character and the end of the last one, which the text does
// not hold, too; places are indexes into the document's text. All throw std::bad_alloc and leave the control as it was.
#pragma once

#include <optional>

#include "qxcore/platform/posix/controls/document.h"
#include "qxcore/platform/win32/rich_edit.h"

namespace platform::rich {

struct Control {
  Document document;
  std::size_t limit = 32767;  // characters of plain text
  int mode = TM_RICHTEXT;
  bool isModified = false;
  CHARRANGE selection = {0, 0};      // positions, in order
  std::optional<CharFormat> typing;  // of what is put into an empty selection next, when it was set

  Control();
  std::u16string_view Text() const { return document.text.View(); }
};

// A new content: nothing of it is selected or modified.
void SetDocument(Control& control, Document&& document);

// --- rich_edit_stream.cpp ---
LRESULT StreamIn(Control& control, WPARAM format, EDITSTREAM& stream);
LRESULT StreamOut(const Control& control, WPARAM format, EDITSTREAM& stream);

// --- rich_edit_selection.cpp ---
// The places between which the selection lies.
struct Span {
  std::size_t start, end;
};
Span SelectedSpan(const Control& control);
LRESULT SetSelection(Control& control, CHARRANGE range);  // returns its end
LRESULT GetSelectedText(const Control& control, WCHAR* buffer);
// Puts a part in the place of the selection, which is behind it then. Its formats are by the document's lists.
void ReplaceSelection(Control& control, const Document& part);
void ReplaceSelection(Control& control, const WCHAR* text);

// --- rich_edit_format.cpp ---
LRESULT GetCharFormat(const Control& control, CHARFORMATW& format);
LRESULT SetCharFormat(Control& control, WPARAM which, const CHARFORMATW& format);

}  // namespace platform::rich
