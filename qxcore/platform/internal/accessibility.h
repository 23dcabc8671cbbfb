// How the system hands an accessible object to the program that asked for it.
#pragma once

#include <memory>
#include <string>

#include "qxcore/platform/win32.h"

namespace platform {

// What the system wants to know of a window and its simple children, which are numbered from 1; 0 is the window.
// ui/accessible/accessible.h explains the members.
class AccessibleSource {
 public:
  using Text = std::basic_string<WCHAR>;

  virtual ~AccessibleSource() = default;
  virtual HWND Window() const = 0;
  virtual int ChildCount() const = 0;
  virtual int Role(int child) const = 0;
  virtual DWORD State(int child) const = 0;
  virtual Text Name(int child) const = 0;
  virtual Text Value(int child) const = 0;
  virtual Text DefaultAction(int child) const = 0;
  virtual RECT Place(int child) const = 0;
  virtual int DoDefaultAction(int child) = 0;
  virtual int ChildAt(POINT point) const = 0;
  virtual int FocusedChild() const = 0;
};

// The result of WM_GETOBJECT for an object, which it takes over; 0 where the system has no such interface.
LRESULT AnswerGetObject(WPARAM wParam, std::unique_ptr<AccessibleSource> object);

}  // namespace platform
