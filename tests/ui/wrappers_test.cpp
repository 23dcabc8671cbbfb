// Menus, styles, scroll bars, carets and controls through their objects: a random menu against a model, and what the
// members of a window change in the window.

#include <exception>
#include <random>
#include <stdexcept>

#include "qxcore/platform/resource_table.h"
#include "tests/support/wine.h"
#include "tests/ui/dialog_template.h"
#include "tests/ui/ui_fixture.h"

namespace {

using test::Window;

class Menus : public test::UiTest {};

// --- menus ---

struct Item {
  UINT id;
  SString text;
  bool isChecked = false;
  bool isGrayed = false;
};

void ExpectSame(const SMenu& menu, const std::vector<Item>& items) {
  ASSERT_EQ(menu.GetMenuItemCount(), static_cast<int>(items.size()));
  for (std::size_t i = 0; i < items.size(); ++i) {
    const UINT at = static_cast<UINT>(i);
    ASSERT_EQ(menu.GetMenuItemID(static_cast<int>(i)), items[i].id);
    ASSERT_EQ(menu.GetMenuStringW(at, MF_BYPOSITION), items[i].text);
    ASSERT_EQ(menu.GetMenuStringW(items[i].id, MF_BYCOMMAND), items[i].text);
    const UINT state = menu.GetMenuState(at, MF_BYPOSITION);
    ASSERT_EQ((state & MF_CHECKED) != 0, items[i].isChecked);
    ASSERT_EQ((state & MF_GRAYED) != 0, items[i].isGrayed);
  }
  ASSERT_EQ(menu.GetMenuState(static_cast<UINT>(items.size()), MF_BYPOSITION), static_cast<UINT>(-1));
}

// Items are named by position and by identifier in turn.
TEST_F(Menus, RandomChanges_AgreeWithAModel) {
  std::mt19937 random(11);
  SMenu menu;
  ASSERT_TRUE(menu.CreatePopupMenu());
  std::vector<Item> items;
  UINT nextId = 100;
  for (int step = 0; step < 1500; ++step) {
    const std::size_t count = items.size(), place = count > 0 ? random() % count : 0;
    const bool byCommand = random() % 2 != 0;
    const UINT how = byCommand ? MF_BYCOMMAND : MF_BYPOSITION;
    const UINT item = count == 0 ? 0 : byCommand ? items[place].id : static_cast<UINT>(place);
    const unsigned action = count == 0 ? 0 : count > 12 ? 4 + random() % 2 : random() % 8;
    const Item made{++nextId, SString(WTEXT("item ")) + SString(static_cast<long>(nextId))};
    switch (action) {
      case 0:
      case 1:
        ASSERT_TRUE(menu.AppendMenuW(MF_STRING, made.id, made.text));
        items.push_back(made);
        break;
      case 2:
        ASSERT_TRUE(menu.InsertMenuW(item, how | MF_STRING, made.id, made.text));
        items.insert(items.begin() + static_cast<std::ptrdiff_t>(place), made);
        break;
      case 3:
        ASSERT_TRUE(menu.ModifyMenuW(item, how | MF_STRING, made.id, made.text));
        items[place] = made;
        break;
      case 4:
        ASSERT_TRUE(menu.RemoveMenu(item, how));
        items.erase(items.begin() + static_cast<std::ptrdiff_t>(place));
        break;
      case 5:
        ASSERT_TRUE(menu.DeleteMenu(item, how));
        items.erase(items.begin() + static_cast<std::ptrdiff_t>(place));
        break;
      case 6: {
        const bool checks = random() % 2 != 0;
        const UINT before = menu.CheckMenuItem(item, how | (checks ? MF_CHECKED : MF_UNCHECKED));
        ASSERT_EQ(before, items[place].isChecked ? UINT{MF_CHECKED} : 0u);
        items[place].isChecked = checks;
        break;
      }
      default: {
        const bool grays = random() % 2 != 0;
        const UINT before = menu.EnableMenuItem(item, how | (grays ? MF_GRAYED : MF_ENABLED));
        ASSERT_EQ(before & MF_GRAYED, items[place].isGrayed ? UINT{MF_GRAYED} : 0u);
        items[place].isGrayed = grays;
      }
    }
    ASSERT_NO_FATAL_FAILURE(ExpectSame(menu, items)) << step;
  }
  EXPECT_FALSE(menu.RemoveMenu(99, MF_BYPOSITION));
  EXPECT_FALSE(menu.DeleteMenu(99, MF_BYCOMMAND));
  EXPECT_FALSE(menu.ModifyMenuW(99, MF_BYCOMMAND, 5, WTEXT("none")));
  EXPECT_EQ(menu.CheckMenuItem(99, MF_BYCOMMAND | MF_CHECKED), static_cast<UINT>(-1));
}

// A menu that an item opened outlives its removal, and does not outlive its deletion.
TEST_F(Menus, RemovedAndDeletedItems_TreatTheirMenusDifferently) {
  SMenu bar;
  ASSERT_TRUE(bar.CreateMenu());
  const HMENU opened = ::CreatePopupMenu();
  const auto append = [&] {
    return bar.AppendMenuW(MF_POPUP, reinterpret_cast<UINT_PTR>(opened), WTEXT("opens")) &&
           bar.GetSubMenu(0)->m_hMenu == opened;
  };
  ASSERT_TRUE(append());
  EXPECT_EQ(bar.GetMenuItemID(0), static_cast<UINT>(-1)) << "such an item has no identifier";
  EXPECT_TRUE(bar.RemoveMenu(0, MF_BYPOSITION));
  EXPECT_TRUE(::IsMenu(opened));
  ASSERT_TRUE(append());
  EXPECT_TRUE(bar.DeleteMenu(0, MF_BYPOSITION));
  EXPECT_FALSE(::IsMenu(opened));
}

// The published layout: a header, then flags, identifier (none for items that open a menu) and text of each item.
const WORD kTemplate[] = {0, 0, MF_POPUP,          'F', 'i', 'l', 'e',  0,  0,   7, 'O', 'p', 'e', 'n', 0, 0,
                          0, 0, 0x80 | MF_CHECKED, 9,   'E', 0,   0x80, 11, 'H', 0};

void ExpectTemplate(const SMenu& bar) {
  ASSERT_EQ(bar.GetMenuItemCount(), 2);
  EXPECT_EQ(bar.GetMenuStringW(0, MF_BYPOSITION), WTEXT("File"));
  EXPECT_EQ(bar.GetMenuItemID(1), 11u);
  const SMenu* file = bar.GetSubMenu(0);
  ASSERT_NE(file, nullptr);
  ASSERT_EQ(file->GetMenuItemCount(), 3);
  EXPECT_EQ(file->GetMenuStringW(7, MF_BYCOMMAND), WTEXT("Open"));
  EXPECT_NE(file->GetMenuState(1, MF_BYPOSITION) & MF_SEPARATOR, 0u);
  EXPECT_NE(file->GetMenuState(9, MF_BYCOMMAND) & MF_CHECKED, 0u);
}

TEST_F(Menus, Templates_FromMemoryAndByName) {
  SMenu direct;
  ASSERT_TRUE(direct.LoadMenuIndirectW(kTemplate));
  ExpectTemplate(direct);

  SMenu named, numbered, missing;
  ASSERT_TRUE(platform::RegisterResource(nullptr, RT_MENU, WTEXT("WrappersMenu"), kTemplate, sizeof kTemplate));
  ASSERT_TRUE(platform::RegisterResource(nullptr, RT_MENU, MAKEINTRESOURCEW(7011), kTemplate, sizeof kTemplate));
  ASSERT_TRUE(named.LoadMenuW(WTEXT("wrappersMENU"))) << "case does not matter";
  ExpectTemplate(named);
  ASSERT_TRUE(numbered.LoadMenuW(MAKEINTRESOURCEW(7011)));
  ExpectTemplate(numbered);
  EXPECT_FALSE(missing.LoadMenuW(MAKEINTRESOURCEW(7012)));
  EXPECT_EQ(missing.GetSafeHandle(), nullptr);
  EXPECT_EQ(platform::RegisteredResourceSize(kTemplate), sizeof kTemplate);
  EXPECT_EQ(platform::RegisteredResourceSize(kTemplate + 1), 0u);

  // A later registration takes the place of the earlier one.
  static const WORD kShort[] = {0, 0, 0x80, 3, 'x', 0};
  ASSERT_TRUE(platform::RegisterResource(nullptr, RT_MENU, WTEXT("WRAPPERSMENU"), kShort, sizeof kShort));
  EXPECT_EQ(platform::FindRegisteredResource(nullptr, RT_MENU, WTEXT("WrappersMenu")).data, kShort);
  SMenu replaced;
  ASSERT_TRUE(replaced.LoadMenuW(WTEXT("WrappersMenu")));
  EXPECT_EQ(replaced.GetMenuItemCount(), 1);
}

// --- windows ---

class WindowMembers : public test::UiTest {
 protected:
  void SetUp() override {
    test::UiTest::SetUp();
    ASSERT_TRUE(m_parent.Popup());
    ASSERT_TRUE(m_child.Child(&m_parent, 31));
  }
  void TearDown() override {
    m_parent.DestroyWindow();
    test::UiTest::TearDown();
  }
  Window m_parent, m_child;
};

TEST_F(WindowMembers, Styles_ChangeBitByBit) {
  const DWORD before = m_parent.GetExStyle();
  ASSERT_EQ(before & WS_EX_ACCEPTFILES, 0u);
  m_parent.DragAcceptFiles();
  EXPECT_EQ(m_parent.GetExStyle(), before | WS_EX_ACCEPTFILES);
  m_parent.DragAcceptFiles(0);
  EXPECT_EQ(m_parent.GetExStyle(), before);
  EXPECT_FALSE(m_parent.ModifyStyleEx(WS_EX_ACCEPTFILES, 0)) << "nothing changed";
  // The frame takes its room from the client area as soon as it is drawn anew.
  const SRect client = m_parent.GetClientRect();
  EXPECT_TRUE(m_parent.ModifyStyleEx(0, WS_EX_CLIENTEDGE, SWP_FRAMECHANGED));
  EXPECT_LT(m_parent.GetClientRect().Width(), client.Width());
  EXPECT_TRUE(m_parent.ModifyStyleEx(WS_EX_CLIENTEDGE, 0, SWP_FRAMECHANGED));
  EXPECT_EQ(m_parent.GetClientRect(), client);
}

TEST_F(WindowMembers, Tree_IsSeenFromEachWindow) {
  Window grandchild, owned;
  ASSERT_TRUE(grandchild.Child(&m_child));
  ASSERT_TRUE(owned.CreateEx(0, nullptr, nullptr, WS_POPUP, 0, 0, 20, 20, m_parent.m_hWnd, nullptr));
  EXPECT_TRUE(m_parent.IsChild(&grandchild));
  EXPECT_FALSE(grandchild.IsChild(&m_parent));
  EXPECT_FALSE(m_parent.IsChild(&owned)) << "it is owned";
  EXPECT_FALSE(m_parent.IsChild(nullptr));
  EXPECT_EQ(grandchild.GetTopLevelOwner(), &m_parent);
  EXPECT_EQ(owned.GetTopLevelOwner(), &m_parent);
  EXPECT_EQ(m_parent.GetTopLevelOwner(), &m_parent);
  EXPECT_EQ(m_child.SetDlgCtrlID(77), 31);
  EXPECT_EQ(m_child.GetDlgCtrlID(), 77);
  EXPECT_EQ(m_parent.GetDlgItem(77), &m_child);
  EXPECT_EQ(m_parent.GetDlgItem(31), nullptr);
}

TEST_F(WindowMembers, Menu_IsTheWindowsOwn) {
  SMenu menu;
  ASSERT_TRUE(menu.CreateMenu());
  menu.AppendMenuW(MF_STRING, 5, WTEXT("five"));
  EXPECT_EQ(m_parent.GetMenuHandle(), nullptr);
  EXPECT_TRUE(m_parent.SetMenu(menu.m_hMenu));
  EXPECT_EQ(m_parent.GetMenuHandle(), menu.m_hMenu);
  EXPECT_TRUE(m_parent.SetMenu(nullptr));
  EXPECT_TRUE(::IsMenu(menu.m_hMenu)) << "the window gave it back";
}

TEST_F(WindowMembers, SubclassedChildren_GetTheirReflectedMessages) {
  const HWND button = ::CreateWindowExW(0, WTEXT("Button"), WTEXT("b"), WS_CHILD, 0, 0, 40, 20, m_parent.m_hWnd,
                                        reinterpret_cast<HMENU>(INT_PTR{90}), SGetInstance(), nullptr);
  std::vector<UINT> seen;
  Window object([&](UINT message, WPARAM, LPARAM, LRESULT*) {
    seen.push_back(message);
    return 0;
  });
  EXPECT_FALSE(m_parent.SubclassChild(91, &object)) << "no such child";
  ASSERT_TRUE(m_parent.SubclassChild(90, &object));
  EXPECT_EQ(object.m_hWnd, button);
  EXPECT_EQ(m_parent.GetDlgItem(90), &object);
  object.EnableWindow(0);
  EXPECT_NE(std::find(seen.begin(), seen.end(), UINT{WM_ENABLE}), seen.end());
  LRESULT result = 0;
  EXPECT_FALSE(SWnd::ReflectLastMsg(m_parent.m_hWnd, &result)) << "no message is being handled";
  EXPECT_FALSE(SWnd::ReflectLastMsg(nullptr, &result));
}

TEST_F(WindowMembers, Scrolling_MovesChildrenAndUncoversTheRest) {
  m_parent.ShowWindow(SW_SHOWNA);
  m_parent.UpdateWindow();
  test::PumpAll();
  const SRect before = m_child.GetWindowRect();
  m_parent.ScrollWindow(7, -3);
  const SRect after = m_child.GetWindowRect();
  EXPECT_EQ(after.left, before.left + 7);
  EXPECT_EQ(after.top, before.top - 3);
  EXPECT_TRUE(::GetUpdateRect(m_parent.m_hWnd, nullptr, FALSE)) << "what came into view is to be painted";
  const SRect part(0, 0, 10, 10);
  m_parent.ScrollWindow(7, 0, &part);
  EXPECT_EQ(m_child.GetWindowRect(), after) << "children stay when a part is scrolled";
}

TEST_F(WindowMembers, ScrollBars_OfTheWindowAndOfAControl) {
  class WithBar : public Window {
   public:
    SScrollBar* GetScrollBarCtrl(int bar) const override { return bar == SB_HORZ ? m_bar : nullptr; }
    SScrollBar* m_bar = nullptr;
  } window;
  ASSERT_TRUE(window.Popup(WS_VSCROLL));
  SScrollBar bar;
  ASSERT_TRUE(bar.Create(WS_VISIBLE | SBS_HORZ, SRect(0, 0, 100, 17), &window, 3));
  window.m_bar = &bar;

  SCROLLINFO info = {};
  info.fMask = SIF_RANGE | SIF_PAGE | SIF_POS;
  info.nMin = 10, info.nMax = 99, info.nPage = 20, info.nPos = 30;
  EXPECT_EQ(window.SetScrollInfo(SB_HORZ, &info), 30);
  int low = 0, high = 0;
  bar.GetRange(&low, &high);
  EXPECT_EQ(low, 10);
  EXPECT_EQ(high, 99);
  SCROLLINFO found = {};
  ASSERT_TRUE(bar.GetInfo(&found));
  EXPECT_EQ(found.nPage, 20u);
  EXPECT_EQ(found.nPos, 30);
  EXPECT_EQ(window.GetScrollLimit(SB_HORZ), 80);
  EXPECT_EQ(bar.SetPos(95), 30);
  EXPECT_EQ(bar.GetPos(), 80) << "the page ends at the range's end";

  EXPECT_TRUE(bar.IsWindowEnabled());
  window.EnableScrollBarCtrl(SB_HORZ, 0);
  EXPECT_FALSE(bar.IsWindowEnabled());
  window.EnableScrollBarCtrl(SB_HORZ);
  EXPECT_TRUE(bar.IsWindowEnabled());
  EXPECT_TRUE(bar.EnableArrows(ESB_DISABLE_BOTH));
  if (!IsWine()) {  // which says so each time
    EXPECT_FALSE(bar.EnableArrows(ESB_DISABLE_BOTH)) << "they were disabled already";
  }
  EXPECT_TRUE(bar.EnableArrows());

  EXPECT_NE(window.GetStyle() & WS_VSCROLL, 0u);
  window.EnableScrollBarCtrl(SB_VERT, 0);
  EXPECT_EQ(window.GetStyle() & WS_VSCROLL, 0u) << "the window's own bar is hidden";
  window.EnableScrollBarCtrl(SB_VERT);
  EXPECT_NE(window.GetStyle() & WS_VSCROLL, 0u);
  EXPECT_TRUE(window.EnableScrollBar(SB_VERT, ESB_DISABLE_UP));
  EXPECT_FALSE(window.EnableScrollBar(SB_VERT, ESB_DISABLE_UP));
  window.DestroyWindow();
}

TEST_F(WindowMembers, Caret_BelongsToOneWindow) {
  POINT place = {};
  m_parent.CreateSolidCaret(2, 12);
  SWnd::SetCaretPos({17, 23});
  EXPECT_TRUE(::GetCaretPos(&place));
  EXPECT_EQ(place.x, 17);
  EXPECT_EQ(place.y, 23);
  EXPECT_FALSE(::ShowCaret(m_child.m_hWnd)) << "it is another window's";
  m_parent.ShowCaret();
  m_parent.HideCaret();
  m_child.CreateGrayCaret(2, 12);
  EXPECT_TRUE(::ShowCaret(m_child.m_hWnd)) << "a thread has one caret, which was made anew";
  EXPECT_FALSE(::ShowCaret(m_parent.m_hWnd));
  EXPECT_TRUE(::DestroyCaret());
  EXPECT_FALSE(::ShowCaret(m_child.m_hWnd));
}

// --- dialogs by name, and what nobody catches ---

TEST_F(WindowMembers, DialogsAreFoundByTheirNames) {
  static const test::DialogTemplate box = [] {
    test::DialogTemplate made(WTEXT("Named"));
    made.Button(WTEXT("OK"), BS_DEFPUSHBUTTON, IDOK);
    return made;
  }();
  ASSERT_TRUE(platform::RegisterResource(nullptr, RT_DIALOG, WTEXT("WrappersBox"), box.Data(), box.Size()));
  SDlg dialog, missing;
  ASSERT_TRUE(dialog.CreateDlg(WTEXT("WrappersBox"), &m_parent));
  SString caption;
  dialog.GetWindowTextW(&caption);
  EXPECT_EQ(caption, WTEXT("Named"));
  EXPECT_NE(dialog.GetDlgItem(IDOK), nullptr);
  dialog.EndDialog(IDOK);
  EXPECT_EQ(dialog.m_hWnd, nullptr);
  EXPECT_FALSE(missing.CreateDlg(WTEXT("NoSuchBox"), &m_parent));
}

TEST_F(WindowMembers, ExceptionsThatNobodyCatches_AreReportedWithTheirTexts) {
  const test::Reports reports;
  SReportException(std::make_exception_ptr(SEOutOfMemory()));
  SReportException(std::make_exception_ptr(std::runtime_error("of the runtime")));
  SReportException(std::make_exception_ptr(42));
  ASSERT_EQ(test::Reports::List().size(), 3u);
  EXPECT_EQ(test::Reports::List()[0], SEOutOfMemory().GetText());
  EXPECT_NE(test::Reports::List()[1].Find(WTEXT("of the runtime")), nullptr);
  EXPECT_FALSE(test::Reports::List()[2].IsEmpty());
  // The first exception is kept, later ones are reported.
  SWndThreadState& state = SWndThreadState::Get();
  state.KeepException(std::make_exception_ptr(1));
  state.KeepException(std::make_exception_ptr(std::runtime_error("later")));
  EXPECT_EQ(test::Reports::List().size(), 4u);
  EXPECT_TRUE(state.HasException());
  EXPECT_THROW(std::rethrow_exception(state.TakeException()), int);
  EXPECT_FALSE(state.HasException());
  EXPECT_EQ(state.TakeException(), nullptr);
}

// --- controls ---

TEST_F(WindowMembers, Edit_TakesBackLimitsAndHides) {
  SEdit edit, lines;
  ASSERT_TRUE(edit.Create(WS_VISIBLE | ES_AUTOHSCROLL, SRect(0, 0, 100, 20), &m_parent, 4));
  ASSERT_TRUE(lines.Create(WS_VISIBLE | ES_MULTILINE, SRect(0, 30, 100, 90), &m_parent, 5));
  const auto text = [&] {
    SString taken;
    edit.GetWindowTextW(&taken);
    return taken;
  };
  edit.SetWindowTextW(WTEXT("one"));
  EXPECT_FALSE(edit.CanUndo());
  edit.SetSel(3, 3);
  edit.ReplaceSel(WTEXT(" two"), 1);
  EXPECT_TRUE(edit.CanUndo());
  EXPECT_TRUE(edit.Undo());
  EXPECT_EQ(text(), WTEXT("one"));
  edit.ReplaceSel(WTEXT("!"), 1);
  edit.EmptyUndoBuffer();
  EXPECT_FALSE(edit.CanUndo());

  edit.SetWindowTextW(WTEXT(""));
  edit.SetLimitText(3);
  EXPECT_EQ(edit.GetLimitText(), 3);
  for (WCHAR c : SStringView(WTEXT("abcd"))) edit.SendMessageW(WM_CHAR, c);
  EXPECT_EQ(text(), WTEXT("abc"));
  EXPECT_EQ(edit.GetPasswordChar(), 0);
  edit.SetPasswordChar(WTEXT('*'));
  EXPECT_EQ(edit.GetPasswordChar(), WTEXT('*'));
  EXPECT_EQ(text(), WTEXT("abc")) << "only what is shown is hidden";

  EXPECT_EQ(lines.GetLineCount(), 1);
  lines.ReplaceSel(WTEXT("a\r\nb\r\nc"));
  EXPECT_EQ(lines.GetLineCount(), 3);
}

TEST_F(WindowMembers, Button_BecomesAnotherKind) {
  SButton button;
  ASSERT_TRUE(button.Create(WTEXT("b"), WS_VISIBLE | BS_PUSHBUTTON, SRect(0, 0, 60, 20), &m_parent, 4));
  button.SendMessageW(BM_CLICK);
  EXPECT_EQ(button.GetCheck(), 0);
  button.SetButtonStyle(BS_AUTOCHECKBOX);
  EXPECT_EQ(button.GetButtonStyle() & 0xFu, UINT{BS_AUTOCHECKBOX});
  button.SendMessageW(BM_CLICK);
  EXPECT_EQ(button.GetCheck(), 1);
}

TEST_F(WindowMembers, Progress_StepsAndBeginsAnew) {
  SProgressCtrl progress;
  ASSERT_TRUE(progress.Create(WS_VISIBLE, SRect(0, 0, 100, 20), &m_parent, 4));
  EXPECT_EQ(progress.SetStep(30), 10);
  for (int expected : {0, 30, 60, 90}) EXPECT_EQ(progress.StepIt(), expected);
  EXPECT_LT(progress.GetPos(), 90) << "behind the end it began anew";
  EXPECT_EQ(progress.SetStep(1), 30);
}

TEST_F(WindowMembers, CustomProgress_TakesItsWholeStatusAtOnce) {
  SCustomProgressCtrl progress;
  ASSERT_TRUE(progress.Create(WS_VISIBLE, SRect(0, 0, 100, 20), &m_parent, 4));
  SCustomProgressCtrl::Status status;
  status.m_low = -50, status.m_high = 150, status.m_position = 900;
  progress.SetStatus(status);
  EXPECT_EQ(progress.GetPos(), 150) << "moved into the range";
  EXPECT_EQ(progress.GetPercent(), 100);
  status.m_position = 0;
  progress.SetStatus(status);
  EXPECT_EQ(progress.GetPercent(), 25);
}

}  // namespace
