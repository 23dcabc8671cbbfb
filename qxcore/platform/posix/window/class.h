// Window classes.
#pragma once

#include "qxcore/platform/posix/window/handle_table.h"

namespace platform::model {

struct Class : OnModelHeap {
  ATOM name = 0;
  UINT style = 0;
  WNDPROC procedure = nullptr;
  int windowExtra = 0;
  HINSTANCE instance = nullptr;
  HICON icon = nullptr, smallIcon = nullptr;
  HCURSOR cursor = nullptr;
  HBRUSH background = nullptr;
  Text menuName;
  LPCWSTR menuNumber = nullptr;  // when the menu is named by number
  List<BYTE> extra;
  int windows = 0;
  bool isSystem = false;
};

// Under the lock: the class of this instance, else a system's or global one; null without.
Class* FindClass(LPCWSTR name, HINSTANCE instance);
// Under the lock; throws std::bad_alloc. Makes a class of the system.
void AddSystemClass(LPCWSTR name, UINT style, WNDPROC procedure, int windowExtra, HCURSOR cursor, HBRUSH background);
// Makes the system's classes, once. Under the lock; throws std::bad_alloc.
void EnsureSystemClasses();

}  // namespace platform::model
