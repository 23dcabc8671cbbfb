// Windows and their objects: creation, binding, temporary objects, destruction.

#include "tests/support/wine.h"
#include "tests/ui/ui_fixture.h"

namespace {

using test::Window;

class Windows : public test::UiTest {};

TEST_F(Windows, Create_BindsTheObjectBeforeTheFirstMessage) {
  std::vector<UINT> messages;
  Window window;
  window.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    EXPECT_EQ(SWnd::FromHandlePermanent(window.m_hWnd), &window);
    messages.push_back(message);
    return 0;
  };
  ASSERT_TRUE(window.Popup());
  ASSERT_FALSE(messages.empty());
  EXPECT_TRUE(messages.front() == WM_GETMINMAXINFO || messages.front() == WM_NCCREATE) << messages.front();
  EXPECT_EQ(SWndThreadState::Get().m_creationHook, nullptr);
  EXPECT_EQ(SWndThreadState::Get().m_pending, nullptr);

  const HWND handle = window.m_hWnd;
  EXPECT_TRUE(window.DestroyWindow());
  EXPECT_EQ(window.m_ends, 1);
  EXPECT_EQ(window.m_hWnd, nullptr);
  EXPECT_FALSE(::IsWindow(handle));
  EXPECT_EQ(window.DestroyWindow(), 0) << "there is no window any more";
}

// Each way to fail ends in exactly one PostNcDestroy, and leaves nothing.
TEST_F(Windows, Classes_AreRegisteredOncePerSetOfAttributes) {
  const HCURSOR cross = ::LoadCursorW(nullptr, IDC_CROSS);
  const LPCWSTR name = SRegisterWindowClass(CS_DBLCLKS | CS_HREDRAW, cross);
  EXPECT_EQ(SRegisterWindowClass(CS_DBLCLKS | CS_HREDRAW, cross), name);
  EXPECT_NE(SRegisterWindowClass(CS_DBLCLKS, cross), name);
  EXPECT_NE(SRegisterWindowClass(CS_DBLCLKS | CS_HREDRAW), name);
  test::Window window;
  ASSERT_TRUE(window.CreateEx(0, name, WTEXT("own"), WS_POPUP, 0, 0, 10, 10, nullptr, nullptr));
  EXPECT_EQ(::GetClassLongPtrW(window.m_hWnd, GCL_STYLE), ULONG_PTR{CS_DBLCLKS | CS_HREDRAW});
  EXPECT_EQ(reinterpret_cast<HCURSOR>(::GetClassLongPtrW(window.m_hWnd, GCLP_HCURSOR)), cross);
  EXPECT_EQ(SWnd::FromHandlePermanent(window.m_hWnd), &window);
  window.DestroyWindow();
  EXPECT_EQ(window.m_ends, 1);
}

TEST_F(Windows, Create_ThatFails_EndsOnce) {
  class Refusing : public Window {
   public:
    int PreCreateWindow(CREATESTRUCTW*) override { return 0; }
  } refusing;
  EXPECT_FALSE(refusing.Popup());
  EXPECT_EQ(refusing.m_ends, 1);

  Window unknown;
  EXPECT_FALSE(unknown.CreateEx(0, WTEXT("no such class"), nullptr, WS_POPUP, 0, 0, 1, 1, nullptr, nullptr));
  EXPECT_EQ(unknown.m_ends, 1);
  EXPECT_EQ(unknown.m_hWnd, nullptr);

  for (UINT refused : {UINT{WM_NCCREATE}, UINT{WM_CREATE}}) {
    Window window([refused](UINT message, WPARAM, LPARAM, LRESULT* result) {
      if (message != refused) return 0;
      *result = message == WM_CREATE ? -1 : 0;
      return 1;
    });
    EXPECT_FALSE(window.Popup());
    EXPECT_EQ(window.m_ends, 1) << refused;
    EXPECT_EQ(window.m_hWnd, nullptr);
  }
  EXPECT_EQ(SWndThreadState::Get().m_creationHook, nullptr);
  EXPECT_EQ(SWndThreadState::Get().m_creations, nullptr);
}

