// Tabs: inserting, choosing, measuring, scrolling.

#include "qxcore/ui/layout/tab_beam.h"

#include <memory>

#include "qxcore/ui/app/internal/scaled_pixels.h"
#include "qxcore/ui/window/message_entries.h"
#include "qxcore/ui/window/thread_state.h"

QXCORE_IMPLEMENT_CREATABLE_CLASS(STabBeam, SWnd, 2)

QXCORE_IMPLEMENT_MESSAGE_MAP(
    STabBeam, SWnd, on<WM_CREATE, &STabBeam::OnCreate>(), on<WM_DESTROY, &STabBeam::OnDestroy>(),
    on<WM_SIZE, &STabBeam::OnSize>(), on<WM_PAINT, &STabBeam::OnPaint>(), on<WM_ERASEBKGND, &STabBeam::OnEraseBkgnd>(),
    on<WM_LBUTTONDOWN, &STabBeam::OnLButtonDown>(), on<WM_LBUTTONUP, &STabBeam::OnLButtonUp>(),
    on<WM_LBUTTONDBLCLK, &STabBeam::OnLButtonDblClk>(), on<WM_MOUSEMOVE, &STabBeam::OnMouseMove>(),
    on<WM_CAPTURECHANGED, &STabBeam::OnCaptureChanged>(), on<WM_TIMER, &STabBeam::OnTimer>(),
    on<WM_KEYDOWN, &STabBeam::OnKeyDown>(), on<WM_GETDLGCODE, &STabBeam::OnGetDlgCode>(),
    on<WM_SETFOCUS, &STabBeam::OnSetFocus>(), on<WM_KILLFOCUS, &STabBeam::OnKillFocus>(),
    on<WM_SETFONT, &STabBeam::OnSetFont>(), on<WM_SYSCOLORCHANGE, &STabBeam::OnSysColorChange>(),
    on<WM_SETTINGCHANGE, &STabBeam::OnWinIniChange>(), on<0x02E0 /* WM_DPICHANGED */, &STabBeam::OnDpiChanged>(),
    on<0x02E3 /* WM_DPICHANGED_AFTERPARENT */, &STabBeam::OnDpiChangedAfterParent>(),
    on<WM_GETOBJECT, &STabBeam::OnGetObject>())

static constexpr int kMostSpacing = 0xFFFF;

STabBeam::STabBeam() = default;

STabBeam::~STabBeam() {
  for (STab* tab : m_tabs) delete tab;
}

// --- creation ---

int STabBeam::Create(SWnd* parent, DWORD style, UINT id) {
  return Create(nullptr, nullptr, style, SRect(), parent, id, nullptr);
}

int STabBeam::PreCreateWindow(CREATESTRUCTW* create) {
  if (create->lpszClass == nullptr) {
    create->lpszClass = SRegisterWindowClass(CS_DBLCLKS, ::LoadCursorW(nullptr, IDC_ARROW));
  }
  return SWnd::PreCreateWindow(create);
}

int STabBeam::OnCreate(CREATESTRUCTW* create) {
  if (SWnd::OnCreate(create) == -1) return -1;
  ChangeDpi(static_cast<int>(::GetDpiForWindow(m_hWnd)));
  if (m_font.GetSafeHandle() == nullptr) MakeFonts();
  ReadButtonSize();
  return 0;
}

void STabBeam::OnDestroy() {
  StopAutoMove();
  m_measure.DeleteDC();
  m_measuredFont = nullptr;
  SWnd::OnDestroy();
}

// --- tabs ---

int STabBeam::InsertTab(int index, LPCWSTR text, SWnd* window, int width) {
  if (index < 0 || index > m_count) return -1;
  std::unique_ptr<STab> tab(new STab(window, text));
  if (width >= 0) tab->m_width = width;
  m_tabs.Insert(index, tab.get());
  tab.release();
  ++m_count;
  if (width < 0) {
    AdjustTabSize(index);
  } else {
    Repaint();
  }
  if (m_current < 0) {
    m_current = index;
    EnsureVisible(index);
  } else if (index <= m_current) {
    ++m_current;
  }
  return index;
}

