// A status bar in its frame: what it makes of its panes, and what its control then shows.

#include <climits>
#include <random>

#include "qxcore/ui/accessible/accessible.h"
#include "tests/bar/bar_fixture.h"
#include "tests/bar/pane_peer.h"

namespace {

using test::Frame;
using test::PartRect;
using test::PartsOf;
using test::PartText;
using test::PartType;

// Counts the texts that the control is given.
class Bar : public SStatusBar {
 public:
  int OnWndMsg(UINT message, WPARAM wParam, LPARAM lParam, LRESULT* result) override {
    if (message != SB_SETTEXTW) return SStatusBar::OnWndMsg(message, wParam, lParam, result);
    m_sent.push_back(LOBYTE(wParam));
    m_deepest = std::max(m_deepest, ++m_depth);
    *result = DefWindowProcW(message, wParam, lParam);
    if (m_paintsAtOnce) UpdateWindow();
    --m_depth;
    return 1;
  }
  void Paint() {
    Invalidate();
    UpdateWindow();
  }
  std::vector<int> m_sent;
  bool m_paintsAtOnce = false;  // as some systems do
  int m_depth = 0, m_deepest = 0;
};

class StatusBars : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    m_frame = Frame::Make();
    ASSERT_NE(m_frame, nullptr);
    ASSERT_TRUE(m_bar.Create(m_frame));
    m_frame->RecalcLayout();
  }
  void TearDown() override {
    m_frame->DestroyWindow();
    UiTest::TearDown();
  }
  int SetText(int index, LPCWSTR text, int update = 1) {
    const SString stored(text);
    return m_bar.SetPaneText(index, &stored, update);
  }
  // What panes are laid out in, read from the bar's own window.
  SPaneSpace Space() const {
    const bool hasGrip = (m_bar.GetStyle() & SBARS_SIZEGRIP) && !m_frame->IsZoomed();
    const int grip = hasGrip ? 2 * ::GetSystemMetrics(SM_CXBORDER) + ::GetSystemMetrics(SM_CXVSCROLL) : 0;
    return {m_bar.GetWindowRect().Width() - grip, 0, 2, 6};
  }

  Bar m_bar;
  Frame* m_frame = nullptr;
};

TEST_F(StatusBars, Create_StandsAtTheBottomWithItsOwnHeight) {
  EXPECT_EQ(m_bar.GetStyle() & 0x1FF, 0x14Eu) << "the parent has a sizing border";
  SClientDC dc(m_bar.m_hWnd);
  const SSelectObject font(dc, SGetDefaultUIFont());
  TEXTMETRICW metrics = {};
  dc.GetTextMetricsW(&metrics);
  // The borders of an empty rectangle add to the height: -(bottom - top) of a rectangle with 2 above is 2.
  const int height = 2 * (::GetSystemMetrics(SM_CYBORDER) + 2) + 2 - metrics.tmInternalLeading + metrics.tmHeight - 1;
  EXPECT_EQ(m_bar.GetBarLayout(1, 1), SSize(32767, height));
  EXPECT_EQ(test::PlaceOf(m_bar), SRect(0, 300 - height, 400, 300));
  EXPECT_EQ(m_bar.GetClientRect().Size(), SSize(400, height)) << "the upper border is the control's own";
  EXPECT_EQ(m_bar.GetFont(), SGetDefaultUIFont());

  EXPECT_EQ(m_bar.SendMessageW(SB_SETMINHEIGHT, 50), 1);
  m_frame->SetClientSize(500, 250);
  EXPECT_EQ(test::PlaceOf(m_bar), SRect(0, 200, 500, 250));

  Frame* fixed = Frame::Make(WS_POPUP | WS_CAPTION | WS_VISIBLE);
  SStatusBar plain;
  ASSERT_TRUE(plain.Create(fixed, 0x88000000));
  EXPECT_EQ(plain.GetStyle() & SBARS_SIZEGRIP, 0u);
  EXPECT_EQ(plain.GetBarStyle(), 0x80000000u) << "the kinds of border are taken away";
  fixed->DestroyWindow();
}

