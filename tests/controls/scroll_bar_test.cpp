// The class "ScrollBar" by its messages and the system's calls for scroll bars; and the class "Static".

#include <gtest/gtest.h>

#include "tests/controls/control_host.h"

namespace {

SCROLLINFO InfoOf(HWND bar) {
  SCROLLINFO info{};
  info.cbSize = sizeof info;
  info.fMask = SIF_ALL;
  GetScrollInfo(bar, SB_CTL, &info);
  return info;
}

int SetInfo(HWND bar, UINT mask, int lowest, int highest, UINT page, int position) {
  SCROLLINFO info{sizeof info, mask, lowest, highest, page, position, 0};
  return SetScrollInfo(bar, SB_CTL, &info, TRUE);
}

TEST(ScrollBar, PositionsStayWithinTheRangeLessAPage) {
  ControlHost host;
  HWND bar = host.Make(WTEXT("ScrollBar"), nullptr, SBS_HORZ);
  EXPECT_EQ(SetInfo(bar, SIF_RANGE | SIF_PAGE | SIF_POS, 10, 109, 20, 500), 90);
  EXPECT_EQ(GetScrollPos(bar, SB_CTL), 90);
  EXPECT_EQ(SetScrollPos(bar, SB_CTL, -5, TRUE), 90);
  EXPECT_EQ(GetScrollPos(bar, SB_CTL), 10);
  const SCROLLINFO info = InfoOf(bar);
  EXPECT_EQ(info.nMin, 10);
  EXPECT_EQ(info.nMax, 109);
  EXPECT_EQ(info.nPage, 20u);
  EXPECT_EQ(info.nPos, 10);
  // A page larger than the range shrinks to it.
  SetInfo(bar, SIF_PAGE, 0, 0, 1000, 0);
  EXPECT_EQ(InfoOf(bar).nPage, 100u);
  int lowest = 0, highest = 0;
  SetScrollRange(bar, SB_CTL, 0, 50, FALSE);
  GetScrollRange(bar, SB_CTL, &lowest, &highest);
  EXPECT_EQ(lowest, 0);
  EXPECT_EQ(highest, 50);
}

TEST(ScrollBar, Keys_TellTheParent) {
  ControlHost host;
  HWND bar = host.Make(WTEXT("ScrollBar"), nullptr, SBS_VERT);
  SetInfo(bar, SIF_RANGE | SIF_PAGE, 0, 99, 10, 0);
  host.Told();
  SendMessageW(bar, WM_KEYDOWN, VK_DOWN, 1);
  SendMessageW(bar, WM_KEYUP, VK_DOWN, 1);
  const std::string told = host.Told();
  EXPECT_EQ(told.substr(0, 10), "scroll 1 0") << told;
}

TEST(Static, IsTransparentUnlessItNotifies) {
  ControlHost host;
  HWND text = host.Make(WTEXT("Static"), WTEXT("&Name"), SS_LEFT);
  EXPECT_EQ(SendMessageW(text, WM_NCHITTEST, 0, 0), HTTRANSPARENT);
  EXPECT_EQ(SendMessageW(text, WM_GETDLGCODE, 0, 0), DLGC_STATIC);
  EXPECT_EQ(TextOf(text), "&Name");
  HWND button = host.Make(WTEXT("Static"), WTEXT("press"), SS_LEFT | SS_NOTIFY);
  EXPECT_EQ(SendMessageW(button, WM_NCHITTEST, 0, 0), HTCLIENT);
  Click(button);
  EXPECT_EQ(host.Told(), "command 42 0");
  SendMessageW(button, WM_LBUTTONDBLCLK, MK_LBUTTON, MAKELPARAM(5, 5));
  EXPECT_EQ(host.Told(), "command 42 1");
  EnableWindow(button, FALSE);
  EXPECT_EQ(host.Told(), "command 42 3");
}

}  // namespace
