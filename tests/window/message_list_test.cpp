// Which messages come in which order: lists made under Wine, met on both targets.

#include <gtest/gtest.h>

#include "tests/window/recorder.h"

namespace {

using recorder::ExpectRecord;
using recorder::Make;
using recorder::Pump;
using recorder::Record;

TEST(MessageList, CreateShowAndDestroy) {
  Record record;
  record.Title("create a top-level window");
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW);
  record.Title("a visible child of a hidden parent");
  Make(WTEXT("child"), WS_CHILD | WS_VISIBLE, top, {5, 5, 105, 55});
  record.Title("show");
  ShowWindow(top, SW_SHOW);
  Pump();
  record.Title("a visible child of a visible parent");
  const HWND kid = Make(WTEXT("kid"), WS_CHILD | WS_VISIBLE, top, {5, 60, 105, 110});
  Pump();
  record.Title("a hidden child");
  const HWND hidden = Make(WTEXT("hidden"), WS_CHILD, top, {120, 60, 220, 110});
  record.Title("show the child");
  ShowWindow(hidden, SW_SHOW);
  Pump();
  record.Title("hide the child");
  ShowWindow(hidden, SW_HIDE);
  Pump();
  record.Title("destroy a hidden child");
  DestroyWindow(hidden);
  record.Title("destroy a visible child");
  DestroyWindow(kid);
  Pump();
  record.Title("destroy the top-level window");
  DestroyWindow(top);
  ExpectRecord("create_show_destroy", record.Text());
}

TEST(MessageList, Placing) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  const HWND kid = Make(WTEXT("kid"), WS_CHILD | WS_VISIBLE, top, {5, 60, 105, 110});
  Make(WTEXT("other"), WS_CHILD | WS_VISIBLE, top, {5, 5, 105, 55});
  Pump();
  record.Title("move and size");
  SetWindowPos(top, nullptr, 30, 40, 320, 220, SWP_NOZORDER);
  Pump();
  record.Title("move");
  SetWindowPos(top, nullptr, 50, 50, 0, 0, SWP_NOZORDER | SWP_NOSIZE);
  Pump();
  record.Title("a smaller child");
  MoveWindow(kid, 10, 70, 90, 40, TRUE);
  Pump();
  record.Title("nothing");
  SetWindowPos(kid, nullptr, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE);
  record.Title("the frame alone");
  SetWindowPos(kid, nullptr, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_FRAMECHANGED);
  Pump();
  record.Title("the order alone");
  SetWindowPos(kid, HWND_BOTTOM, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
  Pump();
  record.Title("three children at once, one of them twice");
  HDWP batch = BeginDeferWindowPos(1);
  batch = DeferWindowPos(batch, kid, nullptr, 20, 20, 50, 50, SWP_NOZORDER | SWP_NOACTIVATE);
  batch = DeferWindowPos(batch, GetWindow(top, GW_CHILD), nullptr, 80, 20, 50, 50, SWP_NOZORDER | SWP_NOACTIVATE);
  batch = DeferWindowPos(batch, kid, nullptr, 25, 25, 50, 50, SWP_NOZORDER | SWP_NOACTIVATE);
  EXPECT_TRUE(EndDeferWindowPos(batch));
  Pump();
  DestroyWindow(top);
  ExpectRecord("placing", record.Text());
}

TEST(MessageList, States) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  Pump();
  record.Title("maximise");
  ShowWindow(top, SW_MAXIMIZE);
  EXPECT_TRUE(IsZoomed(top));
  ValidateRect(top, nullptr);
  record.Title("restore");
  ShowWindow(top, SW_RESTORE);
  ValidateRect(top, nullptr);
  record.Title("minimise");
  ShowWindow(top, SW_MINIMIZE);
  EXPECT_TRUE(IsIconic(top));
  ValidateRect(top, nullptr);
  record.Title("restore");
  ShowWindow(top, SW_RESTORE);
  ValidateRect(top, nullptr);
  RECT rect;
  GetWindowRect(top, &rect);
  EXPECT_EQ(rect.left, 10);
  EXPECT_EQ(rect.bottom, 220);
  record.Title("destroy");
  DestroyWindow(top);
  ExpectRecord("states", record.Text());
}

