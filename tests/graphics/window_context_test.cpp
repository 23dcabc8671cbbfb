// Contexts of windows: where they draw, and what is kept out of them.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <random>

#include "qxcore/graphics/background.h"
#include "qxcore/graphics/bitmap.h"
#include "qxcore/graphics/window_dc.h"

namespace {

constexpr COLORREF kParent = RGB(10, 20, 200), kChild = RGB(200, 20, 10), kFrame = RGB(5, 120, 40);

LRESULT CALLBACK PlainProcedure(HWND window, UINT message, WPARAM wParam, LPARAM lParam) {
  if (message == WM_ERASEBKGND) return 1;
  return DefWindowProcW(window, message, wParam, lParam);
}

class WindowContexts : public testing::Test {
 protected:
  static void SetUpTestSuite() {
    WNDCLASSW description{};
    description.lpfnWndProc = PlainProcedure;
    description.lpszClassName = WTEXT("WindowContexts");
    RegisterClassW(&description);
  }
  void SetUp() override {
    top = CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_POPUP | WS_CLIPCHILDREN | WS_VISIBLE, 20, 20, 120,
                          90, nullptr, nullptr, nullptr, nullptr);
    child = CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_CHILD | WS_VISIBLE, 30, 20, 40, 30, top, nullptr,
                            nullptr, nullptr);
    if (!top || !child) GTEST_SKIP() << "no windows without a display";
    UpdateWindow(top);
  }
  void TearDown() override {
    if (top) DestroyWindow(top);
  }

  static void Fill(HWND window, COLORREF color) {
    SClientDC dc(window);
    dc.FillSolidRect(SRect(-50, -50, 500, 500), color);
  }

  HWND top = nullptr, child = nullptr;
};

TEST_F(WindowContexts, DrawOnTheirPartOfTheWindow) {
  Fill(top, kParent);
  Fill(child, kChild);
  Fill(top, kFrame);  // not over the child
  SClientDC dc(top), inner(child);
  EXPECT_EQ(dc.GetPixel(SPoint(5, 5)), kFrame);
  EXPECT_EQ(inner.GetPixel(SPoint(0, 0)), kChild);
  EXPECT_EQ(inner.GetPixel(SPoint(39, 29)), kChild);
  EXPECT_EQ(inner.GetClipBox(), SRect(0, 0, 40, 30));
  EXPECT_EQ(dc.GetPixel(SPoint(71, 21)), kFrame) << "beside the child";
  EXPECT_TRUE(inner.RectVisible(SRect(0, 0, 1, 1)));
  EXPECT_FALSE(inner.RectVisible(SRect(40, 0, 50, 10)));
  EXPECT_FALSE(dc.RectVisible(SRect(35, 25, 50, 40))) << "under the child";
  EXPECT_EQ(WindowFromDC(inner), child);
}

// The border belongs to the window and not to its client area.
TEST_F(WindowContexts, OfAWholeWindow_BeginAtItsCorner) {
  const HWND framed = CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_CHILD | WS_VISIBLE | WS_BORDER, 5, 5,
                                      50, 40, top, nullptr, nullptr, nullptr);
  ASSERT_NE(framed, nullptr);
  Fill(framed, kChild);
  {
    SWindowDC whole(framed);
    EXPECT_EQ(whole.GetClipBox(), SRect(0, 0, 50, 40));
    EXPECT_EQ(whole.GetPixel(SPoint(1, 1)), kChild);
    EXPECT_EQ(whole.GetPixel(SPoint(48, 38)), kChild);
    EXPECT_NE(whole.GetPixel(SPoint(0, 0)), kChild);
    whole.FillSolidRect(SRect(0, 0, 50, 1), kFrame);
    EXPECT_EQ(whole.GetPixel(SPoint(49, 0)), kFrame);
  }
  SClientDC client(framed);
  EXPECT_EQ(client.GetClipBox(), SRect(0, 0, 48, 38));
  EXPECT_EQ(client.GetPixel(SPoint(0, 0)), kChild) << "only the border was drawn on";
  DestroyWindow(framed);
  SWindowDC none(framed);
  EXPECT_EQ(none.GetSafeHdc(), nullptr);
}

