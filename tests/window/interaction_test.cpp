// Menus, accelerators, dialogs, sizing by the border, clicks: message lists, and what comes out.

#include <gtest/gtest.h>

#include <string>
#include <vector>

#include "tests/support/display.h"
#include "tests/support/wine.h"
#include "tests/window/recorder.h"

namespace {

using recorder::ExpectRecord;
using recorder::Make;
using recorder::Pump;
using recorder::Record;

// Calls a function when a recorded window hears a message for the first time; so input comes step by step.
struct Step {
  UINT message;
  void (*act)();
};
std::vector<Step> g_steps;

LRESULT CALLBACK Stepping(int code, WPARAM wParam, LPARAM lParam) {
  const auto* record = reinterpret_cast<const CWPSTRUCT*>(lParam);
  if (code >= 0 && !g_steps.empty() && g_steps.front().message == record->message) {
    const Step step = g_steps.front();
    g_steps.erase(g_steps.begin());
    step.act();
  }
  return CallNextHookEx(nullptr, code, wParam, lParam);
}

class Steps {
 public:
  explicit Steps(std::vector<Step> steps)
      : m_hook(SetWindowsHookExW(WH_CALLWNDPROC, &Stepping, nullptr, GetCurrentThreadId())) {
    g_steps = std::move(steps);
  }
  ~Steps() { UnhookWindowsHookEx(m_hook); }
  Steps(const Steps&) = delete;
  Steps& operator=(const Steps&) = delete;

