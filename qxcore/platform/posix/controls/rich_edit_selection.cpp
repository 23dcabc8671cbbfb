// The selection of rich-edit controls.

#include "qxcore/platform/posix/controls/document_edit.h"
#include "qxcore/platform/posix/controls/rich_edit_control.h"
#include "qxcore/platform/posix/controls/rtf_reader.h"

namespace platform::rich {
namespace {

LONG CountPositions(std::u16string_view text) {
  return static_cast<LONG>(text.size() - static_cast<std::size_t>(std::count(text.begin(), text.end(), u'\n')));
}

std::size_t PlaceOf(std::u16string_view text, LONG position) {
  std::size_t place = 0;
  for (; position > 0 && place < text.size(); --position) place += text[place] == '\r' ? 2 : 1;
  return std::min(place, text.size());
}

}  // namespace

Span SelectedSpan(const Control& control) {
  const std::u16string_view text = control.Text();
  const std::size_t start = PlaceOf(text, control.selection.cpMin);
  return {start, start + PlaceOf(text.substr(start), control.selection.cpMax - control.selection.cpMin)};
}

LRESULT SetSelection(Control& control, CHARRANGE range) {
  const LONG end = CountPositions(control.Text()) + 1;
  if (range.cpMin < 0) range.cpMin = range.cpMax = control.selection.cpMax;
  if (range.cpMax < 0) range.cpMax = end;
  // Without a text behind it the last paragraph's end is only selected together with something in front of it.
  const LONG first = std::min({range.cpMin, range.cpMax, end - 1});
  const LONG last = std::min(std::max(range.cpMin, range.cpMax), end);
  control.selection = {first, range.cpMin == range.cpMax ? first : last};
  control.typing.reset();
  return control.selection.cpMax;
}

LRESULT GetSelectedText(const Control& control, WCHAR* buffer) {
  const Span span = SelectedSpan(control);
  WCHAR* to = buffer;
  for (const char16_t c : control.Text().substr(span.start, span.end - span.start)) {
    if (c != '\n') *to++ = c;
  }
  *to = 0;
  return to - buffer;
}

void ReplaceSelection(Control& control, const Document& part) {
  const Span span = SelectedSpan(control);
  ReplacePart(control.document, span.start, span.end, part);
  const LONG behind = control.selection.cpMin + CountPositions(part.text.View());
  control.selection = {behind, behind};
  control.typing.reset();
  control.isModified = true;
}

// The text gets the format of what it replaces, or of the character in front of it.
void ReplaceSelection(Control& control, const WCHAR* text) {
  const Span span = SelectedSpan(control);
  const std::size_t model = span.start < span.end || span.start == 0 ? span.start : span.start - 1;
  Document part;
  ReadText(text != nullptr ? text : u"", part);
  part.characters.front().format = control.typing.value_or(FormatAt(control.document.characters, model));
  part.paragraphs.front().format = FormatAt(control.document.paragraphs, span.start);
  ReplaceSelection(control, part);
}

}  // namespace platform::rich
