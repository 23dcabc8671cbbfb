// The class "Edit", one line: typing, selecting, limits, undoing.

#include <gtest/gtest.h>

#include <cstring>
#include <random>

#include "qxcore/platform/win32/clipboard.h"
#include "tests/controls/control_host.h"
#include "tests/support/wine.h"

namespace {

void Select(HWND edit, int start, int end) { SendMessageW(edit, EM_SETSEL, static_cast<WPARAM>(start), end); }

std::string SelectionOf(HWND edit) {
  DWORD start = 0, end = 0;
  SendMessageW(edit, EM_GETSEL, reinterpret_cast<WPARAM>(&start), reinterpret_cast<LPARAM>(&end));
  return std::to_string(start) + "-" + std::to_string(end);
}

TEST(Edit, Typing_ReplacesTheSelectionAndTellsTheParent) {
  ControlHost host;
  HWND edit = host.Make(WTEXT("Edit"), WTEXT("abcdef"), ES_AUTOHSCROLL);
  Select(edit, 1, 4);
  EXPECT_EQ(SelectionOf(edit), "1-4");
  Type(edit, WTEXT("X"));
  EXPECT_EQ(TextOf(edit), "aXef");
  EXPECT_EQ(host.Told(), "command 42 1024, command 42 768");
  EXPECT_TRUE(SendMessageW(edit, EM_GETMODIFY, 0, 0));
  Type(edit, WTEXT("\b\b"));
  EXPECT_EQ(TextOf(edit), "ef");
  SendMessageW(edit, WM_KEYDOWN, VK_DELETE, 1);
  EXPECT_EQ(TextOf(edit), "f");
  SetWindowTextW(edit, WTEXT("new"));
  EXPECT_FALSE(SendMessageW(edit, EM_GETMODIFY, 0, 0));
  EXPECT_EQ(SelectionOf(edit), "0-0");
}

TEST(Edit, StylesAndLimits_DecideWhatIsTaken) {
  ControlHost host;
  HWND upper = host.Make(WTEXT("Edit"), nullptr, ES_AUTOHSCROLL | ES_UPPERCASE);
  Type(upper, WTEXT("aBc"));
  EXPECT_EQ(TextOf(upper), "ABC");
  HWND digits = host.Make(WTEXT("Edit"), nullptr, ES_AUTOHSCROLL | ES_NUMBER);
  Type(digits, WTEXT("1a2"));
  EXPECT_EQ(TextOf(digits), "12");
  HWND shortOne = host.Make(WTEXT("Edit"), nullptr, ES_AUTOHSCROLL);
  SendMessageW(shortOne, EM_LIMITTEXT, 3, 0);
  EXPECT_EQ(SendMessageW(shortOne, EM_GETLIMITTEXT, 0, 0), 3);
  host.Told();
  Type(shortOne, WTEXT("abcd"));
  EXPECT_EQ(TextOf(shortOne), "abc");
  EXPECT_NE(host.Told().find("command 42 1281"), std::string::npos);
  // A program may set more than a person may type.
  SetWindowTextW(shortOne, WTEXT("abcdef"));
  EXPECT_EQ(TextOf(shortOne), "abcdef");
  HWND fixed = host.Make(WTEXT("Edit"), WTEXT("as it is"), ES_AUTOHSCROLL | ES_READONLY);
  Type(fixed, WTEXT("x\b"));
  SendMessageW(fixed, WM_KEYDOWN, VK_DELETE, 1);
  EXPECT_EQ(TextOf(fixed), "as it is");
  SendMessageW(fixed, EM_SETREADONLY, FALSE, 0);
  Type(fixed, WTEXT("x"));
  EXPECT_EQ(TextOf(fixed), "xas it is");
}

TEST(Edit, Undo_ComesBackAndForth) {
  ControlHost host;
  HWND edit = host.Make(WTEXT("Edit"), WTEXT("one"), ES_AUTOHSCROLL);
  Select(edit, 3, 3);
  EXPECT_FALSE(SendMessageW(edit, EM_CANUNDO, 0, 0));
  SendMessageW(edit, EM_REPLACESEL, TRUE, reinterpret_cast<LPARAM>(WTEXT(" two")));
  EXPECT_EQ(TextOf(edit), "one two");
  EXPECT_TRUE(SendMessageW(edit, EM_CANUNDO, 0, 0));
  SendMessageW(edit, EM_UNDO, 0, 0);
  EXPECT_EQ(TextOf(edit), "one");
  SendMessageW(edit, EM_UNDO, 0, 0);
  EXPECT_EQ(TextOf(edit), "one two");
}

// Keys and characters at random against a plain model of a line with a caret.
TEST(Edit, RandomKeys_AgreeWithAModel) {
  ControlHost host;
  HWND edit = host.Make(WTEXT("Edit"), nullptr, ES_AUTOHSCROLL);
  std::mt19937 random(7);
  std::string text;
  std::size_t caret = 0;
  for (int step = 0; step < 2000; ++step) {
    switch (random() % 8) {
      case 0:
        SendMessageW(edit, WM_KEYDOWN, VK_LEFT, 1);
        caret -= caret > 0;
        break;
      case 1:
        SendMessageW(edit, WM_KEYDOWN, VK_RIGHT, 1);
        caret += caret < text.size();
        break;
      case 2:
        SendMessageW(edit, WM_KEYDOWN, VK_HOME, 1);
        caret = 0;
        break;
      case 3:
        SendMessageW(edit, WM_KEYDOWN, VK_END, 1);
        caret = text.size();
        break;
      case 4:
        SendMessageW(edit, WM_KEYDOWN, VK_DELETE, 1);
        if (caret < text.size()) text.erase(caret, 1);
        break;
      case 5:
        Type(edit, WTEXT("\b"));
        if (caret > 0) text.erase(--caret, 1);
        break;
      default: {
        const char character = static_cast<char>('a' + random() % 26);
        const WCHAR wide[] = {static_cast<WCHAR>(character), 0};
        if (text.size() < 200) {
          Type(edit, wide);
          text.insert(caret++, 1, character);
        }
        break;
      }
    }
    ASSERT_EQ(TextOf(edit), text) << step;
    ASSERT_EQ(SelectionOf(edit), std::to_string(caret) + "-" + std::to_string(caret)) << step;
  }
}

TEST(Edit, PlacesAndPoints_AreInverse) {
  ControlHost host;
  HWND edit = host.Make(WTEXT("Edit"), WTEXT("Wim"), ES_AUTOHSCROLL);
  int former = -1;
  for (int place = 0; place < 3; ++place) {
    const LRESULT at = SendMessageW(edit, EM_POSFROMCHAR, static_cast<WPARAM>(place), 0);
    const int x = static_cast<short>(LOWORD(at));
    EXPECT_GT(x, former);
    former = x;
    EXPECT_EQ(LOWORD(SendMessageW(edit, EM_CHARFROMPOS, 0, MAKELPARAM(x, 5))), place);
  }
}

// A text that others put on the clipboard, and one that they find there.
void PutOnClipboard(HWND owner, LPCWSTR text) {
  ASSERT_TRUE(OpenClipboard(owner));
  EXPECT_TRUE(EmptyClipboard());
  const SIZE_T size = (SStringView(text).size() + 1) * sizeof(WCHAR);
  const HGLOBAL block = GlobalAlloc(GMEM_MOVEABLE, size);
  std::memcpy(GlobalLock(block), text, size);
  GlobalUnlock(block);
  EXPECT_EQ(SetClipboardData(CF_UNICODETEXT, block), block);
  EXPECT_EQ(GetClipboardOwner(), owner);
  EXPECT_TRUE(CloseClipboard());
}

std::string OnClipboard(HWND reader) {
  if (!OpenClipboard(reader)) return "closed";
  std::string text;
  if (const HGLOBAL block = GetClipboardData(CF_UNICODETEXT)) {
    for (auto* c = static_cast<const WCHAR*>(GlobalLock(block)); *c != 0; ++c) text += static_cast<char>(*c);
    GlobalUnlock(block);
  }
  CloseClipboard();
  return text;
}

TEST(Edit, Clipboard_TakesAndGivesTexts) {
  ControlHost host;
  HWND from = host.Make(WTEXT("Edit"), WTEXT("one two"), ES_AUTOHSCROLL);
  HWND to = host.Make(WTEXT("Edit"), WTEXT("<>"), ES_AUTOHSCROLL);
  Select(from, 4, 7);
  SendMessageW(from, WM_COPY, 0, 0);
  EXPECT_EQ(OnClipboard(host.Window()), "two");
  Select(to, 1, 1);
  SendMessageW(to, WM_PASTE, 0, 0);
  EXPECT_EQ(TextOf(to), "<two>");
  Select(from, 0, 4);
  SendMessageW(from, WM_CHAR, 'X' - '@', 1);
  EXPECT_EQ(TextOf(from), "two");
  EXPECT_EQ(OnClipboard(host.Window()), "one ");
  EXPECT_TRUE(SendMessageW(from, EM_CANUNDO, 0, 0));
  SendMessageW(to, WM_CHAR, 'V' - '@', 1);
  EXPECT_EQ(TextOf(to), "<twoone >");

  PutOnClipboard(host.Window(), WTEXT("two\r\nlines"));
  SendMessageW(from, EM_SETSEL, 0, -1);
  SendMessageW(from, WM_PASTE, 0, 0);
  EXPECT_EQ(TextOf(from), "two") << "a control of one line takes one";
  SendMessageW(from, EM_SETREADONLY, TRUE, 0);
  SendMessageW(from, EM_SETSEL, 0, -1);
  SendMessageW(from, WM_CUT, 0, 0);
  SendMessageW(from, WM_PASTE, 0, 0);
  EXPECT_EQ(TextOf(from), "two");
  HWND secret = host.Make(WTEXT("Edit"), WTEXT("secret"), ES_PASSWORD);
  SendMessageW(secret, EM_SETSEL, 0, -1);
  SendMessageW(secret, WM_COPY, 0, 0);
  if (!IsWine()) {
    EXPECT_EQ(OnClipboard(host.Window()).find("secret"), std::string::npos);
  }
  EXPECT_EQ(GetClipboardData(CF_UNICODETEXT), nullptr) << "it is closed";
}

}  // namespace
