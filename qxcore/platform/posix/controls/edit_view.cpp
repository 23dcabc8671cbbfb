#include "qxcore/platform/posix/controls/edit_view.h"

#include <utility>

#include "qxcore/platform/posix/window/send.h"

namespace platform::controls {
namespace {

using model::OrNoMemory;
using model::Send;
using model::Text;

// What is seen of a line.
Text Shown(const Edit* edit, int line) {
  const Text part = edit->text.All().substr(static_cast<std::size_t>(std::max(edit->text.LineStart(line), 0)),
                                            static_cast<std::size_t>(edit->text.LineLength(line)));
  return edit->password != 0 ? Text(part.size(), edit->password) : part;
}

void PaintLine(HDC dc, const Edit* edit, const Measure& measure, int line, int x, int y) {
  const Text shown = Shown(edit, line);
  const int start = edit->text.LineStart(line), length = static_cast<int>(shown.size());
  TextOutW(dc, x, y, shown.data(), length);
  if (!edit->hasFocus || !edit->text.HasSelection()) return;
  const int first = std::clamp(edit->text.First() - start, 0, length);
  const int last = std::clamp(edit->text.Last() - start, 0, length);
  if (first >= last) return;
  const COLORREF oldText = SetTextColor(dc, GetSysColor(COLOR_HIGHLIGHTTEXT));
  const COLORREF oldBack = SetBkColor(dc, GetSysColor(COLOR_HIGHLIGHT));
  const int oldMode = SetBkMode(dc, OPAQUE);
  TextOutW(dc, x + measure.Width(shown.data(), first), y, shown.data() + first, last - first);
  SetBkMode(dc, oldMode);
  SetBkColor(dc, oldBack);
  SetTextColor(dc, oldText);
}

}  // namespace

RECT TextRect(HWND window, const Edit* edit) {
  RECT rect;
  GetClientRect(window, &rect);
  rect.left += edit->leftMargin + 1;
  rect.right -= edit->rightMargin + 1;
  rect.top += 1;
  return rect;
}

POINT PointOf(HWND window, const Edit* edit, int position) {
  const Measure measure(edit);
  const RECT rect = TextRect(window, edit);
  const int line = edit->text.LineOf(position);
  const Text shown = Shown(edit, line);
  const int column = std::min(position - edit->text.LineStart(line), static_cast<int>(shown.size()));
  return {rect.left - edit->scrolled + measure.Width(shown.data(), column),
          rect.top + (line - edit->firstLine) * measure.LineHeight()};
}

int PositionAt(HWND window, const Edit* edit, POINT point) {
  const Measure measure(edit);
  const RECT rect = TextRect(window, edit);
  const int height = std::max(measure.LineHeight(), 1);
  const int offset = point.y - rect.top;
  const int line = std::clamp(edit->firstLine + (offset >= 0 ? offset / height : -1), 0, edit->text.LineCount() - 1);
  const Text shown = Shown(edit, IsMultiline(window) ? line : 0);
  const int x = point.x - rect.left + edit->scrolled;
  int before = 0;
  for (int column = 0; column < static_cast<int>(shown.size()); ++column) {
    const int after = measure.Width(shown.data(), column + 1);
    if (x < (before + after) / 2) return edit->text.LineStart(line) + column;
    before = after;
  }
  return edit->text.LineStart(line) + static_cast<int>(shown.size());
}

void PaintEdit(HWND window, const Edit* edit, HDC dc) {
  OrNoMemory<int>(0, [&] {
    const bool isField = IsWindowEnabled(window) && !IsReadOnly(window);
    const auto brush = reinterpret_cast<HBRUSH>(Send(GetParent(window), isField ? WM_CTLCOLOREDIT : WM_CTLCOLORSTATIC,
                                                     reinterpret_cast<WPARAM>(dc), reinterpret_cast<LPARAM>(window)));
    RECT client;
    GetClientRect(window, &client);
    if (brush != nullptr) FillRect(dc, &client, brush);
    const RECT rect = TextRect(window, edit);
    const HGDIOBJ old = SelectObject(dc, edit->font != nullptr ? edit->font : InterfaceFont());
    if (!IsWindowEnabled(window)) SetTextColor(dc, GetSysColor(COLOR_GRAYTEXT));
    const int oldMode = SetBkMode(dc, TRANSPARENT);
    const Measure measure(edit);
    int y = rect.top;
    for (int line = edit->firstLine; line < edit->text.LineCount() && y < rect.bottom; ++line) {
      PaintLine(dc, edit, measure, line, rect.left - edit->scrolled, y);
      y += measure.LineHeight();
    }
    SetBkMode(dc, oldMode);
    SelectObject(dc, old);
    return 0;
  });
}

}  // namespace platform::controls
