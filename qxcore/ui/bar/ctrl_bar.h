// SCtrlBar: the base of control bars, which stand at an edge of a frame's client area: status bars, tool bars.
//
// A bar has a style of its own beside the window's, and four border widths around what it shows. Its frame gives it a
// strip of the client area, as high (or wide) as GetBarLayout says, by the message kSMsgSizeParent.
//
// For the user-interface thread.
#pragma once

#include <cstdint>

#include "qxcore/ui/window/window.h"

// Bits of a bar's style.
enum : DWORD {
  kSBarAtLeft = 0x1000,   // the edge of the client area where the bar stands;
  kSBarAtTop = 0x2000,    // without one of the four it is
  kSBarAtRight = 0x4000,  // the bottom one
  kSBarAtBottom = 0x8000,
  kSBarBorder3d = 0x01000000,    // the borders below are three-dimensional edges
  kSBarBorderLeft = 0x10000000,  // a border at this side
  kSBarBorderTop = 0x20000000,
  kSBarBorderRight = 0x40000000,
  kSBarBorderBottom = 0x80000000,
};

class QXCORE_API SCtrlBar : public SWnd {
  QXCORE_DECLARE_CREATABLE_CLASS(SCtrlBar)

 public:
  SCtrlBar() = default;
  ~SCtrlBar() override;

  // --- virtual functions; they continue the list of SWnd ---

  // Called by SetBarStyle when the style has been set. Here: nothing.
  virtual void OnBarStyleChange(DWORD oldStyle, DWORD newStyle);
  // The size that the bar wants, in pixels. `stretch`: nonzero for as long as the area; `horizontal`: whether the bar
  // stands at the top or the bottom. Here the present size of the window.
  virtual SSize GetBarLayout(int stretch, int horizontal);
  // Lets a bar that stands at no edge place itself: the arguments are the fields of the frame's SSizeParent, `batch`
  // the address of its m_batch. Nonzero when it did; then the frame's own rules are left out. Here: 0.
  virtual int GetCustomLayout(void* batch, SRect* area, SSize* used, int stretch);

  DWORD GetBarStyle() const { return m_barStyle; }  // a sum of kSBar... bits and bits of derived classes
  // Sets the style and calls OnBarStyleChange. Returns the old style.
  DWORD SetBarStyle(DWORD style);

  // Moves the edges of a rectangle inward by the bar's borders: those of the style, then the four border widths, which
  // are named for a horizontal bar; a vertical bar exchanges left with top and right with bottom.
  void CalcNCOffsets(SRect* rect, int horizontal) const;

 protected:
  // Takes the bar's strip off the area and moves the bar there. A hidden bar takes nothing.
  LRESULT OnSizeParent(WPARAM wParam, LPARAM lParam);

  QXCORE_DECLARE_MESSAGE_MAP()

  // Pixels.
  std::int32_t m_leftBorder = 0;
  std::int32_t m_topBorder = 0;
  std::int32_t m_rightBorder = 0;
  std::int32_t m_bottomBorder = 0;

 private:
  SRect TakeStrip(SRect* area, const SSize& size) const;

  DWORD m_barStyle = 0;
};

static_assert(sizeof(void*) != 4 || sizeof(SCtrlBar) == 32, "the layout is public");
