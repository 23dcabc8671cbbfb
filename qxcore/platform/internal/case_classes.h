// The characters that share a lower-case form.
#pragma once

#include <span>

#include "qxcore/platform/bmp.h"

namespace platform {

// A character other than its lower-case form.
struct CaseVariant {
  WCHAR lower, other;
};

// All characters whose lower-case form is `lower`, but for that itself; rarely more than one.
std::span<const CaseVariant> CaseVariantsOf(WCHAR lower);

}  // namespace platform
