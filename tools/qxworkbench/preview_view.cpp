#include "tools/qxworkbench/preview_view.h"

#include <algorithm>

#include "qxcore/graphics/color.h"
#include "qxcore/ui/app/ui_font.h"
#include "qxcore/ui/window/message_entries.h"
#include "tools/common/utf8.h"

QXCORE_IMPLEMENT_MESSAGE_MAP(PreviewView, LineView, on<WM_KEYDOWN, &PreviewView::OnKeyDown>(),
                             on<WM_SHOWWINDOW, &PreviewView::OnShowWindow>())

namespace {

constexpr std::size_t kTabStops = 8;  // columns
constexpr int kMargin = 4;

// The line as it is drawn: tabs go to the next stop, other control characters are blanks.
SString Drawable(SStringView line) {
  SString text;
  for (const WCHAR c : line) {
    if (c == '\t') {
      do text += WCHAR{' '};
      while (static_cast<std::size_t>(text.Length()) % kTabStops != 0);
    } else {
      text += c < ' ' ? WCHAR{' '} : c;
    }
  }
  return text;
}

// What the heading fades to: the second colour of captions, or where both are one, something away from the text's.
COLORREF SecondHeadingColor() {
  const COLORREF first = ::GetSysColor(COLOR_ACTIVECAPTION), second = ::GetSysColor(COLOR_GRADIENTACTIVECAPTION);
  if (first != second) return second;
  double hue = 0, saturation = 0, lightness = 0;
  SColor(::GetSysColor(COLOR_CAPTIONTEXT)).GetHSLColor(&hue, &saturation, &lightness);
  return SColor::GetMediumColor(first, lightness < 0.5 ? SColor::White : SColor::Black, 6, 10);
}

}  // namespace

PreviewView::PreviewView(const SString& name, const std::string& native, Encoding detected)
    : m_name(name), m_native(native), m_detected(detected) {
  m_text.Open(native, detected & Encodings::kValueMask);
}

HFONT PreviewView::MakeFont(int dpi) {
  m_fixed.LoadFixedUIFont(static_cast<unsigned>(dpi));
  return m_fixed;
}

bool PreviewView::Step() {
  if (m_wasShown && HasScrollBars()) {
    m_wasShown = false;
    SetScrollBarsAnew();
  }
  if (m_text.IsComplete() && m_rowsShown == m_text.LineCount()) return false;
  const bool goesOn = m_text.Step();
  const bool fillsWindow = m_rowsShown <= FirstRow() + PageRows();
  m_rowsShown = m_text.LineCount();
  if (fillsWindow || !goesOn) Invalidate(0);
  if (!goesOn) UpdateWindow();  // how wide the lines are shows when they are drawn
  RowsChanged();
  return goesOn;
}

void PreviewView::Show(Encoding encoding) {
  m_text.Open(m_native, encoding & Encodings::kValueMask);
  m_rowsShown = 0;
  ScrollTo(0);
  Invalidate(0);
}

void PreviewView::SetDetected(Encoding detected) {
  m_detected = detected;
  Show(detected);
}

void PreviewView::GoToPart(int part) {
  m_text.GoToPart(part);
  m_rowsShown = 0;
  ScrollTo(0);
  Invalidate(0);
}

// --- painting ---

SString PreviewView::Heading() const {
  SString text = m_name + WTEXT("  \u2013  ") + ShownName(m_text.GetEncoding());
  if (m_text.Part() > 0 || m_text.HasNextPart()) text += FromUtf8("  (part " + std::to_string(m_text.Part() + 1) + ")");
  if (!m_text.Warning().IsEmpty()) text += WTEXT("  \u2013  ") + m_text.Warning();
  if (!m_text.Error().empty()) text += WTEXT("  \u2013  ") + FromUtf8(m_text.Error());
  return text;
}

void PreviewView::DrawHead(SDC* dc, const SRect& rect) {
  SDrawGradient gradient;
  gradient.SetGradient(SDrawGradient::VERT, ::GetSysColor(COLOR_ACTIVECAPTION), SecondHeadingColor(), rect);
  SDrawBackground(gradient).Draw(*dc, rect);
  const SSelectObject font(*dc, SGetDefaultUIFont(static_cast<int>(::GetDpiForWindow(m_hWnd))));
  dc->SetTextColor(::GetSysColor(COLOR_CAPTIONTEXT));
  const int mode = dc->SetBkMode(TRANSPARENT);
  SRect inner(rect.left + Scaled(kMargin), rect.top, rect.right - Scaled(kMargin), rect.bottom);
  dc->DrawTextW(Heading(), inner, DT_LEFT | DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX | DT_END_ELLIPSIS);
  dc->SetBkMode(mode);
}

void PreviewView::DrawRow(SDC* dc, int row, const SRect& rect) {
  const SString text = Drawable(m_text.Line(row));
  dc->SetBkColor(::GetSysColor(COLOR_WINDOW));
  dc->SetTextColor(::GetSysColor(COLOR_WINDOWTEXT));
  dc->ExtTextOutW(rect.left + Scaled(kMargin) - Left(), rect.top + Scaled(1), ETO_OPAQUE | ETO_CLIPPED, &rect, text);
  const int width = dc->GetTextExtent(text).cx;
  if (width <= m_widest) return;
  m_widest = width;
  m_rowsShown = -1;
  PostMessageW(WM_NULL);  // idle work follows, which sets the scroll bar
}

// The scroll bars are the tab window's: idle work gives them this view's numbers when it is the one they serve.
void PreviewView::OnShowWindow(int show, UINT why) {
  LineView::OnShowWindow(show, why);
  m_wasShown |= show != 0;
}

void PreviewView::OnKeyDown(UINT key, UINT repeat, UINT flags) {
  const bool isControl = ::GetKeyState(VK_CONTROL) < 0;
  if (isControl && key == VK_DOWN) return GoToPart(m_text.Part() + 1);
  if (isControl && key == VK_UP) return GoToPart(m_text.Part() - 1);
  LineView::OnKeyDown(key, repeat, flags);
}
