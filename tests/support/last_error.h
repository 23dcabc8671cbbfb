// The last error of calls that must fail.
#pragma once

#include <gtest/gtest.h>

#include "qxcore/platform/win32.h"

// Clears the last error, calls, and returns the error of a call that must fail.
template <class Call>
DWORD ErrorOf(Call call) {
  SetLastError(0xDEAD);
  EXPECT_FALSE(call());
  return GetLastError();
}