 private:
  HHOOK m_hook;
};

HMENU MakeMenu() {
  const HMENU bar = CreateMenu(), file = CreatePopupMenu(), edit = CreatePopupMenu();
  AppendMenuW(file, MF_STRING, 100, WTEXT("&Open"));
  AppendMenuW(file, MF_SEPARATOR, 0, nullptr);
  AppendMenuW(file, MF_STRING, 101, WTEXT("&Save"));
  AppendMenuW(edit, MF_STRING | MF_GRAYED, 200, WTEXT("&Cut"));
  AppendMenuW(bar, MF_POPUP, reinterpret_cast<UINT_PTR>(file), WTEXT("&File"));
  AppendMenuW(bar, MF_POPUP, reinterpret_cast<UINT_PTR>(edit), WTEXT("&Edit"));
  return bar;
}

HWND MakeFrame() {
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  Pump();
  SetMenu(top, MakeMenu());
  test::HearTheDisplay();
  Pump();
  return top;
}

HWND g_menuOwner = nullptr;
void PostKeys(WPARAM first, WPARAM second) {
  PostMessageW(g_menuOwner, WM_KEYDOWN, first, 1);
  PostMessageW(g_menuOwner, WM_KEYDOWN, second, 1);
}

TEST(MessageList, MenuByKeyboard) {
  Record record;
  const HWND top = MakeFrame();
  record.Title("down and enter in the first popup");
  g_menuOwner = top;
  {
    const Steps steps({{WM_INITMENUPOPUP, [] { PostKeys(VK_DOWN, VK_RETURN); }}});
    SendMessageW(top, WM_SYSCOMMAND, SC_KEYMENU, 'f');
    Pump();
  }
  record.Title("escape twice");
  {
    const Steps steps({{WM_INITMENUPOPUP, [] { PostKeys(VK_ESCAPE, VK_ESCAPE); }}});
    SendMessageW(top, WM_SYSCOMMAND, SC_KEYMENU, 'f');
    Pump();
  }
  record.Title("destroy");
  DestroyWindow(top);
  ExpectRecord("menu", record.Text());
}

// The keyboard is usually with a child, and the menu is the frame's.
TEST(Input, AKeyOfAChildOpensTheMenu) {
  Record record;
  const HWND top = MakeFrame();
  const HWND child = Make(WTEXT("child"), WS_CHILD | WS_VISIBLE, top);
  SetFocus(child);
  g_menuOwner = top;
  {
    const Steps steps({{WM_INITMENUPOPUP, [] { PostKeys(VK_DOWN, VK_RETURN); }}});
    SendMessageW(child, WM_SYSCHAR, 'f', 1 << 29);
    Pump();
  }
  DestroyWindow(top);
  for (const char* line : {"top WM_INITMENUPOPUP", "top WM_COMMAND 65 none"})
    EXPECT_NE(record.Text().find(line), std::string::npos) << line << " in\n" << record.Text();
}

TEST(Input, TheSystemMenuOffersWhatCanBeDone) {
  const HWND top = MakeFrame();
  g_menuOwner = top;
  for (const bool isLarge : {false, true}) {
    if (isLarge) ShowWindow(top, SW_MAXIMIZE);
    {
      const Steps steps({{WM_INITMENUPOPUP, [] { PostKeys(VK_ESCAPE, VK_ESCAPE); }}});
      SendMessageW(top, WM_SYSCOMMAND, SC_KEYMENU, ' ');
      Pump();
    }
    const auto isGrey = [top](UINT command) {
      return (GetMenuState(GetSystemMenu(top, FALSE), command, MF_BYCOMMAND) & (MF_GRAYED | MF_DISABLED)) != 0;
    };
    EXPECT_EQ(isGrey(SC_RESTORE), !isLarge);
    for (const UINT command : {SC_MOVE, SC_SIZE, SC_MAXIMIZE}) EXPECT_EQ(isGrey(command), isLarge) << command;
    EXPECT_FALSE(isGrey(SC_MINIMIZE));
    EXPECT_FALSE(isGrey(SC_CLOSE));
  }
  DestroyWindow(top);
}

// A message of the mouse at a point of the screen; the loops of the system read the message's own point.
void PostMouse(HWND window, UINT message, POINT screen) {
  SetCursorPos(screen.x, screen.y);
  PostMessageW(window, message, message == WM_LBUTTONUP ? 0 : MK_LBUTTON, MAKELPARAM(screen.x, screen.y));
}

POINT MiddleOf(HWND owner, HMENU menu, UINT item) {
  RECT place{};
  EXPECT_TRUE(GetMenuItemRect(owner, menu, item, &place));
  return {(place.left + place.right) / 2, (place.top + place.bottom) / 2};
}

// A release chooses the item that a move has selected, and no other.
TEST(Input, AMenuIsOpenedByAPressAndChosenByARelease) {
  Record record;
  const HWND top = MakeFrame();
  const POINT file = MiddleOf(top, GetMenu(top), 0);
  g_menuOwner = top;
  const Steps steps({{WM_ENTERIDLE, [] {
                        const HMENU popup = GetSubMenu(GetMenu(g_menuOwner), 0);
                        const POINT item = MiddleOf(g_menuOwner, popup, 2);
                        for (const UINT message : {UINT{WM_LBUTTONUP}, UINT{WM_MOUSEMOVE}, UINT{WM_LBUTTONUP}})
                          PostMouse(g_menuOwner, message, item);
                      }}});
  SendMessageW(top, WM_NCLBUTTONDOWN, HTMENU, MAKELPARAM(file.x, file.y));
  Pump();
  DestroyWindow(top);
  // Wine does not say that the mouse selects.
  const char* selected = IsWine() ? "top WM_MENUSELECT 800065" : "top WM_MENUSELECT 80800065";
  for (const char* line : {"top WM_INITMENUPOPUP", selected, "top WM_COMMAND 65 none"})
    EXPECT_NE(record.Text().find(line), std::string::npos) << line << " in\n" << record.Text();
}

TEST(MessageList, SizingByTheBorder) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, nullptr, {100, 100, 400, 300});
  Pump();
  SetCursorPos(398, 200);
  Pump();
  g_menuOwner = top;
  record.Title("drag the right border by thirty pixels");
  const Steps steps({{WM_ENTERSIZEMOVE,
                      [] {
                        PostMouse(g_menuOwner, WM_MOUSEMOVE, {428, 200});
                      }},
                     {WM_SIZING, [] {
                        PostMouse(g_menuOwner, WM_LBUTTONUP, {428, 200});
                      }}});
  SendMessageW(top, WM_NCLBUTTONDOWN, HTRIGHT, MAKELPARAM(398, 200));
  RECT rect;
  GetWindowRect(top, &rect);
  EXPECT_EQ(rect.right, 430);
  EXPECT_EQ(rect.left, 100);
  EXPECT_EQ(rect.bottom, 300);
  EXPECT_EQ(GetCapture(), nullptr);
  ValidateRect(top, nullptr);
  record.Title("destroy");
  DestroyWindow(top);
  ExpectRecord("sizing", record.Text());
}