// Borders of the style lie around the client area, make the bar higher, and leave the panes less room.
TEST_F(StatusBars, Borders_TakeTheirRoom) {
  constexpr DWORD kAll = kSBarBorderLeft | kSBarBorderTop | kSBarBorderRight | kSBarBorderBottom;
  m_bar.InsertPane(0, 0, kSPaneStretch);
  Frame* fixed = Frame::Make(WS_POPUP | WS_VISIBLE);
  for (const DWORD kind : {DWORD{0}, DWORD{kSBarBorder3d}}) {
    const SUISysData& measures = *SGetUISysData();
    const int width = kind ? measures.m_edgeWidth : measures.m_borderWidth;
    const int height = kind ? measures.m_edgeHeight : measures.m_borderHeight;
    Bar bar;
    ASSERT_TRUE(bar.Create(fixed, kAll | kind));
    EXPECT_EQ(bar.GetBarStyle(), kAll | kind) << "only another style loses its kinds of border";
    bar.InsertPane(0, 0, kSPaneStretch);
    bar.InsertPane(1, 30, 0);
    fixed->RecalcLayout();
    EXPECT_EQ(bar.GetBarLayout(1, 1).cy, m_bar.GetBarLayout(1, 1).cy + 2 * height);
    const SRect place = bar.GetWindowRect();
    EXPECT_EQ(bar.GetClientRect().Size(), place.Size() - SSize(2 * width, 2 * height));
    EXPECT_EQ(PartsOf(bar)[1], place.Width() - 2 * width);
    EXPECT_EQ(PartsOf(bar)[0], place.Width() - 2 * width - 36 - 2);
  }
  fixed->DestroyWindow();
}

TEST_F(StatusBars, RandomChanges_ShowWhatASecondReadingSays) {
  std::mt19937 random(4);
  const auto number = [&](int below) { return static_cast<int>(random() % static_cast<unsigned>(below)); };
  SStatusBarLayout layout;
  layout.Attach(&m_bar);
  test::Peer own, extra;
  static constexpr DWORD bits[] = {0x00100000, 0x00200000, 0x01000000, 0x04000000, 0x08000000, 0x100, 0};
  for (int step = 0; step < 1500; ++step) {
    const bool isExtra = number(3) == 0;
    test::Peer& peer = isExtra ? extra : own;
    const auto call = [&](auto change) { return isExtra ? change(layout) : change(m_bar); };
    const int index = number(static_cast<int>(peer.size()) + 2) - 1;
    const int at = test::Resolve(peer, index);
    const auto place = static_cast<std::size_t>(at);
    switch (number(peer.size() > 9 ? 6 : 8)) {
      case 0:
        EXPECT_EQ(call([&](auto& panes) { return panes.DeletePane(index); }), at >= 0);
        if (at >= 0) peer.erase(peer.begin() + at);
        break;
      case 1: {
        const SString text(
            WideString(static_cast<std::size_t>(number(8)), static_cast<WCHAR>('a' + number(3))).c_str());
        EXPECT_EQ(call([&](auto& panes) { return panes.SetPaneText(index, &text, number(2)); }), at >= 0);
        if (at < 0) break;
        if (peer[place].style & 0x08000000) peer[place].width = test::WidthOf(m_bar, text.View());
        peer[place].text = text.View();
        break;
      }
      case 2: {
        const int width = number(90);
        EXPECT_EQ(call([&](auto& panes) { return panes.SetPaneWidth(index, width); }), at >= 0);
        if (at >= 0) peer[place].width = width;
        break;
      }
      case 3: {
        const DWORD style = bits[number(7)] | bits[number(7)];
        EXPECT_EQ(call([&](auto& panes) { return panes.SetPaneStyle(index, style); }), at >= 0);
        if (at < 0) break;
        peer[place].style = style;
        if (style & 0x08000000) peer[place].width = test::WidthOf(m_bar, peer[place].text);
        break;
      }
      case 4:
        EXPECT_EQ(layout.Activate(number(2)), 1);
        break;
      case 5:
        m_frame->SetClientSize(200 + number(600), 200);
        break;
      default: {
        const DWORD style = bits[number(7)] | bits[number(7)];
        const int width = number(90);
        const int before = index >= 0 ? index : std::max(test::MainOf(peer), 0);
        EXPECT_EQ(call([&](auto& panes) { return panes.InsertPane(index, width, style); }), 1);
        peer.insert(peer.begin() + std::min<int>(before, static_cast<int>(peer.size())),
                    {style & 0x08000000 ? 0 : width, style, {}});
      }
    }
    const test::Peer none;
    const test::Peer& active = layout.IsActive() ? extra : none;
    const test::Peer shown = test::Displayed(own, active);
    if (shown.empty()) continue;
    ASSERT_EQ(PartsOf(m_bar), test::EdgesOf(own, active, Space())) << "step " << step;
    if (step % 10 != 0) continue;
    m_bar.UpdatePaneStrings();
    for (std::size_t i = 0; i < shown.size(); ++i) {
      const bool isKept = (shown[i].style & 0x01000000) != 0;
      ASSERT_EQ(PartText(m_bar, static_cast<int>(i)), isKept ? WideString() : shown[i].text) << "step " << step;
      ASSERT_EQ(PartType(m_bar, static_cast<int>(i)), static_cast<int>(shown[i].style & 0xFF00));
    }
  }
}

