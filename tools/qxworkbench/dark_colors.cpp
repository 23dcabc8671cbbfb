#include "tools/qxworkbench/dark_colors.h"

#include <iterator>

namespace {

struct Color {
  int element;
  COLORREF value;
};
constexpr Color kColors[] = {{COLOR_WINDOW, RGB(32, 32, 32)},
                             {COLOR_WINDOWTEXT, RGB(232, 232, 232)},
                             {COLOR_3DFACE, RGB(52, 52, 52)},
                             {COLOR_BTNTEXT, RGB(232, 232, 232)},
                             {COLOR_3DSHADOW, RGB(30, 30, 30)},
                             {COLOR_3DHIGHLIGHT, RGB(80, 80, 80)},
                             {COLOR_3DLIGHT, RGB(64, 64, 64)},
                             {COLOR_3DDKSHADOW, RGB(12, 12, 12)},
                             {COLOR_MENU, RGB(44, 44, 44)},
                             {COLOR_MENUTEXT, RGB(232, 232, 232)},
                             {COLOR_ACTIVECAPTION, RGB(30, 60, 110)},
                             {COLOR_GRADIENTACTIVECAPTION, RGB(50, 50, 60)},
                             {COLOR_CAPTIONTEXT, RGB(255, 255, 255)},
                             {COLOR_INACTIVECAPTION, RGB(50, 50, 50)},
                             {COLOR_GRADIENTINACTIVECAPTION, RGB(50, 50, 50)},
                             {COLOR_INACTIVECAPTIONTEXT, RGB(170, 170, 170)},
                             {COLOR_HIGHLIGHT, RGB(40, 90, 160)},
                             {COLOR_HIGHLIGHTTEXT, RGB(255, 255, 255)},
                             {COLOR_MENUBAR, RGB(44, 44, 44)},
                             {COLOR_SCROLLBAR, RGB(40, 40, 40)},
                             {COLOR_GRAYTEXT, RGB(140, 140, 140)}};
constexpr int kCount = static_cast<int>(std::size(kColors));

void SetColors(const std::vector<COLORREF>& values) {
  int elements[kCount];
  for (int i = 0; i < kCount; ++i) elements[i] = kColors[i].element;
  ::SetSysColors(kCount, elements, values.data());
}

}  // namespace

DarkColors::DarkColors() {
  std::vector<COLORREF> dark;
  for (const Color& color : kColors) {
    m_former.push_back(::GetSysColor(color.element));
    dark.push_back(color.value);
  }
  SetColors(dark);
}

DarkColors::~DarkColors() { SetColors(m_former); }