TEST(MessageList, Accelerators) {
  Record record;
  const HWND top = MakeFrame();
  ACCEL entries[] = {{FVIRTKEY | FCONTROL, 'S', 101}, {FVIRTKEY, VK_F5, 300}, {FVIRTKEY, VK_F6, 200}};
  const HACCEL table = CreateAcceleratorTableW(entries, 3);
  EXPECT_EQ(CopyAcceleratorTableW(table, nullptr, 0), 3);
  MSG message{};
  message.hwnd = top;
  message.message = WM_KEYDOWN;
  record.Title("without its shift key");
  message.wParam = 'S';
  EXPECT_EQ(TranslateAcceleratorW(top, table, &message), 0);
  record.Title("an item of the menu");
  BYTE keys[256] = {};
  keys[VK_CONTROL] = 0x80;
  SetKeyboardState(keys);
  EXPECT_NE(TranslateAcceleratorW(top, table, &message), 0);
  keys[VK_CONTROL] = 0;
  SetKeyboardState(keys);
  record.Title("a command that no menu has");
  message.wParam = VK_F5;
  EXPECT_NE(TranslateAcceleratorW(top, table, &message), 0);
  record.Title("a disabled item");
  message.wParam = VK_F6;
  EXPECT_NE(TranslateAcceleratorW(top, table, &message), 0);
  EXPECT_TRUE(DestroyAcceleratorTable(table));
  DestroyWindow(top);
  ExpectRecord("accelerators", record.Text());
}

// A template: a frame with an OK button, an edit control and two radio buttons.
const DLGTEMPLATE* Template() {
  static std::vector<WORD> words;
  words.clear();
  const auto put = [&](int value) { words.push_back(static_cast<WORD>(value)); };
  const auto putLong = [&](DWORD value) {
    put(LOWORD(value));
    put(HIWORD(value));
  };
  const auto putText = [&](LPCWSTR text) {
    do put(*text);
    while (*text++ != 0);
  };
  putLong(WS_POPUP | WS_CAPTION | WS_SYSMENU | WS_VISIBLE | DS_MODALFRAME);
  putLong(0);
  for (const int value : {4, 10, 10, 100, 60, 0, 0}) put(value);
  putText(WTEXT("dialog"));
  struct Item {
    DWORD style;
    int y, id, windowClass;
    LPCWSTR text;
  };
  const Item items[] = {{WS_TABSTOP | BS_DEFPUSHBUTTON, 5, IDOK, 0x80, WTEXT("OK")},
                        {WS_TABSTOP | ES_LEFT, 20, 100, 0x81, WTEXT("edit")},
                        {WS_TABSTOP | WS_GROUP | BS_AUTORADIOBUTTON, 35, 101, 0x80, WTEXT("&one")},
                        {BS_AUTORADIOBUTTON, 50, 102, 0x80, WTEXT("&two")}};
  for (const Item& item : items) {
    if (words.size() & 1) put(0);
    putLong(item.style | WS_CHILD | WS_VISIBLE);
    putLong(0);
    for (const int value : {5, item.y, 40, 12, item.id, 0xFFFF, item.windowClass}) put(value);
    putText(item.text);
    put(0);
  }
  return reinterpret_cast<const DLGTEMPLATE*>(words.data());
}

INT_PTR CALLBACK DialogProcedure(HWND dialog, UINT message, WPARAM wParam, LPARAM lParam) {
  recorder::NoteDialog(dialog, message, wParam, lParam);
  if (message == WM_INITDIALOG) {
    if (lParam == 1) PostMessageW(dialog, WM_COMMAND, IDOK, 0);
    return TRUE;
  }
  if (message == WM_COMMAND && LOWORD(wParam) <= IDCANCEL && HIWORD(wParam) == BN_CLICKED) {
    EndDialog(dialog, 40 + LOWORD(wParam));
    return TRUE;
  }
  return FALSE;
}

void Press(HWND dialog, WPARAM key) {
  MSG message{};
  message.hwnd = GetFocus();
  message.message = WM_KEYDOWN;
  message.wParam = key;
  EXPECT_TRUE(IsDialogMessageW(dialog, &message));
}

TEST(MessageList, ModalDialog) {
  Record record;
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE);
  Pump();
  record.Title("open, answer, close");
  EXPECT_EQ(DialogBoxIndirectParamW(GetModuleHandleW(nullptr), Template(), top, &DialogProcedure, 1), 41);
  EXPECT_TRUE(IsWindowEnabled(top));
  record.Title("destroy");
  DestroyWindow(top);
  ExpectRecord("modal_dialog", record.Text());
}