TEST_F(StatusBars, MainPane_MissingMeansNothing) {
  SString text(WTEXT("kept"));
  EXPECT_EQ(m_bar.GetPaneText(kSMainPane, &text), 0);
  EXPECT_EQ(text, WTEXT("kept"));
  EXPECT_EQ(m_bar.GetPaneText(kSMainPane), WTEXT(""));
  EXPECT_EQ(m_bar.SetMainPaneText(&text), 0);
  EXPECT_EQ(m_bar.GetPaneStyle(kSMainPane), 0u);
  EXPECT_EQ(m_bar.GetPaneWidth(kSMainPane), 0);
  EXPECT_EQ(m_bar.SetPaneStyle(kSMainPane, 1), 0);
  EXPECT_EQ(m_bar.SetPaneWidth(kSMainPane, 1), 0);
  EXPECT_EQ(m_bar.DeletePane(kSMainPane), 0);
  SRect rect;
  EXPECT_EQ(m_bar.GetPaneRect(kSMainPane, &rect), 0);
  EXPECT_EQ(m_bar.GetExtraLayoutItemRect(0, &rect), 0);
}

TEST_F(StatusBars, Texts_AreSentOnceAndWhenTheyAreDue) {
  m_bar.InsertPane(0, 50, kSPaneMain);
  m_bar.InsertPane(1, 50, 0);
  m_bar.Paint();
  m_bar.m_sent.clear();
  EXPECT_EQ(SetText(1, WTEXT("now")), 1);
  EXPECT_EQ(m_bar.m_sent, std::vector<int>{1});
  EXPECT_EQ(SetText(1, WTEXT("now")), 1);
  EXPECT_EQ(m_bar.m_sent.size(), 1u) << "it has not changed";
  EXPECT_EQ(SetText(kSMainPane, WTEXT("later"), 0), 1);
  EXPECT_EQ(m_bar.m_sent.size(), 1u);
  EXPECT_EQ(m_bar.GetPaneText(0), WTEXT("later"));
  m_bar.Paint();
  EXPECT_EQ(m_bar.m_sent, (std::vector<int>{1, 0}));
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("later"));

  // Where the control paints as soon as it gets a text, one text does not lead into the next.
  m_bar.m_paintsAtOnce = true;
  for (int i = 2; i < 40; ++i) m_bar.InsertPane(i, 5, 0);
  m_bar.m_sent.clear();
  m_bar.m_deepest = 0;
  m_bar.Paint();
  EXPECT_EQ(m_bar.m_sent.size(), 40u);
  EXPECT_EQ(m_bar.m_deepest, 1);
  m_bar.m_paintsAtOnce = false;

  m_bar.m_sent.clear();
  EXPECT_EQ(m_bar.SetPaneWidth(0, 50), 1);
  EXPECT_EQ(m_bar.SetPaneWidth(0, 60), 1);
  m_bar.Paint();
  EXPECT_TRUE(m_bar.m_sent.empty()) << "a width changes no text";
  while (m_bar.DeletePane(0)) {
  }
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("")) << "without panes nothing is left to see";
}

