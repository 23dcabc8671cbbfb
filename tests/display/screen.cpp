// The real screen: windows, mouse, keyboard and clipboard of an X server, with another client that has the hands and
// the eyes. screen_test.py starts the server and this program.

#include <atomic>
#include <thread>

#include "qxcore/platform/win32/clipboard.h"
#include "tests/display/x_client.h"
#include "tests/layout/layout_fixture.h"

namespace {

constexpr int kMenuCommand = 0x8001;
const char* const kTitle = "Screen test";

// A window that keeps the messages of the mouse and the keyboard, and shows a pattern in which each pixel tells its
// place.
class Board : public test::Window {
 public:
  Board() {
    m_handler = [this](UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) {
      if (message == WM_PAINT) return *result = 0, Paint(), 1;
      const bool isInput = (message >= WM_KEYFIRST && message <= WM_KEYLAST) ||
                           (message >= WM_MOUSEFIRST && message <= WM_MOUSELAST && message != WM_MOUSEMOVE);
      if (isInput || message == WM_COMMAND || message == WM_CLOSE || message == WM_DROPFILES)
        m_got.push_back({nullptr, message, wParam, lParam, 0, {}});
      if (message == WM_ACTIVATE) m_isActive = LOWORD(wParam) != WA_INACTIVE;
      if (message == WM_CLOSE) return *result = 0, 1;
      if (message == WM_INITMENUPOPUP) return *result = 0, 1;  // all commands can be chosen
      return 0;
    };
  }
  static COLORREF ColorAt(int x, int y) { return RGB(x & 0xFF, y & 0xFF, (x >> 8) * 16 + (y >> 8)); }
  void Paint() {
    SPaintDC dc(m_hWnd);
    const SRect client = GetClientRect();
    for (int y = 0; y < client.bottom; y += 8)
      for (int x = 0; x < client.right; x += 8) dc.FillSolidRect(SRect(x, y, x + 8, y + 8), ColorAt(x, y));
  }
  bool Got(UINT message) const {
    return std::any_of(m_got.begin(), m_got.end(), [&](const MSG& got) { return got.message == message; });
  }
  const MSG& First(UINT message) const {
    return *std::find_if(m_got.begin(), m_got.end(), [&](const MSG& got) { return got.message == message; });
  }
  std::vector<MSG> m_got;
  bool m_isActive = false;
};

class Screen : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    ASSERT_GT(::GetSystemMetrics(SM_CMONITORS), 0) << "the display was not opened";
    if (!m_client.CanType()) GTEST_SKIP() << "the server takes no input from clients, or there is no libXtst";
    ASSERT_TRUE(
        m_board.CreateEx(0, nullptr, WTEXT("Screen test"), WS_OVERLAPPEDWINDOW, 200, 150, 420, 320, nullptr, nullptr));
    m_board.ShowWindow(SW_SHOW);
    m_board.UpdateWindow();
    ASSERT_TRUE(test::PumpUntil([&] { return IsOnScreen(); })) << "the window does not come to the screen";
    m_board.m_got.clear();
  }
  void TearDown() override {
    if (m_board.m_hWnd != nullptr) m_board.DestroyWindow();
    UiTest::TearDown();
  }

  // A menu bar with one menu of two commands.
  void GiveMenu() {
    const HMENU bar = ::CreateMenu(), file = ::CreatePopupMenu();
    ::AppendMenuW(file, MF_STRING, kMenuCommand, WTEXT("&First"));
    ::AppendMenuW(file, MF_STRING, kMenuCommand + 1, WTEXT("&Second"));
    ::AppendMenuW(bar, MF_POPUP, reinterpret_cast<UINT_PTR>(file), WTEXT("&File"));
    ::SetMenu(m_board.m_hWnd, bar);
  }

  POINT OnScreen(int x, int y) const {
    SPoint point(x, y);
    m_board.ClientToScreen(&point);
    return point;
  }
  // Whether each pixel of the client area is on the screen.
  bool IsOnScreen() {
    const SRect client = m_board.GetClientRect();
    const POINT corner = OnScreen(0, 0);
    const auto pixels = m_client.Pixels({corner.x, corner.y, corner.x + client.right, corner.y + client.bottom});
    if (pixels.empty()) return false;
    for (int y = 0; y < client.bottom; ++y) {
      for (int x = 0; x < client.right; ++x) {
        const COLORREF color = Board::ColorAt(x & ~7, y & ~7);
        const std::uint32_t expected =
            static_cast<std::uint32_t>(GetRValue(color) << 16 | GetGValue(color) << 8 | GetBValue(color));
        if (pixels[static_cast<std::size_t>(y * client.right + x)] != expected) return false;
      }
    }
    return true;
  }
  bool Waits(UINT message) {
    return test::PumpUntil([&] { return m_board.Got(message); });
  }

  test::XClient m_client;
  Board m_board;
};

