// SAccessible: what a screen reader or a test learns of a window that the library draws itself.
//
// A window has an object of its own, child 0, and simple children, numbered from 1: the tabs of a tab beam, the bars
// of a splitter, the panes of a status bar. The object describes the window as it is at each call. On Windows it is
// what WM_GETOBJECT returns, as an IAccessible; programs ask for it directly by the MakeAccessible of the window's
// class. Roles and states are the published numbers of the system's accessibility interface.
//
// An invalid child has the role 0, an empty name and an empty rectangle, and nothing is done for it. For the
// user-interface thread.
#pragma once

#include <memory>

#include "qxcore/graphics/rect.h"
#include "qxcore/string/string.h"

class SWnd;

// Roles.
inline constexpr int kSRolePane = 16;
inline constexpr int kSRoleSeparator = 21;
inline constexpr int kSRoleStatusBar = 23;
inline constexpr int kSRoleTab = 37;
inline constexpr int kSRoleStaticText = 41;
inline constexpr int kSRoleTabStrip = 60;

// Bits of a state.
inline constexpr DWORD kSStateUnavailable = 0x1;
inline constexpr DWORD kSStateSelected = 0x2;
inline constexpr DWORD kSStateFocused = 0x4;
inline constexpr DWORD kSStateReadOnly = 0x40;
inline constexpr DWORD kSStateInvisible = 0x8000;
inline constexpr DWORD kSStateOffscreen = 0x10000;
inline constexpr DWORD kSStateMoveable = 0x40000;
inline constexpr DWORD kSStateFocusable = 0x100000;
inline constexpr DWORD kSStateSelectable = 0x200000;

class QXCORE_API SAccessible {
 public:
  SAccessible(const SAccessible&) = delete;
  SAccessible& operator=(const SAccessible&) = delete;
  virtual ~SAccessible();

  HWND GetWindow() const { return m_window; }  // the window that the object describes

  virtual int GetChildCount() const = 0;         // how many children there are
  virtual int GetRole(int child) const = 0;      // one of kSRole...
  virtual SString GetName(int child) const = 0;  // what the child is called
  // A sum of kSState... bits.
  virtual DWORD GetState(int child) const = 0;
  // What the child shows or how far it is moved; empty where the name says all.
  virtual SString GetValue(int child) const;
  // The place on the screen; that of the window for child 0.
  virtual SRect GetRect(int child) const = 0;
  // What DoDefaultAction does, in one word; empty for nothing.
  virtual SString GetDefaultAction(int child) const;
  // Does what a user's usual choice of the child does. Returns nonzero when something was done.
  virtual int DoDefaultAction(int child);

  // The child at a point of the screen: 0 for the window itself, -1 outside of it.
  int ChildAt(const POINT& point) const;
  // The child that has the keyboard: 0 for the window itself, -1 when it is elsewhere.
  int GetFocusedChild() const;

 protected:
  // Describes a window, which must exist.
  explicit SAccessible(const SWnd& window);

  // True for the number of a child, 0 left out.
  bool IsChild(int child) const { return child >= 1 && child <= GetChildCount(); }
  // The window's own part of a state, and its rectangle.
  DWORD WindowState() const;
  SRect WindowRect() const;
  // A rectangle of the client area on the screen.
  SRect OnScreen(const SRect& client) const;

 private:
  HWND m_window;
};

// The answer to WM_GETOBJECT: takes the object over when the message asks for the client area's. Returns 0 where the
// system has no such interface, or for another object; then the message goes to its default procedure.
QXCORE_API LRESULT SAnswerGetObject(WPARAM wParam, LPARAM lParam, std::unique_ptr<SAccessible> object);
// Whether the message asks for the object of the client area.
QXCORE_API bool SAsksForClient(LPARAM lParam);