TEST_F(WindowContexts, PaintOnlyWhatIsInvalid) {
  Fill(child, kParent);
  ValidateRect(child, nullptr);
  RECT part{10, 5, 20, 15};
  InvalidateRect(child, &part, FALSE);
  {
    SPaintDC dc(child);
    EXPECT_EQ(SRect(dc.m_ps.rcPaint), SRect(part));
    dc.FillSolidRect(SRect(0, 0, 40, 30), kChild);
  }
  SClientDC dc(child);
  EXPECT_EQ(dc.GetPixel(SPoint(10, 5)), kChild);
  EXPECT_EQ(dc.GetPixel(SPoint(9, 5)), kParent);
  EXPECT_EQ(dc.GetPixel(SPoint(20, 14)), kParent);
  EXPECT_FALSE(GetUpdateRect(child, nullptr, FALSE));
}

TEST_F(WindowContexts, CopyIntoABitmap) {
  Fill(child, kChild);
  SClientDC dc(child);
  SBitmap bitmap;
  bitmap.CreatePixels(40, 30);
  SMemoryDC memory(dc);
  SSelectObject select(memory, bitmap);
  ASSERT_TRUE(memory.BitBlt(SRect(0, 0, 40, 30), dc, SPoint(0, 0)));
  GdiFlush();
  for (int i = 0; i < 40 * 30; ++i) ASSERT_EQ(bitmap.GetBits()[i] & 0xFFFFFF, 0xC8140Au) << i;
}

TEST_F(WindowContexts, ABackgroundFillsTheClientArea) {
  SDrawBackground background;
  background.GetGradient().SetGradient(SDrawGradient::HORZ, kParent, kChild, SRect());
  SClientDC dc(child);
  EXPECT_TRUE(background.Erase(dc, child));
  EXPECT_EQ(background.GetGradient().GetStartRect(), SRect(0, 0, 40, 30));
  EXPECT_EQ(dc.GetPixel(SPoint(39, 29)), kChild) << "the last band has the end colour";
  EXPECT_FALSE(background.Erase(dc, nullptr));
}

#ifndef _WIN32
// Wine moves the windows of a batch one after the other, and one over the pixels of the next.

// Windows in the cells of a grid, each of one colour.
class Grid {
 public:
  static constexpr int kColumns = 4, kRows = 3, kCount = kColumns * kRows;

  explicit Grid(HWND top) : m_top(top) {
    for (HWND& window : m_windows) window = Make(SRect());
  }

  // One of the windows comes or goes, or moves by itself, beside the others.
  void DisturbOne() {
    const int i = Roll(kCount);
    HWND& window = m_windows[i];
    const int show = IsWindowVisible(window) ? SW_HIDE : SW_SHOWNA;
    switch (Roll(6)) {
      case 0:
        ShowWindow(window, show);
        break;
      case 1:
        SetWindowLongW(window, GWL_STYLE, GetWindowLongW(window, GWL_STYLE) ^ WS_VISIBLE);
        break;
      case 2:
        SendMessageW(window, WM_SETREDRAW, !IsWindowVisible(window), 0);
        break;
      case 3:
        DestroyWindow(window);
        window = Make(m_places[i] = PlaceBeside(i));
        break;
      case 4:
        m_places[i] = PlaceBeside(i);
        MoveWindow(window, m_places[i].left, m_places[i].top, m_places[i].Width(), m_places[i].Height(), TRUE);
        break;
      case 5:
        ShowWindow(m_top, SW_HIDE);
        ShowWindow(window, show);
        ShowWindow(m_top, SW_SHOWNA);
        break;
    }
  }

  // New cells, mostly in the former order; the windows move to them at once.
  void MoveAll() {
    const std::array<int, kColumns + 1> x = Edges<kColumns>(120);
    const std::array<int, kRows + 1> y = Edges<kRows>(90);
    if (Roll(3) == 0) std::swap(m_cells[Roll(kCount)], m_cells[Roll(kCount)]);
    m_former = Shown();
    HDWP batch = BeginDeferWindowPos(kCount);
    for (int i = 0; i < kCount; ++i) {
      const int column = m_cells[i] % kColumns, row = m_cells[i] / kColumns;
      SRect& place = m_places[i];
      place = SRect(x[column], y[row], x[column + 1] - Roll(3), y[row + 1] - Roll(3));
      place.right = std::max(place.left, place.right);
      place.bottom = std::max(place.top, place.bottom);
      batch = DeferWindowPos(batch, m_windows[i], nullptr, place.left, place.top, place.Width(), place.Height(),
                             SWP_NOZORDER | SWP_NOACTIVATE | SWP_DEFERERASE);
    }
    ASSERT_TRUE(EndDeferWindowPos(batch));
  }

