// Work that may throw in a place where nothing may be thrown.
#pragma once

// Runs the body and drops what it throws. For destructors and the callbacks of others, which cannot report a failure:
// whoever must know of it calls Close, Flush or the like before.
template <class Body>
void SQuietly(Body body) noexcept {
  try {
    body();
  } catch (...) {
    return;
  }
}