TEST_F(StatusBars, WindowText_IsThatOfThePaneAtTheFront) {
  EXPECT_EQ(m_bar.SendMessageW(WM_SETTEXT, 0, reinterpret_cast<LPARAM>(WTEXT("lost"))), -1);
  EXPECT_EQ(m_bar.SendMessageW(WM_GETTEXTLENGTH), 0);
  WCHAR buffer[4] = {'?', '?', '?', '?'};
  EXPECT_EQ(m_bar.SendMessageW(WM_GETTEXT, 4, reinterpret_cast<LPARAM>(buffer)), 0);
  EXPECT_EQ(buffer[0], 0);
  m_bar.InsertPane(0, 50, 0);
  EXPECT_EQ(m_bar.SendMessageW(WM_SETTEXT, 0, reinterpret_cast<LPARAM>(WTEXT("title"))), 0);
  EXPECT_EQ(m_bar.GetPaneText(0), WTEXT("title"));
  EXPECT_EQ(m_bar.SendMessageW(WM_GETTEXTLENGTH), 5);
  EXPECT_EQ(m_bar.SendMessageW(WM_GETTEXT, 4, reinterpret_cast<LPARAM>(buffer)), 3);
  EXPECT_EQ(WideString(buffer), WTEXT("tit"));
  buffer[0] = '?';
  EXPECT_EQ(m_bar.SendMessageW(WM_GETTEXT, 0, reinterpret_cast<LPARAM>(buffer)), 0);
  EXPECT_EQ(buffer[0], '?');
}

TEST_F(StatusBars, MaximisedParent_LeavesTheGripsRoomToThePanes) {
  m_bar.InsertPane(0, 0, kSPaneStretch);
  EXPECT_LT(PartsOf(m_bar).back(), 400 - ::GetSystemMetrics(SM_CXVSCROLL));
  m_frame->ShowWindow(SW_MAXIMIZE);
  EXPECT_EQ(PartsOf(m_bar).back(), m_bar.GetWindowRect().Width());
  const SRect place = m_bar.GetWindowRect();
  const LPARAM corner = MAKELPARAM(place.right - 2, place.bottom - 2);
  EXPECT_EQ(m_bar.SendMessageW(WM_NCHITTEST, 0, corner), HTCLIENT);
  m_frame->ShowWindow(SW_RESTORE);
  const SRect restored = m_bar.GetWindowRect();
  const auto hit = [&](int x, int y) { return m_bar.SendMessageW(WM_NCHITTEST, 0, MAKELPARAM(x, y)); };
  EXPECT_EQ(hit(restored.right - 2, restored.bottom - 2), HTBOTTOMRIGHT);
  EXPECT_EQ(hit(restored.left + 2, restored.top + 2), HTCLIENT);
}

