// What screen readers learn of tabs and bars: read directly.

#include "qxcore/ui/accessible/accessible.h"
#include "tests/layout/layout_fixture.h"

namespace {

SPoint Middle(const SRect& rect) { return SPoint((rect.left + rect.right) / 2, (rect.top + rect.bottom) / 2); }

class Accessible : public test::FrameTest {};

TEST_F(Accessible, TabsAreATabStrip) {
  STabWnd tabs;
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr, WS_CHILD | WS_VISIBLE, kSFirstPane));
  tabs.MoveWindow(SRect(0, 0, 600, 300));
  for (LPCWSTR text : {WTEXT("one"), WTEXT("two"), WTEXT("three")}) tabs.AddTab(&test::PaneView::classPaneView, text);
  STabBeam& beam = *tabs.GetTabBeam();
  const auto object = beam.MakeAccessible();
  EXPECT_EQ(object->GetRole(0), kSRoleTabStrip);
  ASSERT_EQ(object->GetChildCount(), 3);
  EXPECT_EQ(object->GetRole(2), kSRoleTab);
  EXPECT_EQ(object->GetName(2), WTEXT("two"));
  EXPECT_TRUE(object->GetState(1) & kSStateSelected);
  EXPECT_FALSE(object->GetState(2) & kSStateSelected);
  // A child lies where a click on it chooses it.
  EXPECT_EQ(object->ChildAt(Middle(object->GetRect(2))), 2);
  SPoint place = Middle(object->GetRect(2));
  beam.ScreenToClient(&place);
  test::Mouse(beam, WM_LBUTTONDOWN, place);
  test::Mouse(beam, WM_LBUTTONUP, place);
  EXPECT_EQ(beam.GetCurSel(), 1);
  EXPECT_TRUE(object->DoDefaultAction(3));
  EXPECT_EQ(beam.GetCurSel(), 2);
  beam.SetFocus();
  EXPECT_EQ(object->GetFocusedChild(), 3);
  beam.SetFirstVisible(2);
  EXPECT_TRUE(object->GetState(1) & kSStateInvisible);
  EXPECT_TRUE(object->GetRect(1).IsEmpty());
  for (int child : {-1, 4}) {
    EXPECT_EQ(object->GetRole(child), 0);
    EXPECT_TRUE(object->GetName(child).IsEmpty());
    EXPECT_FALSE(object->DoDefaultAction(child));
  }
}

TEST_F(Accessible, BarsAreSeparators) {
  SSplitterWnd splitter;
  ASSERT_TRUE(splitter.CreateStatic(m_frame, 2, 3, WS_CHILD | WS_VISIBLE, kSFirstPane));
  for (int row = 0; row < 2; ++row)
    for (int column = 0; column < 3; ++column)
      splitter.AddPane(row, column, &test::PaneView::classPaneView, SSize(150, 100));
  splitter.SetColumnInfo(1, 150, 0, 1);
  splitter.MoveWindow(SRect(0, 0, 600, 300));
  const auto object = splitter.MakeAccessible();
  EXPECT_EQ(object->GetRole(0), kSRolePane);
  ASSERT_EQ(object->GetChildCount(), 3);  // one between the rows, two between the columns
  EXPECT_EQ(object->GetRole(1), kSRoleSeparator);
  EXPECT_EQ(object->GetName(1), WTEXT("Row bar 1"));
  EXPECT_EQ(object->GetName(2), WTEXT("Column bar 1"));
  EXPECT_EQ(object->GetValue(2), WTEXT("150"));
  EXPECT_TRUE(object->GetState(2) & kSStateMoveable);
  EXPECT_TRUE(object->GetState(3) & kSStateUnavailable);  // fixed
  EXPECT_FALSE(object->DoDefaultAction(3));
  // The bar lies between its panes.
  SRect left = splitter.GetPane(0, 0)->GetWindowRect(), right = splitter.GetPane(0, 1)->GetWindowRect();
  EXPECT_EQ(object->GetRect(2).left, left.right);
  EXPECT_EQ(object->GetRect(2).right, right.left);
  EXPECT_TRUE(object->DoDefaultAction(2));
  EXPECT_EQ(object->GetValue(2), WTEXT("0"));
  EXPECT_TRUE(object->DoDefaultAction(2));
  EXPECT_EQ(object->GetValue(2), WTEXT("150"));
}

}  // namespace
