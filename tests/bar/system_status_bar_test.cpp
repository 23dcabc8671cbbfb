// The system's own class of status bars, and of progress bars: the same answers on both targets.

#include "tests/bar/bar_fixture.h"

namespace {

using test::PartRect;
using test::PartsOf;
using test::PartText;
using test::PartType;
using test::Window;

class SystemStatusBar : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    const INITCOMMONCONTROLSEX classes = {sizeof classes, ICC_BAR_CLASSES | ICC_PROGRESS_CLASS};
    ASSERT_TRUE(::InitCommonControlsEx(&classes));
    m_parent.m_handler = [this](UINT message, WPARAM wParam, LPARAM lParam, LRESULT*) {
      if (message == WM_NCLBUTTONDOWN || message == WM_NCLBUTTONUP) {
        m_notified.insert(m_notified.end(), {static_cast<int>(message), static_cast<int>(wParam)});
        return 1;
      }
      if (message == WM_NOTIFY) {
        const auto& mouse = *reinterpret_cast<const NMMOUSE*>(lParam);
        m_notified.push_back(static_cast<int>(mouse.hdr.code));
        if (mouse.hdr.code != SBN_SIMPLEMODECHANGE) m_notified.push_back(static_cast<int>(mouse.dwItemSpec));
        const bool isLeftOut = IsWine() && mouse.hdr.code == SBN_SIMPLEMODECHANGE;  // Wine sends 0 with this one
        EXPECT_EQ(wParam, isLeftOut ? 0u : 7u);
        EXPECT_EQ(mouse.hdr.hwndFrom, m_bar.m_hWnd);
        return 1;
      }
      if (message == WM_DRAWITEM) m_drawn.push_back(*reinterpret_cast<const DRAWITEMSTRUCT*>(lParam));
      return 0;
    };
    ASSERT_TRUE(
        m_parent.CreateEx(0, nullptr, WTEXT("parent"), WS_POPUP | WS_VISIBLE, 0, 0, 400, 300, nullptr, nullptr));
  }
  void TearDown() override {
    m_parent.DestroyWindow();
    UiTest::TearDown();
  }
  // Below y = 200, 300 pixels wide and 25 high, and it stays there.
  void Make(DWORD style = CCS_NORESIZE | CCS_NOPARENTALIGN | CCS_NOMOVEY | CCS_NODIVIDER, LPCWSTR text = nullptr) {
    ASSERT_TRUE(m_bar.Create(STATUSCLASSNAMEW, text, WS_VISIBLE | style, SRect(0, 200, 300, 225), &m_parent, 7));
  }
  LRESULT Send(UINT message, WPARAM wParam = 0, LPARAM lParam = 0) {
    return m_bar.SendMessageW(message, wParam, lParam);
  }
  LRESULT SetText(UINT part, LPCWSTR text) { return Send(SB_SETTEXTW, part, reinterpret_cast<LPARAM>(text)); }
  LRESULT SetParts(const std::vector<int>& edges) {
    return Send(SB_SETPARTS, edges.size(), reinterpret_cast<LPARAM>(edges.data()));
  }

  Window m_parent, m_bar;
  std::vector<int> m_notified;
  std::vector<DRAWITEMSTRUCT> m_drawn;
};

TEST_F(SystemStatusBar, Created_HasOnePartWithTheWindowsName) {
  Make(CCS_NORESIZE, WTEXT("start"));
  EXPECT_EQ(PartsOf(m_bar), std::vector<int>{-1});
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("start"));
  int borders[3] = {-1, -1, -1};
  EXPECT_TRUE(Send(SB_GETBORDERS, 0, reinterpret_cast<LPARAM>(borders)));
  EXPECT_EQ(borders[0], 0);
  EXPECT_EQ(borders[1], 2);
  EXPECT_EQ(borders[2], 2);
  EXPECT_NE(m_bar.GetFont(), nullptr);
  EXPECT_EQ(Send(SB_ISSIMPLE), 0);
}

