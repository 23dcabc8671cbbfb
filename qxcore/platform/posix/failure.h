// The one way to fail in the portable layer: the last error says why, the result says that.
#pragma once

#include <exception>

#include "qxcore/platform/win32.h"

namespace platform {

// Sets the last error and returns the value by which a call says that it failed: FALSE unless another is named.
template <class Result = BOOL>
inline Result FailWith(DWORD error, Result failed = Result()) {
  SetLastError(error);
  return failed;
}

// Runs the body of a call and returns its result. No exception leaves the portable layer: all that can be
// thrown there says that memory is out.
template <class Result, class Body>
Result Guarded(Result failed, Body body) noexcept {
  try {
    return body();
  } catch (const std::exception&) {
    return FailWith(ERROR_NOT_ENOUGH_MEMORY, failed);
  }
}

// The same for a body that returns an error code; TRUE for ERROR_SUCCESS.
template <class Body>
BOOL Succeeds(Body body) noexcept {
  return Guarded(FALSE, [&]() -> BOOL {
    const DWORD error = body();
    return error == ERROR_SUCCESS ? TRUE : FailWith(error);
  });
}

}  // namespace platform