TEST(Dialog, KeyboardWalksAndChooses) {
  const HWND dialog = CreateDialogIndirectParamW(GetModuleHandleW(nullptr), Template(), nullptr, &DialogProcedure, 0);
  ASSERT_NE(dialog, nullptr);
  EXPECT_EQ(GetDlgCtrlID(GetFocus()), IDOK);
  Press(dialog, VK_TAB);
  EXPECT_EQ(GetDlgCtrlID(GetFocus()), 100);
  DWORD first = 9, last = 9;
  SendMessageW(GetFocus(), EM_GETSEL, reinterpret_cast<WPARAM>(&first), reinterpret_cast<LPARAM>(&last));
  EXPECT_EQ(first, 0u);
  EXPECT_EQ(last, 4u);
  Press(dialog, VK_TAB);
  EXPECT_EQ(GetDlgCtrlID(GetFocus()), 101);
  Press(dialog, VK_DOWN);
  EXPECT_EQ(GetDlgCtrlID(GetFocus()), 102);
  EXPECT_EQ(IsDlgButtonChecked(dialog, 102), static_cast<UINT>(BST_CHECKED));
  EXPECT_EQ(IsDlgButtonChecked(dialog, 101), static_cast<UINT>(BST_UNCHECKED));
  CheckRadioButton(dialog, 101, 102, 101);
  EXPECT_EQ(IsDlgButtonChecked(dialog, 102), static_cast<UINT>(BST_UNCHECKED));
  EXPECT_EQ(LOWORD(SendMessageW(dialog, DM_GETDEFID, 0, 0)), IDOK);

  EXPECT_TRUE(SetDlgItemInt(dialog, 100, static_cast<UINT>(-125), TRUE));
  BOOL translated = FALSE;
  EXPECT_EQ(static_cast<int>(GetDlgItemInt(dialog, 100, &translated, TRUE)), -125);
  EXPECT_TRUE(translated);
  SetDlgItemTextW(dialog, 100, WTEXT("4294967296"));
  EXPECT_EQ(GetDlgItemInt(dialog, 100, &translated, FALSE), 0u);
  EXPECT_FALSE(translated);
  EXPECT_EQ(GetDlgItem(dialog, 999), nullptr);
  RECT rect{4, 8, 8, 16};
  EXPECT_TRUE(MapDialogRect(dialog, &rect));
  const LONG units = GetDialogBaseUnits();
  EXPECT_EQ(rect.left, LOWORD(units));
  EXPECT_EQ(rect.bottom, 2 * HIWORD(units));
  DestroyWindow(dialog);
}

void Mouse(DWORD flags, int dx = 0, int dy = 0) {
  INPUT input{};
  input.type = INPUT_MOUSE;
  input.mi.dwFlags = flags;
  input.mi.dx = dx;
  input.mi.dy = dy;
  SendInput(1, &input, sizeof input);
}

// With its place in the same event: what the display reports meanwhile does not move it.
void MouseAt(POINT point, DWORD flags) {
  const auto scaled = [](LONG at, int size) { return static_cast<int>((at << 16) / GetSystemMetrics(size)) + 1; };
  Mouse(flags | MOUSEEVENTF_MOVE | MOUSEEVENTF_ABSOLUTE, scaled(point.x, SM_CXSCREEN), scaled(point.y, SM_CYSCREEN));
}

// Handles messages until one of the kind has been dispatched, or for at most ten seconds.
bool PumpUntil(UINT wanted) {
  const DWORD start = GetTickCount();
  MSG message;
  while (GetTickCount() - start < 10000) {
    if (!PeekMessageW(&message, nullptr, 0, 0, PM_REMOVE)) {
      Sleep(1);
      continue;
    }
    TranslateMessage(&message);
    DispatchMessageW(&message);
    if (message.message == wanted) return true;
  }
  return false;
}