TEST_F(SystemStatusBar, Parts_HaveTheRectanglesBetweenTheirEdges) {
  Make();
  EXPECT_EQ(SetParts({50, 120, -1}), 1);
  EXPECT_EQ(PartsOf(m_bar), (std::vector<int>{50, 120, -1}));
  EXPECT_EQ(PartRect(m_bar, 0), SRect(0, 2, 50, 25));
  EXPECT_EQ(PartRect(m_bar, 1), SRect(52, 2, 120, 25));
  EXPECT_EQ(PartRect(m_bar, 2), SRect(122, 2, 300, 25));
  EXPECT_EQ(PartRect(m_bar, 3), SRect(-7, -7, -7, -7)) << "there is no such part";
  int first[3] = {9, 9, 9};
  EXPECT_EQ(Send(SB_GETPARTS, 2, reinterpret_cast<LPARAM>(first)), 3) << "all parts are counted";
  EXPECT_EQ(first[2], 9) << "no more are copied than there is room for";

  EXPECT_EQ(SetParts({}), 0) << "a bar has parts";
  EXPECT_EQ(PartsOf(m_bar).size(), 3u);
  EXPECT_EQ(SetParts({30, 20, 400}), 1) << "any edges will do";
  EXPECT_EQ(PartRect(m_bar, 1), SRect(32, 2, 20, 25));
  EXPECT_EQ(PartRect(m_bar, 2), SRect(22, 2, 400, 25));
  EXPECT_EQ(SetParts(std::vector<int>(256, 5)), 1);
  EXPECT_EQ(PartsOf(m_bar).size(), 256u);
  EXPECT_EQ(SetParts(std::vector<int>(257, 5)), IsWine()) << "documented: at most 256";
}

// A new text is seen without more ado; tabs part what stands at the left, in the middle and at the right.
TEST_F(SystemStatusBar, Texts_ArePaintedInTheirThirds) {
  Make();
  SetParts({-1});
  const auto inked = [this] {
    m_bar.UpdateWindow();
    const SRect rect = PartRect(m_bar, 0);
    SClientDC dc(m_bar.m_hWnd);
    std::string thirds(3, ' ');
    for (int y = rect.top + 3; y < rect.bottom - 3; ++y) {
      for (int x = rect.left + 3; x < rect.right - 3; ++x) {
        if (GetRValue(dc.GetPixel(SPoint(x, y))) < 100) thirds[static_cast<std::size_t>(x * 3 / rect.right)] = 'x';
      }
    }
    return thirds;
  };
  EXPECT_EQ(inked(), "   ");
  const std::pair<LPCWSTR, const char*> cases[] = {{WTEXT("mm"), "x  "},
                                                   {WTEXT("\tmm"), " x "},
                                                   {WTEXT("\t\tmm"), "  x"},
                                                   {WTEXT("mm\tmm\tmm"), "xxx"},
                                                   {WTEXT("mm\t\tmm"), "x x"}};
  for (const auto& [text, expected] : cases) {
    SetText(0, text);
    EXPECT_EQ(inked(), expected);
  }
}

TEST_F(SystemStatusBar, Texts_AreKeptWithTheirType) {
  Make();
  SetParts({50, 120, -1});
  EXPECT_EQ(SetText(0, WTEXT("abc")), 1);
  EXPECT_EQ(SetText(1 | SBT_POPOUT | SBT_RTLREADING, WTEXT("\tc\tr")), 1);
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("abc"));
  EXPECT_EQ(PartType(m_bar, 0), 0);
  EXPECT_EQ(PartText(m_bar, 1), WTEXT("\tc\tr"));
  EXPECT_EQ(PartType(m_bar, 1), SBT_POPOUT | SBT_RTLREADING);
  EXPECT_EQ(SetText(0 | SBT_NOBORDERS, nullptr), 1);
  EXPECT_EQ(PartText(m_bar, 0), WTEXT(""));
  EXPECT_EQ(PartType(m_bar, 0), SBT_NOBORDERS);
  EXPECT_EQ(SetText(0, WTEXT("a\x01z\r\nb\t")), 1);
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("a z  b\t")) << "control characters other than tabs are blanks";
  EXPECT_EQ(SetText(3, WTEXT("no such part")), 0);
  EXPECT_EQ(SetText(200, WTEXT("no such part")), 0);

  // Parts that stay keep their texts.
  SetParts({40, -1});
  EXPECT_EQ(PartText(m_bar, 1), WTEXT("\tc\tr"));
  SetParts({40, 50, -1});
  EXPECT_EQ(PartText(m_bar, 2), WTEXT("")) << "a part that went is forgotten";
}