// A window destroyed while it is being created, and one that creates others meanwhile.
TEST_F(Windows, Create_Nested_BindsEachToItsObject) {
  Window inner;
  Window outer;
  outer.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_CREATE) {
      EXPECT_TRUE(inner.Child(&outer));
    }
    return 0;
  };
  ASSERT_TRUE(outer.Popup());
  EXPECT_EQ(SWnd::FromHandlePermanent(inner.m_hWnd), &inner);
  EXPECT_EQ(::GetParent(inner.m_hWnd), outer.m_hWnd);
  outer.DestroyWindow();
  EXPECT_EQ(inner.m_ends, 1);

  Window gone;
  gone.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_CREATE) gone.DestroyWindow();
    return 0;
  };
  gone.Popup();
  EXPECT_EQ(gone.m_ends, 1);
  EXPECT_EQ(gone.m_hWnd, nullptr);
}

TEST_F(Windows, Temporary_ObjectsAreSharedUntilTheyAreDeleted) {
  const HWND handle = ::CreateWindowExW(0, WTEXT("Static"), WTEXT("text"), WS_POPUP, 0, 0, 10, 10, nullptr, nullptr,
                                        SGetInstance(), nullptr);
  ASSERT_NE(handle, nullptr);
  SWnd* object = SWnd::FromHandle(handle);
  ASSERT_NE(object, nullptr);
  EXPECT_EQ(object->m_hWnd, handle);
  EXPECT_EQ(SWnd::FromHandle(handle), object);
  EXPECT_EQ(SWnd::FromHandlePermanent(handle), nullptr);
  EXPECT_EQ(SWnd::FromHandle(nullptr), nullptr);

  // The lock keeps them.
  SLockTempMaps();
  SLockTempMaps();
  SUnlockTempMaps();
  EXPECT_EQ(SWnd::HandleMap().FromHandleTemporary(handle), object);
  SUnlockTempMaps();
  EXPECT_EQ(SWnd::HandleMap().GetTemporaryCount(), 0);
  EXPECT_TRUE(::IsWindow(handle)) << "a temporary object never destroys its window";

  ::DestroyWindow(handle);
}

TEST_F(Windows, Temporary_ObjectThatDestroysItsWindow_IsFoundUntilThen) {
  Window parent;
  ASSERT_TRUE(parent.Popup());
  const HWND handle = ::CreateWindowExW(0, WTEXT("Static"), nullptr, WS_CHILD, 0, 0, 9, 9, parent.m_hWnd, nullptr,
                                        SGetInstance(), nullptr);
  SWnd* object = SWnd::FromHandle(handle);
  SWnd* found = nullptr;
  parent.m_handler = [&](UINT message, WPARAM wParam, LPARAM lParam, LRESULT*) {
    if (message == WM_PARENTNOTIFY && LOWORD(wParam) == WM_DESTROY) {
      found = SWnd::FromHandle(reinterpret_cast<HWND>(lParam));
      SLockTempMaps();
      SUnlockTempMaps();  // idle work of a loop inside keeps it
    }
    return 0;
  };
  EXPECT_TRUE(object->DestroyWindow());
  EXPECT_EQ(found, object);
  EXPECT_EQ(object->m_hWnd, nullptr);
  EXPECT_EQ(SWnd::HandleMap().FromHandleTemporary(handle), nullptr);
  EXPECT_FALSE(::IsWindow(handle));
  parent.DestroyWindow();
}

TEST_F(Windows, ScrollBars_AreGivenToHandlersAsSuch) {
  Window parent;
  ASSERT_TRUE(parent.Popup());
  const HWND bar = ::CreateWindowExW(0, WTEXT("ScrollBar"), nullptr, WS_CHILD, 0, 0, 10, 50, parent.m_hWnd, nullptr,
                                     SGetInstance(), nullptr);
  EXPECT_TRUE(SWnd::FromHandle(bar)->IsKindOf(&SScrollBar::classSScrollBar));
  EXPECT_NE(SMsgObjects::ScrollBar(reinterpret_cast<std::intptr_t>(bar)), nullptr);
  EXPECT_EQ(SMsgObjects::ScrollBar(reinterpret_cast<std::intptr_t>(parent.m_hWnd)), nullptr);
  EXPECT_EQ(SMsgObjects::ScrollBar(0), nullptr);
  parent.DestroyWindow();
}