  // What is not invalid shows what it showed before: of a window its colour, of the parent what was not covered.
  void Check() {
    const HRGN invalid = CreateRectRgn(0, 0, 0, 0);
    for (int i = 0; i < kCount; ++i) {
      if (!IsWindowVisible(m_windows[i])) continue;
      GetUpdateRgn(m_windows[i], invalid, FALSE);
      SClientDC dc(m_windows[i]);
      for (int y = 0; y < m_places[i].Height(); y += 2) {
        for (int x = 0; x < m_places[i].Width(); x += 2) {
          if (PtInRegion(invalid, x, y)) continue;
          ASSERT_EQ(dc.GetPixel(SPoint(x, y)), Color(i)) << i << ": " << x << ", " << y;
        }
      }
    }
    GetUpdateRgn(m_top, invalid, FALSE);
    const Places shown = Shown();
    for (int y = 0; y < 90; ++y) {
      for (int x = 0; x < 140; ++x) {
        const bool wasUncovered = IsIn(m_former, x, y) && !IsIn(shown, x, y);
        ASSERT_TRUE(!wasUncovered || PtInRegion(invalid, x, y)) << x << ", " << y;
        if (m_isAllInvalid) {
          ASSERT_EQ(!PtInRegion(invalid, x, y), IsIn(shown, x, y)) << x << ", " << y;
        }
      }
    }
    DeleteObject(invalid);
  }

  void Paint() {
    for (int i = 0; i < kCount; ++i) {
      SClientDC dc(m_windows[i]);
      dc.FillSolidRect(SRect(0, 0, 500, 500), Color(i));
      ValidateRect(m_windows[i], nullptr);
    }
    ValidateRect(m_top, nullptr);
    m_isAllInvalid = false;
  }
  void InvalidateAll() {
    InvalidateRect(m_top, nullptr, TRUE);
    m_isAllInvalid = true;
  }

 private:
  using Places = std::array<SRect, kCount>;

  HWND Make(const SRect& place) {
    return CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_CHILD | WS_VISIBLE, place.left, place.top,
                           place.Width(), place.Height(), m_top, nullptr, nullptr, nullptr);
  }
  SRect PlaceBeside(int i) { return SRect(SPoint(120, 7 * i), SSize(Roll(20), Roll(7))); }
  Places Shown() const {
    Places shown = m_places;
    for (int i = 0; i < kCount; ++i)
      if (!IsWindowVisible(m_windows[i])) shown[i] = SRect();
    return shown;
  }
  static COLORREF Color(int i) { return RGB(20 * i + 10, 255 - 20 * i, 7 * i); }
  static bool IsIn(const Places& places, int x, int y) {
    return std::any_of(places.begin(), places.end(), [&](const SRect& place) { return place.Contains(SPoint(x, y)); });
  }
  int Roll(int sides) { return static_cast<int>(m_random() % static_cast<unsigned>(sides)); }
  template <int count>
  std::array<int, count + 1> Edges(int length) {
    std::array<int, count + 1> edges = {};
    for (int& edge : edges) edge = Roll(length + 1);
    std::sort(edges.begin(), edges.end());
    return edges;
  }

  HWND m_top;
  std::array<HWND, kCount> m_windows = {};
  std::array<int, kCount> m_cells = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11};
  Places m_places, m_former;
  bool m_isAllInvalid = false;  // the parent, where none of the windows lies
  std::mt19937 m_random{7};
};

// However often they move before anybody looks, and whatever happens to one of them meanwhile.
TEST_F(WindowContexts, WhatMovesTogetherKeepsItsPixelsOrIsInvalid) {
  ShowWindow(child, SW_HIDE);
  SetWindowPos(top, nullptr, 0, 0, 140, 90, SWP_NOMOVE | SWP_NOZORDER);
  Grid grid(top);
  for (int step = 0; step < 600; ++step) {
    if (step % 3 == 0) grid.DisturbOne();
    grid.Paint();
    if (step % 5 == 0) grid.InvalidateAll();
    for (int moves = step % 3; moves >= 0; --moves) grid.MoveAll();
    grid.Check();
    if (HasFatalFailure()) FAIL() << "step " << step;
  }
}

