// What the UTF-8 decoders return.
#pragma once

#include "qxcore/platform/win32.h"

struct SUtf8Run {
  const unsigned char* in;  // first byte not used
  WCHAR* out;               // behind the last character
};
