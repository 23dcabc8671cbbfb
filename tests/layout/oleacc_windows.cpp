// What programs of the system learn through IAccessible: the same as the library's own objects say.

#include <oleacc.h>

#include "qxcore/ui/accessible/accessible.h"
#include "tests/layout/layout_fixture.h"

namespace {

VARIANT Child(int number) {
  VARIANT child;
  VariantInit(&child);
  child.vt = VT_I4;
  child.lVal = number;
  return child;
}

SString Taken(BSTR text) {
  const SString taken(text != nullptr ? text : WTEXT(""));
  SysFreeString(text);
  return taken;
}

// The system's object for the client area of a window.
class Found {
 public:
  explicit Found(const SWnd& window) {
    AccessibleObjectFromWindow(window.m_hWnd, static_cast<DWORD>(OBJID_CLIENT), __uuidof(IAccessible),
                               reinterpret_cast<void**>(&m_object));
  }
  ~Found() {
    if (m_object != nullptr) m_object->Release();
  }
  Found(const Found&) = delete;
  Found& operator=(const Found&) = delete;
  explicit operator bool() const { return m_object != nullptr; }

  int Count() const {
    long count = -1;
    m_object->get_accChildCount(&count);
    return static_cast<int>(count);
  }
  int Role(int child) const {
    VARIANT role = Child(-1);
    return m_object->get_accRole(Child(child), &role) == S_OK && role.vt == VT_I4 ? role.lVal : -1;
  }
  DWORD State(int child) const {
    VARIANT state = Child(-1);
    return m_object->get_accState(Child(child), &state) == S_OK ? static_cast<DWORD>(state.lVal) : ~DWORD{0};
  }
  SString Name(int child) const {
    BSTR text = nullptr;
    m_object->get_accName(Child(child), &text);
    return Taken(text);
  }
  SString Action(int child) const {
    BSTR text = nullptr;
    m_object->get_accDefaultAction(Child(child), &text);
    return Taken(text);
  }
  SRect Rect(int child) const {
    long left = 0, top = 0, width = 0, height = 0;
    m_object->accLocation(&left, &top, &width, &height, Child(child));
    return SRect(SPoint(left, top), SSize(width, height));
  }
  HRESULT Act(int child) const { return m_object->accDoDefaultAction(Child(child)); }

 private:
  IAccessible* m_object = nullptr;
};

void ExpectSame(const Found& found, const SAccessible& own) {
  ASSERT_TRUE(found);
  ASSERT_EQ(found.Count(), own.GetChildCount());
  for (int child = 0; child <= own.GetChildCount(); ++child) {
    EXPECT_EQ(found.Role(child), own.GetRole(child)) << child;
    EXPECT_EQ(found.State(child), own.GetState(child)) << child;
    if (child > 0) {
      EXPECT_EQ(found.Name(child), own.GetName(child)) << child;
    }
    EXPECT_EQ(found.Action(child), own.GetDefaultAction(child)) << child;
    EXPECT_EQ(found.Rect(child), own.GetRect(child)) << child;
  }
}

class Oleacc : public test::FrameTest {};

TEST_F(Oleacc, FindsTheBarsOfASplitter) {
  SSplitterWnd splitter;
  ASSERT_TRUE(splitter.CreateStatic(m_frame, 2, 3, WS_CHILD | WS_VISIBLE, kSFirstPane));
  for (int place = 0; place < 6; ++place) {
    splitter.AddPane(place / 3, place % 3, &test::PaneView::classPaneView, SSize(150, 100));
  }
  splitter.MoveWindow(SRect(0, 0, 600, 300));
  const Found found(splitter);
  ExpectSame(found, *splitter.MakeAccessible());
  EXPECT_EQ(found.Role(2), ROLE_SYSTEM_SEPARATOR);
  EXPECT_EQ(found.Act(2), S_OK);
  int width = -1;
  splitter.GetColumnInfo(0, &width, nullptr);
  EXPECT_EQ(width, 0);
  splitter.DestroyWindow();
  EXPECT_EQ(found.Act(2), CO_E_OBJNOTCONNECTED) << "whoever still holds the object learns that its window went";
  EXPECT_EQ(found.Role(0), -1);
}

TEST_F(Oleacc, FindsTheTabsOfABeam) {
  STabWnd tabs;
  ASSERT_TRUE(tabs.Create(m_frame, nullptr, nullptr, WS_CHILD | WS_VISIBLE, kSFirstPane));
  tabs.MoveWindow(SRect(0, 0, 600, 300));
  for (LPCWSTR text : {WTEXT("one"), WTEXT("two"), WTEXT("three")}) tabs.AddTab(&test::PaneView::classPaneView, text);
  const Found found(*tabs.GetTabBeam());
  ExpectSame(found, *tabs.GetTabBeam()->MakeAccessible());
  EXPECT_EQ(found.Role(1), ROLE_SYSTEM_PAGETAB);
  EXPECT_EQ(found.Act(3), S_OK);
  EXPECT_EQ(tabs.GetTabBeam()->GetCurSel(), 2);
}

TEST_F(Oleacc, FindsThePanesOfAStatusBar) {
  SStatusBar bar;
  ASSERT_TRUE(bar.Create(m_frame));
  bar.InsertPane(0, 80, 0);
  bar.InsertPane(1, 0, kSPaneStretch);
  const SString text(WTEXT("ready"));
  bar.SetPaneText(0, &text);
  const Found found(bar);
  ExpectSame(found, *bar.MakeAccessible());
  EXPECT_EQ(found.Role(0), ROLE_SYSTEM_STATUSBAR);
}

}  // namespace