int STabBeam::DeleteTab(int index) {
  if (!IsTab(index)) return 0;
  delete m_tabs[index];
  m_tabs.Remove(index);
  --m_count;
  if (index < m_current || m_current == m_count) --m_current;
  m_first = std::clamp(m_first, 0, std::max(m_count - 1, 0));
  Repaint();
  return 1;
}

int STabBeam::FindTab(const SWnd* window) {
  for (int i = 0; i < m_count; ++i) {
    if (std::as_const(m_tabs)[i]->m_window == window) return i;
  }
  return -1;
}

const SString& STabBeam::GetTabText(int index) const {
  static const SString none;
  return IsTab(index) ? m_tabs[index]->m_text : none;
}

SWnd* STabBeam::GetTabWindow(int index) const { return IsTab(index) ? m_tabs[index]->m_window : nullptr; }

int STabBeam::SetTabText(int index, LPCWSTR text) {
  if (!IsTab(index)) return 0;
  m_tabs[index]->m_text = text != nullptr ? text : WTEXT("");
  AdjustTabSize(index);
  return 1;
}

void STabBeam::SetTabEmpty(int index, int empty) {
  if (!IsTab(index) || GetTabEmpty(index) == (empty != 0)) return;
  m_tabs[index]->m_hasContent = empty == 0;
  AdjustTabSize(index);
}

int STabBeam::GetTabEmpty(int index) const { return IsTab(index) && !m_tabs[index]->m_hasContent; }

// --- choosing ---

int STabBeam::SetCurSel(int index) {
  if (!IsTab(index)) return 0;
  const int former = std::exchange(m_current, index);
  EnsureVisible(index);
  if (former != index) Repaint();
  return former != index;
}

LRESULT STabBeam::Notify(int code, int tab, int former) {
  STabBeamNotify record = {};
  record.m_header.hwndFrom = m_hWnd;
  record.m_header.idFrom = static_cast<UINT_PTR>(GetDlgCtrlID());
  record.m_header.code = static_cast<UINT>(code);
  record.m_tab = tab;
  record.m_former = former;
  record.m_window = GetTabWindow(tab);
  return SSent(
      ::SendMessageW(::GetParent(m_hWnd), WM_NOTIFY, record.m_header.idFrom, reinterpret_cast<LPARAM>(&record)));
}

// Whoever hears of it may delete tabs and the beam.
int STabBeam::ChooseTab(int index) {
  if (!IsTab(index) || index == m_current) return 0;
  const HWND window = m_hWnd;
  const int former = m_current;
  if (window != nullptr && Notify(kSTabChanging, index, former) != 0) return 0;
  if (window != nullptr && FromHandlePermanent(window) != this) return 0;
  if (!SetCurSel(index)) return 0;
  if (window != nullptr) Notify(kSTabChanged, index, former);
  return 1;
}

int STabBeam::SwitchToTab(SPoint point) {
  const int tab = CalcTabFromOffset(point.x);
  if (tab >= 0) ChooseTab(tab);
  return tab;
}

// --- geometry ---

STabStrip STabBeam::Strip() const {
  const int width = m_hWnd != nullptr ? GetClientRect().Width() : 0;
  return {m_tabs.GetArray(), m_count, m_first, m_spacing, m_buttons.TabOrigin(), width};
}

int STabBeam::CalcTabOffset(int index) { return Strip().Offset(index); }
int STabBeam::CalcTabFromOffset(int x) { return Strip().TabAt(x); }

SRect STabBeam::GetTabRect(int index) const {
  if (!IsTab(index)) return SRect();
  const STabStrip strip = Strip();
  return SRect(strip.Offset(index), 0, strip.RightEdge(index), GetClientRect().bottom);
}

