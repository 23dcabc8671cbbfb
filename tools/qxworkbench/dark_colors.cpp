#include "tools/qxworkbench/dark_colors.h"

#include <iterator>

namespace {

constexpr int kElements[] = {COLOR_WINDOW,      COLOR_WINDOWTEXT,  COLOR_3DFACE,        COLOR_BTNTEXT,
                             COLOR_3DSHADOW,    COLOR_3DHIGHLIGHT, COLOR_3DLIGHT,       COLOR_3DDKSHADOW,
                             COLOR_MENU,        COLOR_MENUTEXT,    COLOR_ACTIVECAPTION, COLOR_GRADIENTACTIVECAPTION,
                             COLOR_CAPTIONTEXT, COLOR_HIGHLIGHT,   COLOR_HIGHLIGHTTEXT, COLOR_MENUBAR,
                             COLOR_SCROLLBAR,   COLOR_GRAYTEXT};
constexpr COLORREF kColors[] = {RGB(32, 32, 32),    RGB(232, 232, 232), RGB(52, 52, 52),    RGB(232, 232, 232),
                                RGB(30, 30, 30),    RGB(80, 80, 80),    RGB(64, 64, 64),    RGB(12, 12, 12),
                                RGB(44, 44, 44),    RGB(232, 232, 232), RGB(30, 60, 110),   RGB(50, 50, 60),
                                RGB(255, 255, 255), RGB(40, 90, 160),   RGB(255, 255, 255), RGB(44, 44, 44),
                                RGB(40, 40, 40),    RGB(140, 140, 140)};
constexpr int kCount = static_cast<int>(std::size(kElements));
static_assert(std::size(kColors) == std::size(kElements));

}  // namespace

DarkColors::DarkColors() {
  for (const int element : kElements) m_former.push_back(::GetSysColor(element));
  ::SetSysColors(kCount, kElements, kColors);
}

DarkColors::~DarkColors() { ::SetSysColors(kCount, kElements, m_former.data()); }