// The press ends the menu, and is one in the window that it meets.
TEST(Input, APressBesideAnOpenMenu_ClosesItAndReachesTheWindowThere) {
  Record record;
  const HWND top = MakeFrame();
  const HWND other = Make(WTEXT("other"), WS_POPUP | WS_VISIBLE, nullptr, {400, 300, 500, 400});
  SetForegroundWindow(top);
  test::HearTheDisplay();
  Pump();
  {
    const Steps steps({{WM_ENTERIDLE, [] {
                          MouseAt({450, 350}, MOUSEEVENTF_LEFTDOWN);
                          MouseAt({450, 350}, MOUSEEVENTF_LEFTUP);
                        }}});
    EXPECT_EQ(TrackPopupMenu(GetSubMenu(GetMenu(top), 0), TPM_RETURNCMD, 50, 60, 0, top, nullptr), 0);
  }
  EXPECT_EQ(GetCapture(), nullptr);
  EXPECT_TRUE(PumpUntil(WM_LBUTTONUP));
  std::size_t at = 0;
  for (const char* line : {"top WM_EXITMENULOOP", "other WM_LBUTTONDOWN 1 50,50", "other WM_LBUTTONUP 0 50,50"}) {
    at = record.Text().find(line, at);
    EXPECT_NE(at, std::string::npos) << line << " in\n" << record.Text();
  }
  DestroyWindow(other);
  DestroyWindow(top);
}

#ifndef _WIN32  // Under Wine input that is sent while the loop of sizing begins can be lost; the loop waits for ever.
TEST(Input, TheBorderSizesTheWindow) {
  const HWND top = Make(WTEXT("top"), WS_OVERLAPPEDWINDOW | WS_VISIBLE, nullptr, {100, 100, 400, 300});
  SetForegroundWindow(top);
  Pump();
  SetCursorPos(398, 200);
  Pump();
  const Steps steps(
      {{WM_ENTERSIZEMOVE, [] { Mouse(MOUSEEVENTF_MOVE, 30, 0); }}, {WM_SIZING, [] { Mouse(MOUSEEVENTF_LEFTUP); }}});
  Mouse(MOUSEEVENTF_LEFTDOWN);
  ASSERT_TRUE(PumpUntil(WM_NCLBUTTONDOWN));
  RECT rect;
  GetWindowRect(top, &rect);
  EXPECT_GT(rect.right, 420);
  EXPECT_EQ(rect.left, 100);
  EXPECT_EQ(rect.bottom, 300);
  EXPECT_EQ(GetCapture(), nullptr);
  DestroyWindow(top);
}
#endif

LRESULT g_clicks = 0;
LRESULT CALLBACK ClickParent(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_COMMAND && HIWORD(wParam) == BN_CLICKED) ++g_clicks;
  return DefWindowProcW(window, message, wParam, lParam);
}

HWND MakeClickParent() {
  static const ATOM atom = [] {
    WNDCLASSW wanted{};
    wanted.lpfnWndProc = &ClickParent;
    wanted.hInstance = GetModuleHandleW(nullptr);
    wanted.lpszClassName = WTEXT("ClickParent");
    return RegisterClassW(&wanted);
  }();
  EXPECT_NE(atom, 0);
  return CreateWindowExW(0, WTEXT("ClickParent"), nullptr, WS_POPUP | WS_VISIBLE, 100, 100, 300, 200, nullptr, nullptr,
                         GetModuleHandleW(nullptr), nullptr);
}

HWND MakeControl(LPCWSTR windowClass, LPCWSTR text, DWORD style, HWND parent, int id) {
  return CreateWindowExW(0, windowClass, text, style | WS_CHILD | WS_VISIBLE, 10, 10, 100, 30, parent,
                         reinterpret_cast<HMENU>(static_cast<UINT_PTR>(id)), GetModuleHandleW(nullptr), nullptr);
}

