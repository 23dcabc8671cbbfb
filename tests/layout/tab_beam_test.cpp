// The tab beam: inserting and deleting beside a model, choosing, scroll buttons, fonts.

#include <random>

#include "tests/layout/layout_fixture.h"

namespace {

using test::Key;
using test::Mouse;

class Beam : public STabBeam {
 public:
  using STabBeam::CalcTabFromOffset;
  using STabBeam::CalcTabOffset;
  using STabBeam::m_buttons;
  using STabBeam::m_tabs;
  using STabBeam::Scroll;
  using STabBeam::ScrollBtnHit;
  SFont& FontOf(bool empty) { return empty ? m_emptyFont : m_font; }
  int TextWidth(const SString& text, bool empty) {
    SMemoryDC dc;
    const SSelectObject font(dc, FontOf(empty).GetSafeHandle());
    return dc.GetTextExtent(text).cx;
  }
  // The stated fields follow each other.
  void ExpectFieldOrder() {
    const void* fields[] = {&m_tabs,
                            &m_count,
                            &m_current,
                            &m_first,
                            &m_spacing,
                            &m_buttons.m_areaWidth,
                            &m_buttons.m_height,
                            &m_buttons.m_width,
                            &m_buttons.m_shown,
                            &m_buttons.m_count,
                            &m_font,
                            &m_emptyFont};
    for (std::size_t i = 1; i < std::size(fields); ++i) EXPECT_LT(fields[i - 1], fields[i]);
    STab tab;
    const void* record[] = {&tab.m_window, &tab.m_text, &tab.m_hasContent, &tab.m_width, &tab.m_drawn, &tab.m_textArea};
    for (std::size_t i = 1; i < std::size(record); ++i) EXPECT_LT(record[i - 1], record[i]);
    EXPECT_EQ(tab.m_hasContent, 1);
    EXPECT_EQ(tab.m_width, 60);
    if (sizeof(void*) == 4) {
      EXPECT_EQ(sizeof tab, 48u);
    }
  }
};

// A beam in a window that notes the notifications and can refuse.
class Beams : public test::UiTest {
 protected:
  void SetUp() override {
    UiTest::SetUp();
    m_parent.m_handler = [this](UINT message, WPARAM, LPARAM lParam, LRESULT* result) {
      if (message != WM_NOTIFY) return 0;
      const auto* record = reinterpret_cast<const STabBeamNotify*>(lParam);
      const bool isChanging = record->m_header.code == static_cast<UINT>(kSTabChanging);
      m_notes += isChanging ? "?" : "!";
      m_notes += std::to_string(record->m_former) + ">" + std::to_string(record->m_tab);
      *result = isChanging && m_refuses;
      return 1;
    };
    ASSERT_TRUE(m_parent.Popup(WS_VISIBLE));
    ASSERT_TRUE(m_beam.Create(&m_parent, WS_VISIBLE, 9));
    m_beam.MoveWindow(SRect(0, 0, 300, 19));
  }
  void TearDown() override {
    m_parent.DestroyWindow();
    UiTest::TearDown();
  }
  void Insert(int count, int width = 60) {
    for (int i = 0; i < count; ++i) m_beam.InsertTab(m_beam.GetCount(), WTEXT("tab"), nullptr, width);
  }