// --- windows ---

TEST_F(Screen, AWindowIsShownMovedSizedAndHidden) {
  ASSERT_TRUE(m_client.HasWindow(kTitle));
  m_board.SetWindowPos(nullptr, 300, 60, 500, 280, SWP_NOZORDER);
  EXPECT_TRUE(test::PumpUntil([&] { return IsOnScreen(); }));
  m_board.SetWindowTextW(WTEXT("Another title \u2013 \u0416"));
  EXPECT_TRUE(test::PumpUntil([&] { return m_client.HasWindow("Another title \xE2\x80\x93 \xD0\x96"); }));
  m_board.ShowWindow(SW_HIDE);
  EXPECT_TRUE(test::PumpUntil([&] { return !IsOnScreen(); }));
  m_board.ShowWindow(SW_SHOW);
  EXPECT_TRUE(test::PumpUntil([&] { return IsOnScreen(); }));
}

// As a window manager does it for the user.
TEST_F(Screen, OthersPlaceTheWindow) {
  SRect whole;
  m_client.Place(kTitle, {40, 50, 40 + 600, 50 + 400});
  EXPECT_TRUE(test::PumpUntil([&] {
    whole = m_board.GetWindowRect();
    return whole == SRect(40, 50, 640, 450);
  })) << whole.left
      << ' ' << whole.top << ' ' << whole.Width() << ' ' << whole.Height();
  EXPECT_TRUE(test::PumpUntil([&] { return IsOnScreen(); }));
  m_client.Place(kTitle, {40, 50, 40 + 5, 50 + 5});  // less than the window's least size
  EXPECT_TRUE(test::PumpUntil([&] {
    whole = m_board.GetWindowRect();
    return whole.Width() == ::GetSystemMetrics(SM_CXMINTRACK) && whole.Height() == ::GetSystemMetrics(SM_CYMINTRACK);
  }));
}

TEST_F(Screen, ClosingIsAsked) {
  m_client.AskToClose(kTitle);
  EXPECT_TRUE(Waits(WM_CLOSE));
  m_board.m_got.clear();
  m_board.EnableWindow(0);  // as behind a modal dialog
  m_client.AskToClose(kTitle);
  m_client.Place(kTitle, {10, 10, 410, 310});
  SRect whole;
  EXPECT_TRUE(test::PumpUntil([&] { return whole = m_board.GetWindowRect(), whole.left == 10; }));
  EXPECT_FALSE(m_board.Got(WM_CLOSE));
}

TEST_F(Screen, TheKeyboardComesAndGoes) {
  ASSERT_TRUE(test::PumpUntil([&] { return m_board.m_isActive; }));
  m_client.TakeKeyboard();
  EXPECT_TRUE(test::PumpUntil([&] { return !m_board.m_isActive; }));
  EXPECT_EQ(::GetActiveWindow(), nullptr);
  m_client.GiveKeyboard(kTitle);
  EXPECT_TRUE(test::PumpUntil([&] { return m_board.m_isActive; }));
}