TEST(Controls, ButtonsClickAndKeepTheirState) {
  const HWND parent = MakeClickParent();
  const HWND button = MakeControl(WTEXT("Button"), WTEXT("push"), BS_PUSHBUTTON, parent, 1);
  const HWND box = MakeControl(WTEXT("Button"), WTEXT("box"), BS_AUTOCHECKBOX, parent, 2);
  const HWND three = MakeControl(WTEXT("Button"), WTEXT("three"), BS_AUTO3STATE, parent, 3);
  g_clicks = 0;
  SendMessageW(button, BM_CLICK, 0, 0);
  EXPECT_EQ(g_clicks, 1);
  SendMessageW(button, WM_LBUTTONDOWN, MK_LBUTTON, MAKELPARAM(5, 5));
  EXPECT_EQ(GetCapture(), button);
  EXPECT_TRUE(SendMessageW(button, BM_GETSTATE, 0, 0) & BST_PUSHED);
  SendMessageW(button, WM_MOUSEMOVE, MK_LBUTTON, MAKELPARAM(500, 5));
  EXPECT_FALSE(SendMessageW(button, BM_GETSTATE, 0, 0) & BST_PUSHED);
  SendMessageW(button, WM_LBUTTONUP, 0, MAKELPARAM(500, 5));
  EXPECT_EQ(g_clicks, 1) << "released outside";
  for (const LRESULT wanted : {BST_CHECKED, BST_UNCHECKED}) {
    SendMessageW(box, BM_CLICK, 0, 0);
    EXPECT_EQ(SendMessageW(box, BM_GETCHECK, 0, 0), wanted);
  }
  for (const LRESULT wanted : {BST_CHECKED, BST_INDETERMINATE, BST_UNCHECKED}) {
    SendMessageW(three, BM_CLICK, 0, 0);
    EXPECT_EQ(SendMessageW(three, BM_GETCHECK, 0, 0), wanted);
  }
  EXPECT_TRUE(SendMessageW(button, WM_GETDLGCODE, 0, 0) & DLGC_UNDEFPUSHBUTTON);
  DestroyWindow(parent);
}

std::basic_string<WCHAR> TextOf(HWND window) {
  WCHAR text[200] = {};
  const int count = GetWindowTextW(window, text, 200);
  return std::basic_string<WCHAR>(text, text + count);
}

TEST(Controls, EditTypesSelectsAndUndoes) {
  const HWND parent = MakeClickParent();
  const HWND edit = MakeControl(WTEXT("Edit"), WTEXT("abc"), ES_AUTOHSCROLL, parent, 1);
  SetFocus(edit);
  EXPECT_TRUE(TextOf(edit) == WTEXT("abc"));
  SendMessageW(edit, EM_SETSEL, 1, 2);
  for (const WCHAR c : {'x', 'y'}) SendMessageW(edit, WM_CHAR, c, 1);
  EXPECT_TRUE(TextOf(edit) == WTEXT("axyc"));
  SendMessageW(edit, WM_CHAR, 8, 1);
  EXPECT_TRUE(TextOf(edit) == WTEXT("axc"));
  EXPECT_TRUE(SendMessageW(edit, EM_GETMODIFY, 0, 0));
  SendMessageW(edit, EM_SETSEL, 0, -1);
  SendMessageW(edit, EM_REPLACESEL, TRUE, reinterpret_cast<LPARAM>(WTEXT("new")));
  EXPECT_TRUE(TextOf(edit) == WTEXT("new"));
  EXPECT_TRUE(SendMessageW(edit, EM_CANUNDO, 0, 0));
  SendMessageW(edit, EM_UNDO, 0, 0);
  EXPECT_TRUE(TextOf(edit) == WTEXT("axc"));
  SendMessageW(edit, EM_SETREADONLY, TRUE, 0);
  SendMessageW(edit, WM_CHAR, 'q', 1);
  EXPECT_TRUE(TextOf(edit) == WTEXT("axc"));
  SendMessageW(edit, EM_SETREADONLY, FALSE, 0);
  SendMessageW(edit, EM_SETLIMITTEXT, 4, 0);
  SendMessageW(edit, EM_SETSEL, 3, 3);
  for (const WCHAR c : {'1', '2'}) SendMessageW(edit, WM_CHAR, c, 1);
  EXPECT_TRUE(TextOf(edit) == WTEXT("axc1"));

  const HWND lines = MakeControl(WTEXT("Edit"), WTEXT("one\r\ntwo\r\n"), ES_MULTILINE | ES_AUTOHSCROLL, parent, 2);
  EXPECT_EQ(SendMessageW(lines, EM_GETLINECOUNT, 0, 0), 3);
  EXPECT_EQ(SendMessageW(lines, EM_LINEINDEX, 1, 0), 5);
  EXPECT_EQ(SendMessageW(lines, EM_LINEINDEX, 9, 0), -1);
  EXPECT_EQ(SendMessageW(lines, EM_LINEFROMCHAR, 6, 0), 1);
  EXPECT_EQ(SendMessageW(lines, EM_LINELENGTH, 6, 0), 3);
  DestroyWindow(parent);
}