TEST_F(SystemStatusBar, WindowText_IsThatOfTheFirstPart) {
  Make();
  SetParts({50, -1});
  EXPECT_TRUE(m_bar.SetWindowTextW(WTEXT("first")));
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("first"));
  EXPECT_EQ(m_bar.GetWindowTextLengthW(), 5);
  WCHAR cut[3];
  EXPECT_EQ(m_bar.GetWindowTextW(cut, 3), 2);
  EXPECT_EQ(WideString(cut), WTEXT("fi"));
}

TEST_F(SystemStatusBar, SimpleMode_ShowsOneTextOfItsOwn) {
  Make();
  SetParts({50, -1});
  SetText(0, WTEXT("part"));
  EXPECT_EQ(SetText(SB_SIMPLEID, WTEXT("simple")), 1);
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("part"));
  EXPECT_EQ(Send(SB_SIMPLE, 1), 1);
  EXPECT_EQ(Send(SB_ISSIMPLE), 1);
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("simple"));
  EXPECT_EQ(PartRect(m_bar, 1), SRect(0, 2, 300, 25));
  EXPECT_EQ(PartsOf(m_bar).size(), 2u);
  EXPECT_EQ(Send(SB_SIMPLE, 0), 1);
  EXPECT_EQ(Send(SB_SIMPLE, 0), 1);
  EXPECT_EQ(PartText(m_bar, 0), WTEXT("part"));
  const int change = static_cast<int>(SBN_SIMPLEMODECHANGE);
  EXPECT_EQ(m_notified, (std::vector<int>{change, change})) << "only a change is told";
}

TEST_F(SystemStatusBar, OwnerDrawnParts_AskTheParent) {
  Make();
  SetParts({50, -1});
  EXPECT_EQ(Send(SB_SETTEXTW, 1 | SBT_OWNERDRAW, 0x1234), 1);
  m_bar.UpdateWindow();
  ASSERT_FALSE(m_drawn.empty());
  const DRAWITEMSTRUCT& item = m_drawn.back();
  EXPECT_EQ(item.CtlID, 7u);
  EXPECT_EQ(item.itemID, 1u);
  EXPECT_EQ(item.itemAction, 0u + (IsWine() ? 0 : ODA_DRAWENTIRE)) << "Wine leaves it 0";
  EXPECT_EQ(item.hwndItem, m_bar.m_hWnd);
  EXPECT_EQ(item.itemData, 0x1234u);
  EXPECT_NE(item.hDC, nullptr);
  EXPECT_EQ(Send(SB_GETTEXTW, 1), 0x1234) << "the number stands in place of the text";
}

TEST_F(SystemStatusBar, Height_FollowsTheFontAndTheMinimum) {
  Make(0);
  SClientDC dc(m_bar.m_hWnd);
  const auto lineHeight = [&](HFONT font) {
    const SSelectObject selected(dc, font);
    TEXTMETRICW metrics = {};
    dc.GetTextMetricsW(&metrics);
    return static_cast<int>(metrics.tmHeight);
  };
  const auto expectHeight = [&](int height) { EXPECT_EQ(test::PlaceOf(m_bar), SRect(0, 300 - height, 400, 300)); };
  expectHeight(lineHeight(m_bar.GetFont()) + 8);

  SFontOld large;
  LOGFONTW description = {};
  description.lfHeight = -30;
  ASSERT_TRUE(large.CreateFontIndirectW(&description));
  m_bar.SetFont(large, 1);
  expectHeight(lineHeight(large) + 8);

  EXPECT_EQ(Send(SB_SETMINHEIGHT, 60), 1);
  Send(WM_SIZE);
  expectHeight(60 + (IsWine() ? 2 : 4));  // documented: twice the vertical border
  Send(SB_SETMINHEIGHT, 0);
  m_parent.SetWindowPos(nullptr, 0, 0, 400, 200, SWP_NOMOVE | SWP_NOZORDER);
  Send(WM_SIZE);
  EXPECT_EQ(test::PlaceOf(m_bar).bottom, 200);
  m_bar.DestroyWindow();

  Make();
  Send(SB_SETMINHEIGHT, 60);
  Send(WM_SIZE);
  EXPECT_EQ(test::PlaceOf(m_bar), SRect(0, 200, 300, 225)) << "its size is its owner's affair";
}