TEST_F(Windows, Attach_DetachAndSubclass_KeepTheWindowsProcedure) {
  const HWND handle =
      ::CreateWindowExW(0, WTEXT("Edit"), nullptr, WS_POPUP, 0, 0, 99, 20, nullptr, nullptr, SGetInstance(), nullptr);
  const LONG_PTR procedure = ::GetWindowLongPtrW(handle, GWLP_WNDPROC);
  SEdit edit;
  EXPECT_FALSE(edit.Attach(nullptr));
  EXPECT_FALSE(edit.SubclassWindow(nullptr));
  EXPECT_TRUE(edit.Attach(handle));
  EXPECT_EQ(SWnd::FromHandle(handle), &edit);
  EXPECT_EQ(edit.Detach(), handle);
  EXPECT_EQ(edit.Detach(), nullptr);
  EXPECT_EQ(SWnd::FromHandlePermanent(handle), nullptr);

  EXPECT_TRUE(edit.SubclassWindow(handle));
  EXPECT_EQ(::GetWindowLongPtrW(handle, GWLP_WNDPROC), reinterpret_cast<LONG_PTR>(&SWindowProcedure));
  edit.SetWindowTextW(WTEXT("through the class's own procedure"));
  SString text;
  edit.GetWindowTextW(&text);
  EXPECT_EQ(text, SString(WTEXT("through the class's own procedure")));
  edit.SetReadOnly(1);
  EXPECT_TRUE(edit.IsReadOnly());
  EXPECT_TRUE(edit.IsWindowEnabled());
  edit.DestroyWindow();
  EXPECT_EQ(edit.m_hWnd, nullptr);
  EXPECT_NE(procedure, 0);
}

TEST_F(Windows, SetReadOnly_OfOtherClasses_DisablesThem) {
  Window window;
  ASSERT_TRUE(window.Popup());
  window.SetReadOnly(1);
  EXPECT_TRUE(window.IsReadOnly());
  EXPECT_FALSE(window.IsWindowEnabled());
  window.SetReadOnly(0);
  EXPECT_FALSE(window.IsReadOnly());
  window.DestroyWindow();
}

// A class of this name does not pass its last message on, so its window leaves the map at once.
TEST_F(Windows, Destroy_OfAnEditorWindow_LeavesTheMapAtOnce) {
  WNDCLASSEXW registered = {};
  registered.cbSize = sizeof(registered);
  registered.hInstance = SGetInstance();
  registered.lpfnWndProc = &::DefWindowProcW;
  registered.lpszClassName = WTEXT("sEDITOR");
  ASSERT_NE(::RegisterClassExW(&registered), 0);
  const HWND handle =
      ::CreateWindowExW(0, WTEXT("SEditor"), nullptr, WS_POPUP, 0, 0, 9, 9, nullptr, nullptr, SGetInstance(), nullptr);
  ASSERT_NE(handle, nullptr);
  SWnd editor;
  editor.Attach(handle);
  EXPECT_TRUE(editor.DestroyWindow());
  EXPECT_EQ(editor.m_hWnd, nullptr);
  EXPECT_EQ(SWnd::FromHandlePermanent(handle), nullptr);
}

TEST_F(Windows, Destructor_WithALiveWindow_DestroysIt) {
  HWND handle = nullptr;
  {
    Window window;
    ASSERT_TRUE(window.Popup());
    handle = window.m_hWnd;
  }
  EXPECT_FALSE(::IsWindow(handle));
  EXPECT_EQ(SWnd::FromHandlePermanent(handle), nullptr);
}

// Objects that end in their own handler: nothing of them is touched afterwards.
TEST_F(Windows, Object_DeletedInItsOwnHandler_IsNotTouchedAgain) {
  for (UINT deadly : {UINT{WM_USER}, UINT{WM_COMMAND}, UINT{WM_SIZE}, UINT{WM_NCDESTROY}}) {
    auto* window = new Window;
    bool isGone = false;
    window->m_onEnd = [&] {
      isGone = true;
      delete window;
    };
    window->m_handler = [window, deadly](UINT message, WPARAM, LPARAM, LRESULT* result) {
      if (message != deadly || deadly == WM_NCDESTROY) return 0;
      *result = 7;
      window->DestroyWindow();
      return 1;
    };
    // A window that is created gets a WM_SIZE; so this one ends before there is a window.
    const int created = window->Popup();
    EXPECT_EQ(created, deadly != WM_SIZE);
    if (created) ::SendMessageW(window->m_hWnd, deadly == WM_NCDESTROY ? WM_CLOSE : deadly, 9, 0);
    EXPECT_TRUE(isGone) << deadly;
  }
}