// The children's places are none of what a window that leaves them out has to paint, however it was
// invalidated. Wine counts them in.
TEST_F(WindowContexts, NothingIsLeftToPaintAroundAChild) {
  RECT client, place;
  GetClientRect(top, &client);
  GetWindowRect(child, &place);
  MapWindowPoints(nullptr, top, reinterpret_cast<POINT*>(&place), 2);
  const RECT sides[] = {{0, 0, client.right, place.top},
                        {0, place.top, place.left, place.bottom},
                        {place.right, place.top, client.right, place.bottom},
                        {0, place.bottom, client.right, client.bottom}};
  const auto isDue = [&] {
    MSG message;
    const bool waits = PeekMessageW(&message, top, WM_PAINT, WM_PAINT, PM_NOREMOVE);
    EXPECT_EQ(GetUpdateRect(top, nullptr, FALSE), waits);
    return waits;
  };
  InvalidateRect(top, nullptr, TRUE);
  for (const RECT& side : sides) {
    EXPECT_TRUE(isDue());
    ValidateRect(top, &side);
  }
  EXPECT_FALSE(isDue());
  MoveWindow(child, 0, 0, client.right, client.bottom, FALSE);
  ValidateRect(top, nullptr);
  InvalidateRect(top, nullptr, TRUE);
  EXPECT_FALSE(isDue()) << "the child covers all of it";
}
#endif

// Windows of which a part is hidden, or the place that it moves to.
class HiddenParts : public WindowContexts {
 protected:
  HWND Make(HWND parent, const SRect& place, DWORD style = 0) {
    const HWND window =
        CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_CHILD | WS_VISIBLE | style, place.left, place.top,
                        place.Width(), place.Height(), parent, nullptr, nullptr, nullptr);
    Show(window);
    return window;
  }
  // Each pixel that shows tells its place.
  static void Show(HWND window) {
    SClientDC dc(window);
    RECT client;
    GetClientRect(window, &client);
    for (int y = 0; y < client.bottom; ++y)
      for (int x = 0; x < client.right; ++x) dc.SetPixel(SPoint(x, y), Color(x, y));
    ValidateRect(window, nullptr);
  }
  static COLORREF Color(int x, int y) { return RGB(3 * x, 2 * y, 77); }
  // All that can be seen of the window is as it was painted, or invalid.
  static void Check(HWND window, const char* what) {
    const HRGN invalid = CreateRectRgn(0, 0, 0, 0);
    GetUpdateRgn(window, invalid, FALSE);
    SClientDC dc(window);
    RECT client;
    GetClientRect(window, &client);
    int valid = 0, wrong = 0;
    for (int y = 0; y < client.bottom; ++y) {
      for (int x = 0; x < client.right; ++x) {
        if (PtInRegion(invalid, x, y) || !dc.RectVisible(SRect(x, y, x + 1, y + 1))) continue;
        ++valid;
        wrong += dc.GetPixel(SPoint(x, y)) != Color(x, y);
      }
    }
    DeleteObject(invalid);
    EXPECT_EQ(wrong, 0) << what << ", of " << valid;
  }
  static void Place(HWND window, int x, int y, int width, int height) {
    SetWindowPos(window, nullptr, x, y, width, height, SWP_NOZORDER | SWP_NOACTIVATE);
  }
};

