// The class "Button" by its messages: states, notifications, groups.

#include <gtest/gtest.h>

#include "tests/controls/control_host.h"

namespace {

LRESULT CheckOf(HWND button) { return SendMessageW(button, BM_GETCHECK, 0, 0); }

TEST(Button, Click_TellsTheParentOnce) {
  ControlHost host;
  HWND button = host.Make(WTEXT("Button"), WTEXT("&Go"), BS_PUSHBUTTON);
  Click(button);
  EXPECT_EQ(host.Told(), "command 42 0");
  // Released outside it is no click; back inside it is one again.
  SendMessageW(button, WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(5, 5));
  EXPECT_EQ(SendMessageW(button, BM_GETSTATE, 0, 0) & BST_PUSHED, BST_PUSHED);
  SendMessageW(button, WM_MOUSEMOVE, MK_LBUTTON, MAKELPARAM(500, 5));
  EXPECT_EQ(SendMessageW(button, BM_GETSTATE, 0, 0) & BST_PUSHED, 0);
  SendMessageW(button, WM_LBUTTONUP, 0, MAKELPARAM(500, 5));
  EXPECT_EQ(host.Told(), "");
  EXPECT_EQ(GetCapture(), nullptr);
  SendMessageW(button, WM_KEYDOWN, VK_SPACE, 1);
  SendMessageW(button, WM_KEYUP, VK_SPACE, 1);
  EXPECT_EQ(host.Told(), "command 42 0");
  SendMessageW(button, BM_CLICK, 0, 0);
  EXPECT_EQ(host.Told(), "command 42 0");
}

TEST(Button, KindsAnswerTheDialogAndKeepTheirChecks) {
  struct Case {
    DWORD style;
    LRESULT dialogCode;
    int afterClicks[4];  // the check after each of four clicks
  };
  const Case cases[] = {
      {BS_PUSHBUTTON, DLGC_BUTTON | DLGC_UNDEFPUSHBUTTON, {0, 0, 0, 0}},
      {BS_DEFPUSHBUTTON, DLGC_BUTTON | DLGC_DEFPUSHBUTTON, {0, 0, 0, 0}},
      {BS_CHECKBOX, DLGC_BUTTON, {0, 0, 0, 0}},
      {BS_AUTOCHECKBOX, DLGC_BUTTON, {1, 0, 1, 0}},
      {BS_3STATE, DLGC_BUTTON, {0, 0, 0, 0}},
      {BS_AUTO3STATE, DLGC_BUTTON, {1, 2, 0, 1}},
      {BS_RADIOBUTTON, DLGC_BUTTON | DLGC_RADIOBUTTON, {0, 0, 0, 0}},
      {BS_AUTORADIOBUTTON, DLGC_BUTTON | DLGC_RADIOBUTTON, {1, 1, 1, 1}},
  };
  for (const Case& each : cases) {
    ControlHost host;
    HWND button = host.Make(WTEXT("Button"), WTEXT("text"), each.style);
    EXPECT_EQ(SendMessageW(button, WM_GETDLGCODE, 0, 0), each.dialogCode) << each.style;
    for (int wanted : each.afterClicks) {
      Click(button);
      EXPECT_EQ(CheckOf(button), wanted) << each.style;
    }
  }
  ControlHost host;
  HWND group = host.Make(WTEXT("Button"), WTEXT("Group"), BS_GROUPBOX);
  EXPECT_EQ(SendMessageW(group, WM_GETDLGCODE, 0, 0), DLGC_STATIC);
  EXPECT_EQ(SendMessageW(group, WM_NCHITTEST, 0, 0), HTTRANSPARENT);
}

TEST(Button, AutomaticRadioButtons_OneOfAGroup) {
  ControlHost host;
  HWND buttons[5];
  for (int i = 0; i < 5; ++i) {
    // The fourth begins another group.
    const DWORD group = i == 0 || i == 3 ? WS_GROUP : 0;
    buttons[i] = host.Make(WTEXT("Button"), WTEXT("choice"), BS_AUTORADIOBUTTON | group, 100 + i);
  }
  const auto checks = [&] {
    std::string all;
    for (HWND button : buttons) all += static_cast<char>('0' + CheckOf(button));
    return all;
  };
  Click(buttons[1]);
  Click(buttons[4]);
  EXPECT_EQ(checks(), "01001");
  Click(buttons[0]);
  EXPECT_EQ(checks(), "10001");
  Click(buttons[3]);
  EXPECT_EQ(checks(), "10010");
  // The tabulator stops at what is checked.
  EXPECT_TRUE(GetWindowLongPtrW(buttons[0], GWL_STYLE) & WS_TABSTOP);
  EXPECT_FALSE(GetWindowLongPtrW(buttons[1], GWL_STYLE) & WS_TABSTOP);
}

}  // namespace