// Without a window manager the window has its own caption, which moves it.
TEST_F(Screen, TheCaptionMovesTheWindow) {
  const POINT caption = OnScreen(60, -10);
  m_client.Move(caption);
  m_client.Button(1, true);
  std::thread hand([&] {
    for (int step = 1; step <= 20; ++step) {
      m_client.Move({caption.x + 4 * step, caption.y + 3 * step});
      ::Sleep(5);
    }
    m_client.Button(1, false);
  });
  SRect whole;
  EXPECT_TRUE(test::PumpUntil([&] { return whole = m_board.GetWindowRect(), whole.TopLeft() == SPoint(280, 210); }));
  hand.join();
  EXPECT_TRUE(test::PumpUntil([&] { return IsOnScreen(); }));
  EXPECT_EQ(whole.TopLeft(), SPoint(280, 210));
}

// --- mouse and keyboard ---

TEST_F(Screen, TheMouse) {
  m_client.Click(OnScreen(30, 40));
  ASSERT_TRUE(Waits(WM_LBUTTONUP));
  EXPECT_EQ(m_board.First(WM_LBUTTONDOWN).lParam, MAKELPARAM(30, 40));
  EXPECT_EQ(m_board.First(WM_LBUTTONUP).lParam, MAKELPARAM(30, 40));
  m_client.Move(OnScreen(100, 50));
  m_client.Button(4, true);
  m_client.Button(4, false);
  ASSERT_TRUE(Waits(WM_MOUSEWHEEL));
  EXPECT_EQ(static_cast<short>(HIWORD(m_board.First(WM_MOUSEWHEEL).wParam)), WHEEL_DELTA);
  m_client.Button(3, true);
  m_client.Button(3, false);
  EXPECT_TRUE(Waits(WM_RBUTTONUP));
}

TEST_F(Screen, KeysAndCharacters) {
  m_client.Type("a");
  m_client.Key("Shift_L", true);
  m_client.Type("b");
  m_client.Key("Shift_L", false);
  m_client.Type("F6");
  m_client.Key("Control_L", true);
  m_client.Type("c");
  m_client.Key("Control_L", false);
  m_client.Type("Return");
  m_client.Type("Left");
  ASSERT_TRUE(test::PumpUntil([&] {
    return m_board.Got(WM_KEYUP) && m_board.m_got.back().message == WM_KEYUP && m_board.m_got.back().wParam == VK_LEFT;
  }));
  std::vector<WPARAM> keys;
  std::u16string characters;
  for (const MSG& message : m_board.m_got) {
    if (message.message == WM_KEYDOWN) keys.push_back(message.wParam);
    if (message.message == WM_CHAR) characters += static_cast<char16_t>(message.wParam);
  }
  EXPECT_EQ(keys, (std::vector<WPARAM>{'A', VK_SHIFT, 'B', VK_F6, VK_CONTROL, 'C', VK_RETURN, VK_LEFT}));
  EXPECT_EQ(characters, u"aB\x03\r");
}

// A menu is a window of its own, which takes no keyboard away.
TEST_F(Screen, AMenuIsUsedByTheMouse) {
  GiveMenu();
  ASSERT_TRUE(test::PumpUntil([&] { return IsOnScreen(); }));
  const POINT onBar = OnScreen(12, -8);
  std::thread hand([&] {
    m_client.Click(onBar);
    ::Sleep(300);
    m_client.Click({onBar.x + 8, onBar.y + 40});  // on the second item
  });
  EXPECT_TRUE(Waits(WM_COMMAND));
  hand.join();
  if (m_board.Got(WM_COMMAND)) {
    EXPECT_EQ(m_board.First(WM_COMMAND).wParam, static_cast<WPARAM>(kMenuCommand + 1));
  }
  m_client.Type("x");  // the keyboard is back
  EXPECT_TRUE(Waits(WM_CHAR));
}