TEST(Controls, StatusBarPartsAndTexts) {
  const HWND parent = MakeClickParent();
  InitCommonControls();
  const HWND bar = CreateWindowExW(0, STATUSCLASSNAMEW, WTEXT("first"), WS_CHILD | WS_VISIBLE, 0, 0, 0, 0, parent,
                                   nullptr, GetModuleHandleW(nullptr), nullptr);
  ASSERT_NE(bar, nullptr);
  RECT rect, client;
  GetClientRect(parent, &client);
  GetWindowRect(bar, &rect);
  MapWindowPoints(nullptr, parent, reinterpret_cast<POINT*>(&rect), 2);
  EXPECT_EQ(rect.bottom, client.bottom);
  EXPECT_EQ(rect.right, client.right);
  int edges[] = {50, 120, -1};
  EXPECT_TRUE(SendMessageW(bar, SB_SETPARTS, 3, reinterpret_cast<LPARAM>(edges)));
  EXPECT_EQ(SendMessageW(bar, SB_GETPARTS, 0, 0), 3);
  EXPECT_TRUE(SendMessageW(bar, SB_SETTEXTW, 1, reinterpret_cast<LPARAM>(WTEXT("second"))));
  WCHAR text[32] = {};
  EXPECT_EQ(LOWORD(SendMessageW(bar, SB_GETTEXTW, 1, reinterpret_cast<LPARAM>(text))), 6);
  EXPECT_TRUE(std::basic_string<WCHAR>(text, text + 6) == WTEXT("second"));
  EXPECT_EQ(LOWORD(SendMessageW(bar, SB_GETTEXTLENGTHW, 0, 0)), 5);
  RECT parts[2];
  for (int i = 0; i < 2; ++i) EXPECT_TRUE(SendMessageW(bar, SB_GETRECT, i, reinterpret_cast<LPARAM>(&parts[i])));
  int borders[3];
  EXPECT_TRUE(SendMessageW(bar, SB_GETBORDERS, 0, reinterpret_cast<LPARAM>(borders)));
  EXPECT_EQ(parts[0].left, borders[0]);
  EXPECT_EQ(parts[0].right, 50);
  EXPECT_EQ(parts[1].left, 50 + borders[2]);
  EXPECT_EQ(parts[1].top, borders[1]);
  EXPECT_FALSE(SendMessageW(bar, SB_SETTEXTW, 7, reinterpret_cast<LPARAM>(WTEXT("none"))));
  DestroyWindow(parent);
}

TEST(Controls, ScrollBarsAndProgress) {
  const HWND parent = MakeClickParent();
  const HWND bar = MakeControl(WTEXT("ScrollBar"), nullptr, SBS_HORZ, parent, 1);
  SCROLLINFO info{};
  info.cbSize = sizeof info;
  info.fMask = SIF_ALL;
  info.nMax = 99;
  info.nPage = 10;
  info.nPos = 95;
  EXPECT_EQ(SetScrollInfo(bar, SB_CTL, &info, TRUE), 90) << "the last full page";
  EXPECT_EQ(GetScrollPos(bar, SB_CTL), 90);
  int lowest = -1, highest = -1;
  EXPECT_TRUE(GetScrollRange(bar, SB_CTL, &lowest, &highest));
  EXPECT_EQ(highest, 99);
  // A window's own bar goes away when there is nothing to scroll.
  const DWORD style = static_cast<DWORD>(GetWindowLongW(parent, GWL_STYLE));
  EXPECT_FALSE(style & WS_VSCROLL);
  SetScrollInfo(parent, SB_VERT, &info, FALSE);
  EXPECT_TRUE(GetWindowLongW(parent, GWL_STYLE) & WS_VSCROLL);
  info.nPage = 100;
  SetScrollInfo(parent, SB_VERT, &info, FALSE);
  EXPECT_FALSE(GetWindowLongW(parent, GWL_STYLE) & WS_VSCROLL);

  const HWND progress = MakeControl(PROGRESS_CLASSW, nullptr, 0, parent, 2);
  SendMessageW(progress, PBM_SETRANGE32, 10, 20);
  EXPECT_EQ(SendMessageW(progress, PBM_SETPOS, 25, 0), 10);
  EXPECT_EQ(SendMessageW(progress, PBM_GETPOS, 0, 0), 20);
  EXPECT_EQ(SendMessageW(progress, PBM_GETRANGE, TRUE, 0), 10);
  DestroyWindow(parent);
}

}  // namespace