void STabBeam::AdjustTabSize(int index) {
  if (!IsTab(index)) return;
  if (m_font.GetSafeHandle() == nullptr) MakeFonts();
  if (m_measure.GetSafeHdc() == nullptr) m_measure.Attach(::CreateCompatibleDC(nullptr));
  STab& tab = *m_tabs[index];
  const HGDIOBJ font = tab.m_hasContent ? m_font.GetSafeHandle() : m_emptyFont.GetSafeHandle();
  if (std::exchange(m_measuredFont, font) != font) ::SelectObject(m_measure.GetSafeHdc(), font);
  tab.m_width = m_measure.GetTextExtent(tab.m_text).cx + m_spacing;
  Repaint();
}

void STabBeam::MeasureAll() {
  for (int i = 0; i < m_count; ++i) AdjustTabSize(i);
}

void STabBeam::SetSpacing(int spacing) {
  m_spacing = std::clamp(spacing, 0, kMostSpacing);
  MeasureAll();
}

void STabBeam::EnsureVisible(int index) {
  if (!IsTab(index)) return;
  const int first = Strip().FirstThatShows(index);
  if (first == m_first) return;
  m_first = first;
  Repaint();
}

void STabBeam::SetFirstVisible(int index) {
  const int first = std::clamp(index, 0, std::max(m_count - 1, 0));
  if (first == m_first) return;
  m_first = first;
  Repaint();
}

void STabBeam::SetScrollButtons(int show, int twoOnly) {
  m_buttons.Show(show, twoOnly);
  Repaint();
}

int STabBeam::ScrollBtnHit(SPoint point, int only) {
  const int button = m_buttons.At(point);
  if (only != kSTabNoButton && button != only) return kSTabNoButton;
  return STabCanScroll(Strip(), button) ? button : kSTabNoButton;
}

void STabBeam::Scroll(int button) { SetFirstVisible(STabScrollTarget(Strip(), button)); }

// --- fonts and sizes ---

// The font that is described, the usual one for null; and the same for empty tabs.
void STabBeam::MakeFonts(const LOGFONTW* given) {
  m_measure.DeleteDC();  // it holds one of the former fonts
  m_measuredFont = nullptr;
  if (given != nullptr) {
    m_font.CreateFontIndirectW(given);
  } else {
    m_font.LoadDefaultUIFont(static_cast<unsigned int>(m_dpi));
  }
  LOGFONTW description;
  if (!m_font.GetLogFont(&description)) return;
  description.lfItalic = TRUE;
  m_emptyFont.CreateFontIndirectW(&description);
}

void STabBeam::ReadButtonSize() { m_buttons.SetSize(::GetSystemMetricsForDpi(SM_CXHSCROLL, static_cast<UINT>(m_dpi))); }

// A font that the program gave stays, in the size of the new resolution.
void STabBeam::ChangeDpi(int dpi) {
  if (dpi <= 0 || dpi == m_dpi) return;
  const int former = std::exchange(m_dpi, dpi);
  m_spacing = std::min(SScaledPixels(m_spacing, dpi, former), kMostSpacing);
  LOGFONTW description;
  const bool staysGiven = m_hasGivenFont && m_font.GetLogFont(&description);
  if (staysGiven) description.lfHeight = SScaledPixels(description.lfHeight, dpi, former);
  MakeFonts(staysGiven ? &description : nullptr);
  MeasureAll();
}

// The fonts are copies, so the caller's may go. Without a font the usual one comes back.
LRESULT STabBeam::OnSetFont(WPARAM wParam, LPARAM) {
  LOGFONTW description;
  m_hasGivenFont = ::GetObjectW(reinterpret_cast<HGDIOBJ>(wParam), sizeof description, &description) != 0;
  MakeFonts(m_hasGivenFont ? &description : nullptr);
  MeasureAll();
  return 0;
}

void STabBeam::OnWinIniChange(UINT what, LPCWSTR area) {
  SWnd::OnSettingChange(what, area);
  const int former = m_buttons.m_width;
  ReadButtonSize();
  if (m_buttons.m_width == former) return;
  if (!m_hasGivenFont) MakeFonts();
  MeasureAll();
  Repaint();
}

LRESULT STabBeam::OnDpiChanged(WPARAM wParam, LPARAM) {
  ChangeDpi(LOWORD(wParam));
  ReadButtonSize();
  Repaint();
  return 0;
}