// As fingers do it: Alt is held while the menu comes up, and is released then.
TEST_F(Screen, AMenuIsUsedByTheKeyboard) {
  GiveMenu();
  ASSERT_TRUE(test::PumpUntil([&] { return IsOnScreen(); }));
  std::thread hand([&] {
    m_client.Key("Alt_L", true);
    m_client.Type("f");
    ::Sleep(300);
    m_client.Key("Alt_L", false);
    ::Sleep(100);
    m_client.Type("s");
  });
  EXPECT_TRUE(Waits(WM_COMMAND));
  hand.join();
  if (m_board.Got(WM_COMMAND)) {
    EXPECT_EQ(m_board.First(WM_COMMAND).wParam, static_cast<WPARAM>(kMenuCommand + 1));
  }
  EXPECT_TRUE(test::PumpUntil([] { return ::GetKeyState(VK_MENU) >= 0; }));
}

// Another program that takes the keyboard while Alt is held gets its release.
TEST_F(Screen, NoModifierStaysDown) {
  m_client.Key("Alt_L", true);
  EXPECT_TRUE(test::PumpUntil([] { return ::GetKeyState(VK_MENU) < 0; }));
  m_client.TakeKeyboard();
  EXPECT_TRUE(test::PumpUntil([&] { return !m_board.m_isActive && ::GetKeyState(VK_MENU) >= 0; }));
  m_client.Key("Alt_L", false);
  m_client.GiveKeyboard(kTitle);
  EXPECT_TRUE(test::PumpUntil([&] { return m_board.m_isActive; }));
}

// Another program that takes the keyboard ends the menu.
TEST_F(Screen, AMenuEndsWithTheKeyboard) {
  const HMENU menu = ::CreatePopupMenu();
  ::AppendMenuW(menu, MF_STRING, kMenuCommand, WTEXT("First"));
  std::thread hand([&] {
    ::Sleep(200);
    m_client.TakeKeyboard();
  });
  const POINT corner = OnScreen(20, 20);
  EXPECT_EQ(::TrackPopupMenu(menu, TPM_RETURNCMD, corner.x, corner.y, 0, m_board.m_hWnd, nullptr), 0);
  hand.join();
  ::DestroyMenu(menu);
  m_client.GiveKeyboard(kTitle);
}

// --- drag and drop ---

// Names with blanks and other letters, at the point where they were dropped; a child that accepts files gets its own.
TEST_F(Screen, FilesAreDropped) {
  const auto drop = [this](const Board& target, POINT point, const char* uris) {
    m_board.m_got.clear();
    bool isTaken = false;
    const POINT onScreen = OnScreen(point.x, point.y);
    std::thread hand([&] { isTaken = m_client.Drop(onScreen, uris); });
    test::PumpUntil([&] { return target.Got(WM_DROPFILES); });
    hand.join();
    EXPECT_TRUE(isTaken);
  };
  ::DragAcceptFiles(m_board.m_hWnd, TRUE);
  drop(m_board, {33, 44}, "file:///tmp/a%20folder\r\nfile:///tmp/Gr%C3%BC%C3%9Fe.txt\r\n");
  ASSERT_TRUE(m_board.Got(WM_DROPFILES));
  const auto files = reinterpret_cast<HDROP>(m_board.First(WM_DROPFILES).wParam);
  ASSERT_EQ(::DragQueryFileW(files, ~UINT{0}, nullptr, 0), 2u);
  WCHAR name[100];
  EXPECT_EQ(::DragQueryFileW(files, 0, name, 100), 15u);
  EXPECT_EQ(SString(name), SString(WTEXT("C:\\tmp\\a folder")));
  EXPECT_EQ(::DragQueryFileW(files, 1, name, 8), 7u) << "cut to the room";
  ::DragQueryFileW(files, 1, name, 100);
  EXPECT_EQ(SString(name), SString(WTEXT("C:\\tmp\\Gr\u00FC\u00DFe.txt")));
  POINT point{};
  EXPECT_TRUE(::DragQueryPoint(files, &point));
  EXPECT_EQ(SPoint(point), SPoint(33, 44));
  ::DragFinish(files);

  Board child;
  ASSERT_TRUE(child.CreateEx(WS_EX_ACCEPTFILES, nullptr, nullptr, WS_CHILD | WS_VISIBLE, 100, 100, 50, 50,
                             m_board.m_hWnd, nullptr));
  drop(child, {110, 120}, "file:///tmp\r\n");
  EXPECT_FALSE(m_board.Got(WM_DROPFILES));
  ASSERT_TRUE(child.Got(WM_DROPFILES));
  const auto inside = reinterpret_cast<HDROP>(child.First(WM_DROPFILES).wParam);
  EXPECT_TRUE(::DragQueryPoint(inside, &point));
  EXPECT_EQ(SPoint(point), SPoint(10, 20));
  ::DragFinish(inside);

  m_board.EnableWindow(0);  // as behind a modal dialog
  std::atomic<bool> isTaken = false;
  const POINT onScreen = OnScreen(33, 44);
  std::thread hand([&] { isTaken = m_client.Drop(onScreen, "file:///tmp\r\n"); });
  m_board.m_got.clear();
  EXPECT_TRUE(test::PumpUntil([&] { return isTaken.load(); }));
  hand.join();
  EXPECT_FALSE(m_board.Got(WM_DROPFILES));
}

