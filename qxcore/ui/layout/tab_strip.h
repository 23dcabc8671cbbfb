// The geometry of the tabs in a tab beam: where each one lies, which ones are visible, which one is at a place, and
// which scroll button is. Plain arithmetic without a window; all figures are pixels.
//
// A tab takes its width and the spacing; it is drawn one spacing wider, so that its slanted right edge lies over the
// left one of the next tab. Its right edge is thus its offset, its width and twice the spacing.
// For the user-interface thread.
#pragma once

#include <cstdint>

#include "qxcore/container/node_pool.h"
#include "qxcore/graphics/rect.h"
#include "qxcore/string/string.h"

class SWnd;

// One tab.
struct STab {
  STab() = default;
  // A tab with content, not yet measured; a null text is an empty one.
  STab(SWnd* window, const WCHAR* text) : m_window(window), m_text(text) {}

  SWnd* m_window = nullptr;  // what it stands for; not owned
  SString m_text;            // what is written on it
  int m_hasContent = 1;      // 0: the tab is empty, and is written in the font for empty tabs
  int m_width = 60;          // without the spacing to the next tab
  SRect m_drawn;             // where it was painted last; empty when it was not visible
  SRect m_textArea;          // the same of its text

  // From the pools of nodes; throws SEOutOfMemory.
  static void* operator new(std::size_t size) { return SNodePools::Alloc(size, alignof(STab)); }
  static void operator delete(void* tab, std::size_t size) noexcept { SNodePools::Free(tab, size, alignof(STab)); }
};

// The tabs, and what their places depend on.
struct QXCORE_API STabStrip {
  STab* const* m_tabs;  // not owned
  int m_count;          // tabs
  int m_first;          // the first visible tab
  int m_spacing;        // between tabs; not negative
  int m_origin;         // where the first visible tab begins
  int m_width;          // of the beam

  // Where a tab begins, 0 to the count; for tabs before the first visible one below the origin. Places stop at the
  // ends of int.
  int Offset(int tab) const;
  // Where it ends, if it is visible.
  int RightEdge(int tab) const;
  // The tab at x; -1 left of the first visible tab and behind the last tab.
  int TabAt(int x) const;
  // The last tab that lies in the beam with all of its width; the first visible one at least.
  int LastVisible() const;
  // The first visible tab with which `tab` is visible: the present one if that will do, else the nearest.
  int FirstThatShows(int tab) const;
  // The smallest first visible tab with which `tab` is visible.
  int SmallestFirstThatShows(int tab) const;

 private:
  std::int64_t Step(int tab) const { return std::int64_t{m_tabs[tab]->m_width} + m_spacing; }
  std::int64_t Start(int tab) const {
    std::int64_t start = m_origin;
    for (int i = m_first; i < tab; ++i) start += Step(i);
    for (int i = tab; i < m_first; ++i) start -= Step(i);
    return start;
  }
};

// What a scroll button does.
enum STabButton : int {
  kSTabNoButton = -1,   // no button
  kSTabToFirst = 0,     // to the first tab
  kSTabToPrevious = 1,  // one tab back
  kSTabToNext = 2,      // one tab on
  kSTabToLast = 3,      // until the last tab is visible
};

// The scroll buttons at the left end of the beam.
struct QXCORE_API STabButtons {
  int m_areaWidth = 0;  // of all buttons; 0 while there are none
  int m_height = 0;     // of one button
  int m_width = 0;      // of one button
  int m_shown = 0;      // nonzero while there are buttons
  int m_count = 0;      // 0, 2 (previous, next) or 4 (first, previous, next, last)

  // Shows two or four buttons, or none.
  void Show(int show, int twoOnly);
  // Sets the size of a button, which is square.
  void SetSize(int size);
  // The button at a point, whether it can do something or not.
  int At(const POINT& point) const;
  // The rectangle of a button; empty when it is not shown.
  SRect RectOf(int button) const;
  // Where the first visible tab begins.
  int TabOrigin() const { return m_shown ? m_areaWidth + 1 : 0; }
};

// True when a button can scroll: back when there are tabs before the first visible one, on when tabs lie behind the
// last visible one.
QXCORE_API bool STabCanScroll(const STabStrip& strip, int button);
// The first visible tab after a button; the present one for a number that is no button.
QXCORE_API int STabScrollTarget(const STabStrip& strip, int button);