// Drawn on a context of its own, to be compared pixel by pixel.
TEST_F(StatusBars, OwnerDrawnPane_IsPaintedInGrey) {
  m_bar.InsertPane(0, 20, 0);
  m_bar.InsertPane(1, 100, kSPaneOwnerDraw);
  SetText(1, WTEXT("R&D IIII"));
  m_bar.Paint();
  EXPECT_EQ(PartType(m_bar, 1) & SBT_OWNERDRAW, SBT_OWNERDRAW);
  const SRect client = m_bar.GetClientRect();
  const auto picture = [&](auto draw) {
    SMemoryDC dc;
    SBitmap bitmap;
    bitmap.CreatePixels(client.Width(), client.Height());
    const SSelectObject selected(dc, bitmap);
    const SSelectObject font(dc, m_bar.GetFont());
    dc.FillSolidRect(client, ::GetSysColor(COLOR_3DFACE));
    dc.SetBkColor(RGB(1, 2, 3));
    dc.SetTextColor(RGB(4, 5, 6));
    draw(dc);
    EXPECT_EQ(dc.GetBkColor(), RGB(1, 2, 3)) << "the colours are those from before";
    EXPECT_EQ(dc.GetTextColor(), RGB(4, 5, 6));
    std::vector<COLORREF> pixels;
    for (int y = 0; y < client.bottom; ++y) {
      for (int x = 0; x < 140; ++x) pixels.push_back(dc.GetPixel(SPoint(x, y)));
    }
    return pixels;
  };
  const auto expected = picture([&](SDC& dc) {
    SRect rect = PartRect(m_bar, 1);
    rect.left += 3;
    const COLORREF background = dc.SetBkColor(::GetSysColor(COLOR_3DFACE)), foreground = dc.SetTextColor(0x808080);
    dc.DrawTextW(WTEXT("R&D IIII"), rect, DT_SINGLELINE | DT_VCENTER | DT_NOPREFIX);
    dc.SetBkColor(background);
    dc.SetTextColor(foreground);
  });
  const auto drawn = picture([&](SDC& dc) {
    DRAWITEMSTRUCT item = {};
    item.itemID = 1;
    item.hwndItem = m_bar.m_hWnd;
    item.hDC = dc.GetSafeHdc();
    m_bar.SendMessageW(0xBC2B, 0, reinterpret_cast<LPARAM>(&item));
  });
  EXPECT_EQ(drawn, expected);
  EXPECT_GT(std::count_if(drawn.begin(), drawn.end(), [](COLORREF color) { return GetRValue(color) < 200; }), 20);
}

// Letters of a right-to-left script stand from the right to the left, whichever side the pane's text begins at.
TEST_F(StatusBars, RightToLeftText_StandsInItsOrder) {
  const WCHAR shin = 0x05E9, vav = 0x05D5;
  const auto picture = [this](const SRect& rect) {
    std::vector<COLORREF> pixels;
    SClientDC dc(m_bar.m_hWnd);
    for (int y = rect.top; y < rect.bottom; ++y) {
      for (int x = rect.left; x < rect.right; ++x) pixels.push_back(dc.GetPixel(SPoint(x, y)));
    }
    return pixels;
  };
  for (const DWORD style : {DWORD{SBT_NOBORDERS}, DWORD{SBT_NOBORDERS | SBT_RTLREADING}}) {
    const WCHAR both[] = {shin, vav, 0}, first[] = {shin, 0};
    ASSERT_EQ(m_bar.InsertPane(0, 60, style), 1);
    SetText(0, both);
    m_bar.Paint();
    const SRect part = PartRect(m_bar, 0);
    const int narrow = test::WidthOf(m_bar, SStringView(&vav, 1)), wide = test::WidthOf(m_bar, SStringView(&shin, 1));
    ASSERT_LT(narrow, wide);
    const bool isAtRight = (style & SBT_RTLREADING) != 0;
    const int left = isAtRight ? part.right - 3 - narrow - wide : part.left + 3;
    const auto shown = picture(SRect(left + narrow, part.top, left + narrow + wide, part.bottom));
    SetText(0, first);
    m_bar.Paint();
    const int alone = isAtRight ? part.right - 3 - wide : part.left + 3;
    EXPECT_EQ(shown, picture(SRect(alone, part.top, alone + wide, part.bottom))) << "the first letter is the right one";
    m_bar.DeletePane(0);
  }
}