  test::Window m_parent;
  Beam m_beam;
  std::string m_notes;
  bool m_refuses = false;
};

TEST_F(Beams, FieldsStandInTheirOrder) { m_beam.ExpectFieldOrder(); }

TEST_F(Beams, AMeasuredTabHasItsTextAndTheSpacing) {
  EXPECT_EQ(m_beam.InsertTab(0, WTEXT("Sales figures"), nullptr, -1), 0);
  EXPECT_EQ(m_beam.GetTabWidth(0), m_beam.TextWidth(WTEXT("Sales figures"), false) + 8);
  m_beam.SetTabEmpty(0, 1);
  EXPECT_TRUE(m_beam.GetTabEmpty(0));
  EXPECT_EQ(m_beam.GetTabWidth(0), m_beam.TextWidth(WTEXT("Sales figures"), true) + 8);
  LOGFONTW empty;
  ASSERT_TRUE(m_beam.FontOf(true).GetLogFont(&empty));
  EXPECT_TRUE(empty.lfItalic);
  m_beam.SetTabText(0, WTEXT("x"));
  EXPECT_EQ(m_beam.GetTabWidth(0), m_beam.TextWidth(WTEXT("x"), true) + 8);
  EXPECT_EQ(m_beam.InsertTab(1, WTEXT("wide"), nullptr, 200), 1);
  EXPECT_EQ(m_beam.GetTabWidth(1), 200);
  EXPECT_EQ(m_beam.InsertTab(3, WTEXT("?"), nullptr), -1);
  EXPECT_EQ(m_beam.InsertTab(-1, WTEXT("?"), nullptr), -1);
}

TEST_F(Beams, AnotherSpacingMeasuresAndMovesAllTabs) {
  for (const WCHAR* text : {WTEXT("one"), WTEXT("Sales figures")}) m_beam.InsertTab(m_beam.GetCount(), text, nullptr);
  for (const int spacing : {20, 0, 3, -5}) {
    m_beam.SetSpacing(spacing);
    const int kept = std::max(spacing, 0);
    EXPECT_EQ(m_beam.GetSpacing(), kept);
    EXPECT_EQ(m_beam.GetTabWidth(0), m_beam.TextWidth(WTEXT("one"), false) + kept);
    EXPECT_EQ(m_beam.GetTabWidth(1), m_beam.TextWidth(WTEXT("Sales figures"), false) + kept);
    EXPECT_EQ(m_beam.CalcTabOffset(1) - m_beam.CalcTabOffset(0), m_beam.GetTabWidth(0) + kept);
  }
}

// From every position to every tab.
TEST_F(Beams, ATabIsMadeVisibleByScrollingAsLittleAsNeeded) {
  constexpr int kCount = 20;
  for (int i = 0; i < kCount; ++i) m_beam.InsertTab(i, WTEXT("tab"), nullptr, 20 + i * 37 % 90);
  for (int start = 0; start < kCount; ++start) {
    for (int tab = 0; tab < kCount; ++tab) {
      m_beam.SetFirstVisible(start);
      const bool isBehind = tab > m_beam.GetLastVisible();
      m_beam.EnsureVisible(tab);
      const int first = m_beam.GetFirstVisible();
      ASSERT_GE(m_beam.GetLastVisible(), tab);
      ASSERT_EQ(first, isBehind ? first : std::min(start, tab)) << start << " " << tab;
      if (!isBehind) continue;
      m_beam.SetFirstVisible(first - 1);
      ASSERT_LT(m_beam.GetLastVisible(), tab) << "one tab less would have been enough";
    }
  }
  m_beam.SetFirstVisible(3);
  for (const int none : {-1, kCount}) m_beam.EnsureVisible(none);
  EXPECT_EQ(m_beam.GetFirstVisible(), 3);
}

// Against a model that knows each tab by its window.
TEST_F(Beams, RandomSequences_TheSameTabStaysCurrent) {
  std::mt19937 random(17);
  const auto below = [&random](int limit) { return static_cast<int>(random() % static_cast<unsigned>(limit)); };
  std::vector<std::unique_ptr<SWnd>> windows;
  std::vector<SWnd*> model;
  SWnd* current = nullptr;
  for (int step = 0; step < 3000; ++step) {
    const int count = static_cast<int>(model.size());
    switch (below(5)) {
      case 0:
      case 1: {
        const int at = below(count + 1);
        windows.push_back(std::make_unique<SWnd>());
        SWnd* window = windows.back().get();
        ASSERT_EQ(m_beam.InsertTab(at, WTEXT("t"), window, 20 + below(60)), at);
        model.insert(model.begin() + at, window);
        if (current == nullptr) current = window;
        break;
      }
      case 2:
        if (count > 0 && (count > 30 || below(3) == 0)) {
          const int at = below(count);
          const bool wasCurrent = model[static_cast<std::size_t>(at)] == current;
          ASSERT_TRUE(m_beam.DeleteTab(at));
          model.erase(model.begin() + at);
          if (wasCurrent) current = model.empty() ? nullptr : model[static_cast<std::size_t>(std::min(at, count - 2))];
        }
        break;
      case 3:
        if (count > 0) {
          const int at = below(count);
          m_beam.SetCurSel(at);
          current = model[static_cast<std::size_t>(at)];
          ASSERT_LE(m_beam.GetFirstVisible(), at);
          ASSERT_GE(m_beam.GetLastVisible(), at);
        }
        break;
      default:
        m_beam.SetFirstVisible(below(count + 1));
        break;
    }
    ASSERT_EQ(m_beam.GetCount(), static_cast<int>(model.size()));
    ASSERT_EQ(m_beam.GetTabWindow(m_beam.GetCurSel()), current) << step;
    if (current != nullptr) {
      ASSERT_EQ(m_beam.GetCurSel(), m_beam.FindTab(current));
    }
    ASSERT_LT(m_beam.GetFirstVisible(), std::max(m_beam.GetCount(), 1));
  }
}

TEST_F(Beams, AClickChoosesATab) {
  Insert(4);
  Mouse(m_beam, WM_LBUTTONDOWN, SPoint(2 * 68 + 5, 8));
  EXPECT_EQ(m_beam.GetCurSel(), 2);
  EXPECT_EQ(m_notes, "?0>2!0>2");
  m_refuses = true;
  Mouse(m_beam, WM_LBUTTONDOWN, SPoint(5, 8));
  EXPECT_EQ(m_beam.GetCurSel(), 2);
  EXPECT_EQ(m_notes, "?0>2!0>2?2>0");
  m_notes.clear();
  Mouse(m_beam, WM_LBUTTONDOWN, SPoint(2 * 68 + 5, 8));
  Mouse(m_beam, WM_LBUTTONDOWN, SPoint(290, 8));
  m_beam.SetCurSel(1);
  EXPECT_EQ(m_notes, "") << "the current tab, no tab, and a program's choice are not notified";
}

TEST_F(Beams, KeysChooseTabs) {
  Insert(4);
  for (const WPARAM key : {VK_RIGHT, VK_END, VK_RIGHT, VK_LEFT, VK_HOME, VK_LEFT}) Key(m_beam.m_hWnd, key);
  EXPECT_EQ(m_notes, "?0>1!0>1?1>3!1>3?3>2!3>2?2>0!2>0");
}

TEST_F(Beams, AHeldButtonGoesOnScrolling) {
  Insert(20);
  const int size = ::GetSystemMetrics(SM_CXHSCROLL);
  m_beam.SetScrollButtons(1, 1);
  EXPECT_EQ(m_beam.m_buttons.m_areaWidth, 2 * size);
  EXPECT_EQ(m_beam.CalcTabOffset(0), 2 * size + 1);
  EXPECT_EQ(m_beam.ScrollBtnHit(SPoint(1, 1), -1), -1) << "nothing lies before the first tab";
  EXPECT_EQ(m_beam.ScrollBtnHit(SPoint(size + 1, 1), -1), kSTabToNext);
  EXPECT_EQ(m_beam.ScrollBtnHit(SPoint(size + 1, 1), kSTabToPrevious), -1);

  const SPoint next(size + 3, 3);
  Mouse(m_beam, WM_LBUTTONDOWN, next);
  EXPECT_EQ(m_beam.GetFirstVisible(), 1);
  m_beam.SendMessageW(WM_TIMER, 1);
  m_beam.SendMessageW(WM_TIMER, 1);
  EXPECT_EQ(m_beam.GetFirstVisible(), 3);
  Mouse(m_beam, WM_MOUSEMOVE, SPoint(200, 100));
  m_beam.SendMessageW(WM_TIMER, 1);
  EXPECT_EQ(m_beam.GetFirstVisible(), 3) << "not while the pointer is elsewhere";
  Mouse(m_beam, WM_MOUSEMOVE, next);
  for (int i = 0; i < 40; ++i) m_beam.SendMessageW(WM_TIMER, 1);
  const int first = m_beam.GetFirstVisible();
  EXPECT_EQ(m_beam.GetLastVisible(), 19);
  Mouse(m_beam, WM_LBUTTONUP, next);
  EXPECT_EQ(SWnd::GetCapture(), nullptr);
  m_beam.SendMessageW(WM_TIMER, 1);
  EXPECT_EQ(m_beam.GetFirstVisible(), first);
  EXPECT_EQ(m_beam.ScrollBtnHit(next, -1), -1) << "nothing lies behind the last tab";

  m_beam.Scroll(kSTabToPrevious);
  EXPECT_EQ(m_beam.GetFirstVisible(), first - 1);
  // The system takes the mouse away.
  Mouse(m_beam, WM_LBUTTONDOWN, SPoint(3, 3));
  m_beam.SendMessageW(WM_CANCELMODE);
  EXPECT_EQ(SWnd::GetCapture(), nullptr);
  m_beam.SendMessageW(WM_TIMER, 1);
  EXPECT_EQ(m_beam.GetFirstVisible(), first - 2);
  m_beam.Scroll(kSTabToFirst);
  m_beam.Scroll(kSTabToPrevious);
  m_beam.Scroll(4);
  m_beam.Scroll(-1);
  EXPECT_EQ(m_beam.GetFirstVisible(), 0);
  m_beam.Scroll(kSTabToLast);
  EXPECT_EQ(m_beam.GetFirstVisible(), first);
  EXPECT_EQ(m_notes, "");
}

TEST_F(Beams, SizesFollowTheDpi) {
  m_beam.InsertTab(0, WTEXT("Sales figures"), nullptr, -1);
  m_beam.SetScrollButtons(1, 0);
  const int width = m_beam.GetTabWidth(0), area = m_beam.m_buttons.m_areaWidth;
  m_beam.SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(m_beam.GetSpacing(), 16);
  EXPECT_GT(m_beam.m_buttons.m_areaWidth, area);
  EXPECT_NEAR(m_beam.GetTabWidth(0), 2 * width, width / 4);
  m_beam.SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
  EXPECT_EQ(m_beam.GetTabWidth(0), width);
}

// A font from WM_SETFONT outlives a change of the resolution, in which it grows, and of the system's metrics.
TEST_F(Beams, AGivenFontStays) {
  const auto describe = [this] {
    LOGFONTW font = {};
    m_beam.FontOf(false).GetLogFont(&font);
    return font;
  };
  const LOGFONTW usual = describe();
  LOGFONTW bold = usual;
  bold.lfHeight = -20;
  bold.lfWeight = FW_BOLD;
  SFont given;
  ASSERT_TRUE(given.CreateFontIndirectW(&bold));
  m_beam.SendMessageW(WM_SETFONT, reinterpret_cast<WPARAM>(given.GetSafeHandle()), 0);
  m_beam.SendMessageW(WM_DPICHANGED, MAKEWPARAM(192, 192));
  EXPECT_EQ(describe().lfHeight, -40);
  m_beam.SetScrollButtons(1, 1);
  m_beam.InsertTab(0, WTEXT("x"), nullptr, 500);
  m_beam.SendMessageW(WM_SETTINGCHANGE);
  EXPECT_EQ(m_beam.GetTabWidth(0), 500);
  m_beam.m_buttons.m_width = 1;  // as if the system's metric had changed
  m_beam.SendMessageW(WM_SETTINGCHANGE);
  EXPECT_GT(m_beam.m_buttons.m_width, 1);
  EXPECT_EQ(m_beam.m_buttons.m_areaWidth, 2 * m_beam.m_buttons.m_width);
  EXPECT_EQ(m_beam.GetTabWidth(0), m_beam.TextWidth(WTEXT("x"), false) + 16) << "every tab is measured again";
  EXPECT_EQ(describe().lfHeight, -40);
  EXPECT_EQ(describe().lfWeight, FW_BOLD);
  m_beam.SendMessageW(WM_DPICHANGED, MAKEWPARAM(96, 96));
  m_beam.SendMessageW(WM_SETFONT);
  EXPECT_EQ(describe().lfHeight, usual.lfHeight);
  EXPECT_EQ(describe().lfWeight, usual.lfWeight);
}

// Tabs may come before the window: a given width stays, and a measured one is what it would be in the window.
TEST_F(Beams, TabsBeforeTheWindow) {
  Beam early;
  early.InsertTab(0, WTEXT("wide"), nullptr, 200);
  early.InsertTab(1, WTEXT("Sales figures"), nullptr);
  EXPECT_EQ(early.GetTabWidth(1), early.TextWidth(WTEXT("Sales figures"), false) + 8);
  ASSERT_TRUE(early.Create(&m_parent, WS_VISIBLE, 10));
  EXPECT_EQ(early.GetTabWidth(0), 200);
  EXPECT_EQ(early.GetTabWidth(1), early.TextWidth(WTEXT("Sales figures"), false) + 8);
}

TEST_F(Beams, AChangeWhileDrawingIsLockedHidesNoLaterOne) {
  Insert(1);
  m_beam.SendMessageW(WM_SETREDRAW, 0);
  m_beam.SetTabText(0, WTEXT("locked"));
  m_beam.SendMessageW(WM_SETREDRAW, 1);
  ValidateRect(m_beam.m_hWnd, nullptr);
  EXPECT_FALSE(GetUpdateRect(m_beam.m_hWnd, nullptr, 0));
  m_beam.SetTabText(0, WTEXT("later"));
  EXPECT_TRUE(GetUpdateRect(m_beam.m_hWnd, nullptr, 0));
}

// A listener that deletes the beam's window in the middle of a choice.
TEST_F(Beams, AWindowThatEndsWhileATabIsChosen) {
  Insert(3);
  m_parent.m_handler = [this](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_NOTIFY) m_beam.DestroyWindow();
    return message == WM_NOTIFY;
  };
  EXPECT_EQ(m_beam.ChooseTab(2), 0);
  EXPECT_EQ(m_beam.m_hWnd, nullptr);
}

}  // namespace