// The answers to a program that has gone reach nobody, and end nothing.
TEST_F(Screen, ADragEndsWithItsProgram) {
  ::DragAcceptFiles(m_board.m_hWnd, TRUE);
  m_client.BeginDragAndGo(OnScreen(33, 44));
  m_client.Type("x");
  EXPECT_TRUE(Waits(WM_CHAR));
  EXPECT_FALSE(m_board.Got(WM_DROPFILES));
}

// --- the clipboard ---

SString ClipboardText(const SWnd& window) {
  SString text;
  if (!::OpenClipboard(window.m_hWnd)) return text;
  if (const HANDLE block = ::GetClipboardData(CF_UNICODETEXT)) {
    text = static_cast<const WCHAR*>(::GlobalLock(block));
    ::GlobalUnlock(block);
  }
  ::CloseClipboard();
  return text;
}

void PutOnClipboard(const SWnd& window, const SString& text) {
  ASSERT_TRUE(::OpenClipboard(window.m_hWnd));
  ::EmptyClipboard();
  const HGLOBAL block = ::GlobalAlloc(GMEM_MOVEABLE, static_cast<std::size_t>(text.Length() + 1) * sizeof(WCHAR));
  std::copy_n(static_cast<LPCWSTR>(text), text.Length() + 1, static_cast<WCHAR*>(::GlobalLock(block)));
  ::GlobalUnlock(block);
  ASSERT_NE(::SetClipboardData(CF_UNICODETEXT, block), nullptr);
  ::CloseClipboard();
}

TEST_F(Screen, OthersReadOurClipboard) {
  PutOnClipboard(m_board, WTEXT("Gr\u00FC\u00DFe\r\nand more"));
  m_client.AskForText();
  std::string text;
  const char* expected = "Gr\xC3\xBC\xC3\x9F\x65\nand more";
  ASSERT_TRUE(test::PumpUntil([&] { return m_client.Answer(&text); }));
  EXPECT_EQ(text, expected);
}

TEST_F(Screen, WeReadTheClipboardOfOthers) {
  PutOnClipboard(m_board, WTEXT("ours"));
  EXPECT_EQ(ClipboardText(m_board), SString(WTEXT("ours")));
  test::XClient other;
  other.OfferText("theirs \xE2\x82\xAC\nnext");
  EXPECT_TRUE(test::PumpUntil([&] { return ClipboardText(m_board) == SString(WTEXT("theirs \u20AC\r\nnext")); }));
  EXPECT_TRUE(::IsClipboardFormatAvailable(CF_UNICODETEXT));
  EXPECT_EQ(::GetClipboardOwner(), nullptr);
  PutOnClipboard(m_board, WTEXT("ours again"));
  EXPECT_EQ(ClipboardText(m_board), SString(WTEXT("ours again")));
}

}  // namespace