// The control takes texts for its first 255 parts; the number behind them is that of its simple mode.
TEST_F(StatusBars, PanesBeyondThoseOfTheControl_AreKeptAndDisturbNone) {
  for (int i = 0; i < 300; ++i) {
    m_bar.InsertPane(i, 1, i == 299 ? DWORD{kSPaneMain} : 0);
    SetText(i, SString(static_cast<long>(i)).GetSafePointer());
  }
  m_bar.Paint();
  EXPECT_EQ(m_bar.GetPaneCount(), 300);
  ASSERT_EQ(PartsOf(m_bar).size(), 255u);
  for (int i = 0; i < 255; ++i) ASSERT_EQ(PartText(m_bar, i), SString(static_cast<long>(i)).View());
  SRect rect;
  EXPECT_EQ(m_bar.GetPaneRect(255, &rect), 0);
  EXPECT_EQ(m_bar.GetPaneText(kSMainPane), WTEXT("299"));
  EXPECT_EQ(m_bar.MakeAccessible()->GetChildCount(), 300);
  for (int i = 0; i < 50; ++i) m_bar.DeletePane(0);
  m_bar.Paint();
  EXPECT_EQ(PartText(m_bar, 249), WTEXT("299")) << "what moves forward is shown";
}

// --- layouts ---

TEST_F(StatusBars, ActiveLayout_ShiftsTheControlsIndices) {
  for (int i = 0; i < 3; ++i) m_bar.InsertPane(i, 20, i == 1 ? DWORD{kSPaneSplice} : 0);
  SetText(2, WTEXT("last"));
  SStatusBarLayout layout;
  layout.InsertPane(0, 30, 0);
  layout.InsertPane(1, 40, kSPaneMain);
  const SString text(WTEXT("extra"));
  EXPECT_EQ(layout.SetMainPaneText(&text), 1);
  EXPECT_EQ(layout.Activate(1), 0) << "it is detached";
  layout.Attach(&m_bar);
  EXPECT_EQ(PartsOf(m_bar).size(), 3u);
  EXPECT_EQ(layout.Activate(1), 1);
  m_bar.m_sent.clear();
  m_bar.Paint();
  EXPECT_EQ(m_bar.m_sent, (std::vector<int>{0, 3, 4, 1, 2})) << "all texts, own ones first";
  EXPECT_EQ(PartText(m_bar, 2), WTEXT("extra"));
  EXPECT_EQ(PartText(m_bar, 4), WTEXT("last"));
  SRect rect;
  EXPECT_EQ(m_bar.GetExtraLayoutItemRect(kSMainPane, &rect), 1);
  EXPECT_EQ(rect, PartRect(m_bar, 2));
  EXPECT_EQ(m_bar.GetPaneRect(2, &rect), 1);
  EXPECT_EQ(rect, PartRect(m_bar, 4));
  EXPECT_EQ(layout.Detach(), &m_bar);
  EXPECT_EQ(layout.Detach(), nullptr);
  EXPECT_EQ(m_bar.GetExtraLayout(), nullptr);
  m_bar.Paint();
  EXPECT_EQ(PartText(m_bar, 2), WTEXT("last"));
}

TEST_F(StatusBars, Layouts_EndBeforeAndAfterTheirBar) {
  m_bar.InsertPane(0, 20, 0);
  SStatusBarLayout idle, active;
  active.InsertPane(0, 20, 0);
  {
    SStatusBarLayout first;
    first.InsertPane(0, 30, 0);
    first.Attach(&m_bar);
    first.Activate(1);
    EXPECT_EQ(PartsOf(m_bar).size(), 2u);
  }
  EXPECT_EQ(PartsOf(m_bar).size(), 1u);
  EXPECT_EQ(m_bar.GetExtraLayout(), nullptr);
  {
    Bar other;
    ASSERT_TRUE(other.Create(m_frame, 0, WS_CHILD, 9));
    idle.Attach(&other);
    active.Attach(&m_bar);
    other.SetExtraLayout(&active);
    EXPECT_EQ(active.GetBar(), &other) << "it moves to the bar that shows it";
    EXPECT_TRUE(active.IsActive());
    idle.Activate(0);
    EXPECT_TRUE(active.IsActive()) << "another layout takes out only itself";
  }
  EXPECT_EQ(idle.GetBar(), nullptr);
  EXPECT_EQ(active.GetBar(), nullptr);
  EXPECT_EQ(active.Activate(1), 0);
}

