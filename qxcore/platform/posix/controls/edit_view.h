// What an edit control keeps, and where its text is on the screen.
#pragma once

#include "qxcore/platform/posix/controls/edit_text.h"
#include "qxcore/platform/posix/controls/painting.h"

namespace platform::controls {

inline constexpr int kUsualLimit = 30000, kHighestLimit = 0x7FFFFFFE;

struct Edit : model::OnModelHeap {
  EditText text;
  HFONT font = nullptr;
  int limit = kUsualLimit;
  int firstLine = 0, scrolled = 0;  // what is at the top left, in lines and pixels
  int leftMargin = 0, rightMargin = 0;
  WCHAR password = 0;
  bool isModified = false, hasFocus = false;
};

inline bool IsMultiline(HWND window) { return StyleOf(window) & ES_MULTILINE; }
inline bool IsReadOnly(HWND window) { return StyleOf(window) & ES_READONLY; }

// A context with the control's font, for as long as it is needed.
class Measure {
 public:
  explicit Measure(const Edit* edit)
      : m_dc(GetDC(nullptr)), m_old(SelectObject(m_dc, edit->font != nullptr ? edit->font : InterfaceFont())) {
    GetTextMetricsW(m_dc, &m_metrics);
  }
  ~Measure() {
    SelectObject(m_dc, m_old);
    ReleaseDC(nullptr, m_dc);
  }
  int LineHeight() const { return m_metrics.tmHeight; }
  int Width(const WCHAR* text, int count) const {
    SIZE size{};
    GetTextExtentPoint32W(m_dc, text, count, &size);
    return size.cx;
  }

 private:
  HDC m_dc;
  HGDIOBJ m_old;
  TEXTMETRICW m_metrics{};
};

// The part of the client area that shows text.
RECT TextRect(HWND window, const Edit* edit);
// The place of a position in the client area.
POINT PointOf(HWND window, const Edit* edit, int position);
// The position whose left edge is nearest.
int PositionAt(HWND window, const Edit* edit, POINT point);
void PaintEdit(HWND window, const Edit* edit, HDC dc);

}  // namespace platform::controls