TEST_F(SystemStatusBar, Grip_IsAsWideAsAScrollBar) {
  Make(CCS_NORESIZE | SBARS_SIZEGRIP);
  const auto hit = [&](int x) {
    const SRect place = m_bar.GetWindowRect();
    return static_cast<int>(Send(WM_NCHITTEST, 0, MAKELPARAM(place.left + x, place.top + 10)));
  };
  const int grip = 300 - ::GetSystemMetrics(SM_CXVSCROLL);
  EXPECT_EQ(hit(299), HTBOTTOMRIGHT);
  EXPECT_EQ(hit(grip), HTBOTTOMRIGHT);
  EXPECT_EQ(hit(grip - 1), HTCLIENT);
  for (const UINT message : {UINT{WM_NCLBUTTONDOWN}, UINT{WM_NCLBUTTONUP}}) Send(message, HTBOTTOMRIGHT);
  test::PumpAll();
  EXPECT_EQ(m_notified, (std::vector<int>{WM_NCLBUTTONDOWN, HTBOTTOMRIGHT, WM_NCLBUTTONUP, HTBOTTOMRIGHT}))
      << "it is the parent that is sized";
  m_parent.ShowWindow(SW_MAXIMIZE);
  EXPECT_EQ(hit(299), HTCLIENT) << "a maximised parent is not sized";
}

TEST_F(SystemStatusBar, MouseButtons_AreToldWithThePart) {
  Make();
  SetParts({50, -1});
  Send(WM_LBUTTONDOWN, 0, MAKELPARAM(25, 5));
  Send(WM_LBUTTONUP, 0, MAKELPARAM(25, 5));
  Send(WM_LBUTTONDBLCLK, 0, MAKELPARAM(250, 5));
  Send(WM_RBUTTONUP, 0, MAKELPARAM(2, 5));
  const auto code = [](UINT number) { return static_cast<int>(number); };
  EXPECT_EQ(m_notified, (std::vector<int>{code(NM_CLICK), 0, code(NM_DBLCLK), 1, code(NM_RCLICK), 0}));
}

TEST_F(SystemStatusBar, Background_ReturnsTheFormerColour) {
  Make();
  EXPECT_EQ(static_cast<COLORREF>(Send(SB_SETBKCOLOR, 0, 0x123456)), CLR_DEFAULT);
  EXPECT_EQ(static_cast<COLORREF>(Send(SB_SETBKCOLOR, 0, static_cast<LPARAM>(CLR_DEFAULT))), 0x123456u);
}

using SystemProgressBar = SystemStatusBar;

TEST_F(SystemProgressBar, Positions_StayInTheRange) {
  ASSERT_TRUE(m_bar.Create(PROGRESS_CLASSW, nullptr, WS_VISIBLE, SRect(0, 0, 100, 20), &m_parent, 7));
  PBRANGE range = {};
  EXPECT_EQ(Send(PBM_GETRANGE, 1, reinterpret_cast<LPARAM>(&range)), 0);
  EXPECT_EQ(range.iHigh, 100);
  EXPECT_EQ(Send(PBM_SETRANGE, 0, MAKELPARAM(10, 50)), MAKELONG(0, 100)) << "returns the former range";
  EXPECT_EQ(Send(PBM_GETPOS), 10);
  EXPECT_EQ(Send(PBM_SETPOS, 20), 10);
  EXPECT_EQ(Send(PBM_DELTAPOS, 500), 20);
  EXPECT_EQ(Send(PBM_GETPOS), 50);
  EXPECT_EQ(Send(PBM_SETSTEP, 7), 10);
  Send(PBM_SETPOS, 40);
  EXPECT_EQ(Send(PBM_STEPIT), 40);
  EXPECT_EQ(Send(PBM_GETPOS), 47);
  Send(PBM_STEPIT);
  EXPECT_LT(Send(PBM_GETPOS), 47) << "behind the end it begins anew";
  Send(PBM_SETRANGE32, static_cast<WPARAM>(-100), 100);
  EXPECT_EQ(Send(PBM_GETRANGE, 1), -100);
  Send(PBM_SETPOS, static_cast<WPARAM>(-500));
  EXPECT_EQ(static_cast<int>(Send(PBM_GETPOS)), -100);
}

}  // namespace