TEST_F(HiddenParts, AreInvalidOnceTheyShow) {
  ShowWindow(child, SW_HIDE);
  const HWND edge = Make(top, SRect(90, 60, 150, 120), WS_CLIPSIBLINGS);
  Place(edge, 20, 10, 60, 60);
  Check(edge, "was cut by the parent");
  Show(edge);
  const HWND above = Make(top, SRect(30, 20, 60, 50), WS_CLIPSIBLINGS);
  SetWindowPos(above, HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
  Show(edge);
  Show(above);
  Place(edge, 55, 30, 60, 60);
  Check(edge, "was below another one");
  Check(above, "lies above");
}

TEST_F(HiddenParts, ComeToLightWithTheParent) {
  for (const DWORD style : {DWORD{0}, DWORD{WS_CLIPCHILDREN}}) {
    Place(child, 30, 20, 40, 30);
    SetWindowLongW(child, GWL_STYLE, static_cast<LONG>(WS_CHILD | WS_VISIBLE | style));
    const HWND inner = Make(child, SRect(20, 10, 60, 60));
    Place(child, 30, 20, 70, 60);
    Check(inner, "the parent grew");
    DestroyWindow(inner);
  }
}

// A frame that shrinks, with a window at its right edge that stays there.
TEST_F(HiddenParts, TheEdgeOfAShrinkingFrameMovesAlong) {
  Place(child, 80, 20, 40, 30);
  Show(child);
  Place(top, 20, 20, 90, 90);
  Place(child, 50, 20, 40, 30);
  Check(child, "its former place is outside");
}

// A frame that grows inwards, as with a menu, moves the client area with all that it shows.
TEST_F(HiddenParts, TheClientAreaMovesWithinTheWindow) {
  Show(top);
  Show(child);
  for (const DWORD style : {DWORD{WS_DLGFRAME}, DWORD{0}}) {
    SetWindowLongW(top, GWL_STYLE, static_cast<LONG>(WS_POPUP | WS_CLIPCHILDREN | WS_VISIBLE | style));
    SetWindowPos(top, nullptr, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_FRAMECHANGED);
    Check(top, "the client area");
    Check(child, "a window in it");
  }
}

TEST_F(HiddenParts, ChildrenThatScroll) {
  Show(child);
  const HWND other = Make(top, SRect(75, 20, 115, 50));
  ScrollWindowEx(top, 0, -13, nullptr, nullptr, nullptr, nullptr, SW_SCROLLCHILDREN | SW_INVALIDATE | SW_ERASE);
  Check(child, "scrolled");
  Check(other, "scrolled, too");
}

// What a window hid of another one is nobody's when both have moved.
TEST_F(WindowContexts, WhatLayBelowAnotherWindowOfABatchIsInvalid) {
  ShowWindow(child, SW_HIDE);
  const auto make = [&](const SRect& place) {
    const HWND window =
        CreateWindowExW(0, WTEXT("WindowContexts"), WTEXT(""), WS_CHILD | WS_VISIBLE | WS_CLIPSIBLINGS, place.left,
                        place.top, place.Width(), place.Height(), top, nullptr, nullptr, nullptr);
    SClientDC(window).FillSolidRect(SRect(0, 0, 100, 100), RGB(200, 0, 0));
    ValidateRect(window, nullptr);
    return window;
  };
  const COLORREF below = RGB(0, 0, 200);
  for (const int shift : {0, 7}) {
    const HWND large = make(SRect(0, 14, 60, 74)), small = make(SRect(10, 10, 30, 30));
    const HWND flat = make(SRect(80, 10, 90, 12));  // ends above the large one, which does not lie below the whole row
    SetWindowPos(small, HWND_TOP, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
    SetWindowPos(flat, small, 0, 0, 0, 0, SWP_NOMOVE | SWP_NOSIZE | SWP_NOACTIVATE);
    SClientDC(large).FillSolidRect(SRect(0, 0, 100, 100), below);
    ValidateRect(large, nullptr);
    HDWP batch = BeginDeferWindowPos(2);
    constexpr UINT kFlags = SWP_NOSIZE | SWP_NOZORDER | SWP_NOACTIVATE | SWP_DEFERERASE;
    batch = DeferWindowPos(batch, small, nullptr, 70, 65, 0, 0, kFlags);
    batch = DeferWindowPos(batch, large, nullptr, shift, 14 + shift, 0, 0, kFlags);
    ASSERT_TRUE(EndDeferWindowPos(batch));
    const HRGN invalid = CreateRectRgn(0, 0, 0, 0);
    GetUpdateRgn(large, invalid, FALSE);
    SClientDC dc(large);
    for (int y = 0; y < 60; ++y) {
      for (int x = 0; x < 60; ++x) {
        if (PtInRegion(invalid, x, y)) continue;
        ASSERT_EQ(dc.GetPixel(SPoint(x, y)), below) << x << ", " << y << " after a move by " << shift;
      }
    }
    DeleteObject(invalid);
    for (const HWND window : {large, small, flat}) DestroyWindow(window);
  }
}

TEST_F(WindowContexts, AStaleWindowHasNone) {
  DestroyWindow(child);
  EXPECT_EQ(GetDC(child), nullptr);
  SClientDC dc(child);
  EXPECT_EQ(dc.GetSafeHdc(), nullptr);
}

}  // namespace