TEST_F(Windows, StaleHandles_FailAsTheSystemDoes) {
  Window window;
  ASSERT_TRUE(window.Popup());
  const HWND stale = window.m_hWnd;
  window.DestroyWindow();
  SWnd* wrapper = SWnd::FromHandle(stale);
  ::SetLastError(0);
  EXPECT_FALSE(wrapper->ShowWindow(SW_SHOW));
  EXPECT_FALSE(wrapper->PostMessageW(WM_USER));
  EXPECT_EQ(::GetLastError(), DWORD{ERROR_INVALID_WINDOW_HANDLE});
  EXPECT_EQ(wrapper->SendMessageW(WM_USER), 0);
  EXPECT_FALSE(wrapper->DestroyWindow());
  SWnd* const nobody = wrapper->m_hWnd == stale ? nullptr : wrapper;
  EXPECT_EQ(nobody->GetSafeHwnd(), nullptr);
}

TEST_F(Windows, CurrentMessage_AfterANestedOne_IsTheOuterOneAgain) {
  Window window;
  UINT seen = 0;
  window.m_handler = [&](UINT message, WPARAM, LPARAM, LRESULT*) {
    if (message == WM_USER) {
      window.SendMessageW(WM_USER + 1, 1, 2);
      const SCurrentMessage& current = SWndThreadState::Get().m_current;
      seen = current.m_message;
      EXPECT_EQ(current.m_wParam, WPARAM{5});
      return 1;
    }
    return 0;
  };
  ASSERT_TRUE(window.Popup());
  window.SendMessageW(WM_USER, 5, 6);
  EXPECT_EQ(seen, UINT{WM_USER});
  EXPECT_EQ(SWndThreadState::Get().m_current.m_message, 0u);
  window.DestroyWindow();
}

TEST_F(Windows, SendMessageToDescendants_GoesBelowPlainChildren) {
  Window top;
  ASSERT_TRUE(top.Popup());
  const HWND plain = ::CreateWindowExW(0, WTEXT("Static"), nullptr, WS_CHILD, 0, 0, 9, 9, top.m_hWnd, nullptr,
                                       SGetInstance(), nullptr);
  SWnd wrapper;
  wrapper.Attach(plain);
  int count = 0;
  Window below([&](UINT message, WPARAM, LPARAM, LRESULT*) { return message == WM_USER ? ++count : 0; });
  ASSERT_TRUE(below.Child(&wrapper));
  wrapper.Detach();
  top.SendMessageToDescendants(WM_USER, 0, 0, 1, 1);
  EXPECT_EQ(count, 1);
  top.SendMessageToDescendants(WM_USER, 0, 0, 0, 0);
  EXPECT_EQ(count, 1);
  top.DestroyWindow();
}

TEST_F(Windows, PreTranslateWalk_StopsWhereItShould) {
  class Asked : public Window {
   public:
    int PreTranslateMessage(MSG*) override {
      ++m_asked;
      return m_takes;
    }
    int m_asked = 0;
    int m_takes = 0;
  } owner, top, child;
  ASSERT_TRUE(owner.Popup());
  ASSERT_TRUE(top.CreateEx(0, nullptr, nullptr, WS_POPUP, 0, 0, 9, 9, owner.m_hWnd, nullptr));
  const HWND plain = ::CreateWindowExW(0, WTEXT("Static"), nullptr, WS_CHILD, 0, 0, 9, 9, top.m_hWnd, nullptr,
                                       SGetInstance(), nullptr);
  SWnd wrapper;
  wrapper.Attach(plain);
  ASSERT_TRUE(child.Child(&wrapper));
  wrapper.Detach();
  MSG message = {};
  message.hwnd = child.m_hWnd;
  message.message = WM_USER;
  EXPECT_EQ(SWnd::WalkPreTranslateTree(nullptr, &message), 0);
  EXPECT_EQ(child.m_asked, 1);
  EXPECT_EQ(top.m_asked, 1) << "a window without an object is passed over";
  EXPECT_EQ(owner.m_asked, 0) << "the walk ends at a window that is no child";
  EXPECT_EQ(SWnd::WalkPreTranslateTree(child.m_hWnd, &message), 0);
  EXPECT_EQ(top.m_asked, 1);
  child.m_takes = 1;
  EXPECT_EQ(SWnd::WalkPreTranslateTree(nullptr, &message), 1);
  EXPECT_EQ(top.m_asked, 1);
  owner.DestroyWindow();
}

}  // namespace
