// How windows come to new places, one or several at once: SetWindowPos (place.cpp) and batches (place_together.cpp).
// Called without the lock.
#pragma once

#include "qxcore/platform/posix/window/window.h"

namespace platform::model {

struct NewPlace {
  RECT window, client;
};

// A request, and what became of it.
struct Placing {
  WINDOWPOS place;
  NewPlace from{}, to{};
  bool wasShown = false, isShown = false, spoilsParent = false, isUnpainted = false, isDone = false;
  bool isWaiting = false;  // the window's pixels wait to be copied, since this request
};

enum class Uncovers { Now, Later };

// The first half: the window is in its new place, and its pixels, where they were, are noted (deferred_copies.h). What
// it left comes to light now, or the caller sees to that. False when there is no such window any more.
bool Begin(Placing& placing, Uncovers uncovers);

// The second half: the display, activation, what must be erased at once, and what the window hears of it.
bool Finish(Placing& placing);

// Both halves, and the pixels between them.
bool PlaceNow(Placing& placing);

}  // namespace platform::model
