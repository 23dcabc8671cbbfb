// SStatusBar: the strip of text panes at the bottom of a frame.
//
// It wraps the system's status bar control and owns the list of panes: it decides every pane's width, keeps every
// pane's text, and gives both to the control. Where a pane has kSPaneSplice, the panes of an SStatusBarLayout can be
// shown between the bar's own ones, for example those of the active kind of document.
// ```cpp
// SStatusBar bar;
// bar.Create(frame);
// bar.InsertPane(0, 0, kSPaneMain | kSPaneStretch);    // messages: as wide as there is room
// bar.InsertPane(1, 60, 0);                            // 60 pixels
// bar.InsertPane(2, 0, kSPaneAutoSize);                // as wide as its text
// bar.SetPaneText(kSMainPane, &text, 1);
// ```
// Widths are pixels of the bar's DPI: those of 96 dots an inch until the window is created; from then on those of its
// screen. When the DPI changes, the widths and borders that the bar holds are scaled. The control shows the first 255
// panes. The index kSMainPane (-1) names the main pane. An invalid index gives 0, or the empty string, and changes
// nothing.
//
// For the user-interface thread.
#pragma once

#include <memory>

#include "qxcore/ui/bar/ctrl_bar.h"
#include "qxcore/ui/bar/status_bar_panes.h"

class SAccessible;
class SStatusBarLayout;
struct SPaneSpace;
template <class Owner>
struct SPaneOperations;

// The usual identifier of a frame's status bar.
inline constexpr UINT kSStatusBarId = 0xE801;

class QXCORE_API SStatusBar : public SCtrlBar {
  QXCORE_DECLARE_CREATABLE_CLASS(SStatusBar)

 public:
  SStatusBar();
  // Releases the layouts that are attached.
  ~SStatusBar() override;

  using SCtrlBar::Create;
  // Creates the control at the bottom of `parent`, with a grip for sizing when the parent has a sizing border. Its
  // frame places it. Returns nonzero on success.
  int Create(SWnd* parent, DWORD barStyle = 0, DWORD style = WS_CHILD | WS_VISIBLE, UINT id = kSStatusBarId);

  // --- panes; see SStatusBarPanes for indices ---

  // Inserts a pane before the one at `index`; -1 and -2 insert at the main pane's position. `width` is in pixels,
  // without the padding; that of an auto-size pane is ignored. Returns 1. Throws SEOutOfMemory.
  int InsertPane(int index, int width, DWORD style);
  // Returns 1, or 0 when there is no such pane.
  int DeletePane(int index);
  int GetPaneText(int index, SString* text) const { return m_panes.GetPaneText(index, text); }
  SString GetPaneText(int index) const { return m_panes.GetPaneText(index); }
  // Stores a text, null for an empty one; with `update` it is shown at once, else when the bar is painted next. A text
  // that is not another one is not sent again. Returns 1; 0 when there is no such pane, or no memory.
  int SetPaneText(int index, const SString* text, int update = 1);
  // The same for the main pane.
  int SetMainPaneText(const SString* text, int update = 1) { return SetPaneText(kSMainPane, text, update); }
  DWORD GetPaneStyle(int index) const { return m_panes.GetPaneStyle(index); }
  // A pane that becomes an auto-size one is as wide as its text. Returns 1, or 0.
  int SetPaneStyle(int index, DWORD style);
  int GetPaneWidth(int index) const { return m_panes.GetPaneWidth(index); }
  int SetPaneWidth(int index, int width);                  // returns 1, or 0
  int GetPaneCount() const { return m_panes.GetCount(); }  // own panes
  // The place of a pane in client coordinates. Returns 1, or 0.
  int GetPaneRect(int index, SRect* rect) const;
  // What a screen reader or a test learns of the panes, those of a shown layout included; the object must not outlive
  // the window.
  std::unique_ptr<SAccessible> MakeAccessible();

  // --- the layout that is spliced in ---

  // Shows the panes of a layout, which is attached if it was not; null shows none. The layout stays the caller's.
  void SetExtraLayout(SStatusBarLayout* layout);
  SStatusBarLayout* GetExtraLayout() const { return m_layout; }  // null when none is shown
  // The place of a pane of the layout that is shown. Returns 1, or 0.
  int GetExtraLayoutItemRect(int index, SRect* rect) const;

  // --- work that the members above do by themselves ---

  // Computes all widths and gives them to the control; nonzero: all texts are sent when the bar is painted next.
  void UpdatePaneRects(int markTextDirty);
  // Sends the texts that are dirty.
  void UpdatePaneStrings();

  // 32767 wide, and as high as its text and borders need, at least the minimum height.
  SSize GetBarLayout(int stretch, int horizontal) override;

 protected:
  int PreCreateWindow(CREATESTRUCTW* create) override;

  LRESULT OnNcHitTest(SPoint point);
  void OnSize(UINT type, int width, int height);
  void OnPaint();
  int OnNcCalcSize(int calcValid, NCCALCSIZE_PARAMS* sizes);
  void DrawItem(DRAWITEMSTRUCT* item);
  int OnSetText(LPCWSTR text);
  int OnGetText(int capacity, LPWSTR buffer);
  int OnGetTextLength();
  LRESULT OnSetMinHeight(WPARAM height, LPARAM);
  LRESULT OnDpiChanged(WPARAM wParam, LPARAM lParam);
  void OnSettingChange(UINT what, LPCWSTR area);
  LRESULT OnGetObject(WPARAM wParam, LPARAM lParam);

  QXCORE_DECLARE_MESSAGE_MAP()

  // Pixels of the bar's DPI for a number of pixels at 96 dots an inch.
  int Scaled(int pixels) const { return ::MulDiv(pixels, m_dpi, 96); }
  // The default interface font at the bar's DPI; stays the library's.
  HFONT GetBarFont() const;

  int m_minHeight = 0;                   // pixels; 0 until the control accepts SB_SETMINHEIGHT
  int m_splice = 0;                      // the own position where the layout's panes are shown
  SStatusBarPanes m_panes;               // own panes
  SStatusBarLayout* m_layout = nullptr;  // the one that is shown; not owned

 private:
  friend class SStatusBarLayout;
  friend struct SPaneOperations<SStatusBar>;
  class Panes;  // the accessible object
  int ExtraCount() const;
  int GetControlRect(int controlIndex, SRect* rect) const;
  const SStatusBarPane* FindShown(int controlIndex) const;
  SPaneSpace GetPaneSpace() const;
  bool FitPane(SStatusBarPane& pane);
  void SendPane(int position);
  void SendText(SStatusBarPane& pane, int controlIndex);
  void SendEmptyPane();
  void SetDpi(int dpi);
  void Unlink(SStatusBarLayout* layout);

  SStatusBarLayout* m_attached = nullptr;  // all that are attached, a list
  int m_dpi = 96;
  bool m_isSending = false;  // the texts that are dirty
};