TEST(MessageList, ActivationFocusAndCapture) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  const HWND kid = Make(WTEXT("kid"), WS_CHILD | WS_VISIBLE, top, {5, 60, 105, 110});
  Pump();
  record.Title("focus to a child");
  SetFocus(kid);
  record.Title("disable the window with the focus");
  EnableWindow(kid, FALSE);
  record.Title("enable it again");
  EnableWindow(kid, TRUE);
  record.Title("a second top-level window");
  const HWND two = Make(WTEXT("two"), WS_POPUP | WS_VISIBLE | WS_CAPTION, top, {100, 100, 300, 200});
  Pump();
  record.Title("activate the first");
  SetActiveWindow(top);
  record.Title("hide the second");
  ShowWindow(two, SW_HIDE);
  record.Title("show the second without activation");
  ShowWindow(two, SW_SHOWNA);
  Pump();
  record.Title("capture");
  SetCapture(kid);
  SetCapture(top);
  ReleaseCapture();
  record.Title("style");
  SetWindowLongW(kid, GWL_STYLE, GetWindowLongW(kid, GWL_STYLE) | WS_BORDER);
  record.Title("text");
  SetWindowTextW(top, WTEXT("top"));
  record.Title("close by command");
  SendMessageW(two, WM_SYSCOMMAND, SC_CLOSE, 0);
  record.Title("destroy the active window with another there");
  const HWND three = Make(WTEXT("three"), WS_POPUP | WS_VISIBLE, top, {100, 100, 300, 200});
  Pump();
  record.Title("destroy three");
  DestroyWindow(three);
  record.Title("destroy the window with the focus");
  SetFocus(kid);
  record.Title("now");
  DestroyWindow(kid);
  DestroyWindow(top);
  ExpectRecord("activation", record.Text());
}

TEST(MessageList, PaintingAndParents) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  const HWND kid = Make(WTEXT("kid"), WS_CHILD | WS_VISIBLE, top, {5, 60, 105, 110});
  const HWND other = Make(WTEXT("other"), WS_CHILD | WS_VISIBLE, top, {5, 5, 105, 55});
  Pump();
  record.Title("invalidate and update");
  InvalidateRect(top, nullptr, TRUE);
  UpdateWindow(top);
  record.Title("invalidate the child, without erasing");
  InvalidateRect(kid, nullptr, FALSE);
  Pump();
  record.Title("validate before the paint");
  InvalidateRect(kid, nullptr, TRUE);
  ValidateRect(kid, nullptr);
  Pump();
  record.Title("another parent");
  SetParent(kid, other);
  Pump();
  record.Title("a menu");
  const HMENU bar = CreateMenu(), file = CreatePopupMenu();
  AppendMenuW(file, MF_STRING, 100, WTEXT("&Open"));
  AppendMenuW(bar, MF_POPUP, reinterpret_cast<UINT_PTR>(file), WTEXT("&File"));
  SetMenu(top, bar);
  ValidateRect(top, nullptr);
  DestroyWindow(top);
  EXPECT_FALSE(IsMenu(bar));
  EXPECT_FALSE(IsMenu(file));
  ExpectRecord("painting", record.Text());
}

LRESULT CALLBACK Refusing(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  recorder::NoteDialog(window, message, wParam, lParam);
  if (message == WM_CREATE) return -1;
  return DefWindowProcW(window, message, wParam, lParam);
}

LRESULT CALLBACK RefusingEarly(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  recorder::NoteDialog(window, message, wParam, lParam);
  if (message == WM_NCCREATE) return FALSE;
  return DefWindowProcW(window, message, wParam, lParam);
}

LRESULT CALLBACK Suicidal(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  recorder::NoteDialog(window, message, wParam, lParam);
  if (message == WM_USER) DestroyWindow(window);
  return DefWindowProcW(window, message, wParam, lParam);
}

HWND MakeWith(WNDPROC procedure, LPCWSTR className, HWND parent) {
  WNDCLASSW wanted{};
  wanted.lpfnWndProc = procedure;
  wanted.hInstance = GetModuleHandleW(nullptr);
  wanted.lpszClassName = className;
  RegisterClassW(&wanted);
  return CreateWindowExW(0, className, WTEXT("special"), WS_CHILD | WS_VISIBLE, 0, 0, 10, 10, parent, nullptr,
                         GetModuleHandleW(nullptr), nullptr);
}

TEST(MessageList, RefusalsAndTheEndInAHandler) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW);
  record.Title("WM_CREATE refuses");
  EXPECT_EQ(MakeWith(&Refusing, WTEXT("Refusing"), top), nullptr);
  record.Title("WM_NCCREATE refuses");
  EXPECT_EQ(MakeWith(&RefusingEarly, WTEXT("RefusingEarly"), top), nullptr);
  EXPECT_EQ(GetWindow(top, GW_CHILD), nullptr);
  record.Title("destroyed in its own handler");
  const HWND window = MakeWith(&Suicidal, WTEXT("Suicidal"), top);
  SendMessageW(window, WM_USER, 0, 0);
  EXPECT_FALSE(IsWindow(window));
  DestroyWindow(top);
  ExpectRecord("refusals", record.Text());
}

}  // namespace