// --- the DPI ---

TEST_F(StatusBars, AnotherDpi_ScalesEverythingAndComesBack) {
  m_bar.InsertPane(0, 50, 0);
  m_bar.InsertPane(1, 0, kSPaneAutoSize);
  SetText(1, WTEXT("measured"));
  const std::vector<int> before = PartsOf(m_bar);
  const SRect place = test::PlaceOf(m_bar);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(m_bar.GetPaneWidth(0), 100);
  EXPECT_EQ(PartsOf(m_bar)[0], 2 * before[0]) << "the padding, too";
  EXPECT_EQ(m_bar.GetPaneWidth(1), test::WidthOf(m_bar, WTEXT("measured")));
  EXPECT_EQ(m_bar.GetFont(), SGetDefaultUIFont(192));
  EXPECT_GT(test::PlaceOf(m_bar).Height(), place.Height() * 3 / 2);
  EXPECT_EQ(test::PlaceOf(m_bar).bottom, place.bottom);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
  EXPECT_EQ(PartsOf(m_bar), before);
  EXPECT_EQ(test::PlaceOf(m_bar), place);
}

TEST_F(StatusBars, WidthsAtTheEndOfTheirType_StayThereAtAnyDpi) {
  m_bar.InsertPane(0, INT_MAX, 0);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(m_bar.GetPaneWidth(0), INT_MAX);
  EXPECT_EQ(PartsOf(m_bar)[0], INT_MAX);
  m_frame->SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
}

// --- for screen readers ---

// Panes are children in the order in which they are shown, those of a layout among them.
TEST_F(StatusBars, AScreenReaderLearnsThePanes) {
  m_bar.InsertPane(0, 60, 0);
  m_bar.InsertPane(1, 20, kSPaneSplice);
  m_bar.InsertPane(2, 2000, 0);
  SStatusBarLayout layout;
  layout.InsertPane(0, 50, 0);
  layout.Attach(&m_bar);
  ASSERT_EQ(layout.Activate(1), 1);
  SetText(0, WTEXT("ready"));
  SetText(2, WTEXT("long"));
  const SString inserted(WTEXT("of the document"));
  layout.SetPaneText(0, &inserted);

  const auto object = m_bar.MakeAccessible();
  EXPECT_EQ(object->GetRole(0), kSRoleStatusBar);
  EXPECT_EQ(object->GetRect(0), m_bar.GetWindowRect());
  EXPECT_TRUE(object->GetState(0) & kSStateReadOnly);
  const int count = object->GetChildCount();
  ASSERT_EQ(count, static_cast<int>(PartsOf(m_bar).size()));
  for (int child = 1; child <= count; ++child) {
    EXPECT_EQ(object->GetRole(child), kSRoleStaticText);
    EXPECT_EQ(object->GetName(child), SString(PartText(m_bar, child - 1).c_str())) << child;
    SRect part = PartRect(m_bar, child - 1) & m_bar.GetClientRect();
    m_bar.ClientToScreen(&part);
    EXPECT_EQ(object->GetRect(child), part) << child;
    EXPECT_EQ(object->ChildAt(SPoint(part.left + 1, part.top + 1)), child);
    EXPECT_TRUE(object->GetDefaultAction(child).IsEmpty());
    EXPECT_FALSE(object->DoDefaultAction(child));
  }
  m_frame->SetClientSize(90, 100);  // the last pane has no room now
  EXPECT_TRUE(object->GetState(count) & kSStateInvisible);
  EXPECT_EQ(object->GetRole(count + 1), 0);
  EXPECT_TRUE(object->GetName(-1).IsEmpty());
}

}  // namespace
