// UTF-8 to UTF-16: sequences of one to three bytes, as the library reads them.
//
// Surrogates in three bytes each are taken as they stand, because the library's own files hold them
// so; sequences of four bytes are not supported. Overlong forms are illegal (Unicode 15, table 3-7).
#pragma once

#include <cstddef>

#include "qxcore/platform/win32.h"

struct SUtf8Run {
  const unsigned char* in;  // first byte not used
  WCHAR* out;               // behind the last character
};

// Decodes until the end or the first sequence that is cut, illegal or not supported. `out` has room for
// end - in characters.
SUtf8Run SDecodeUtf8(const unsigned char* in, const unsigned char* end, WCHAR* out);

// The same without checking continuation bytes: stops at a cut sequence, a stray continuation byte
// or a lead byte of four and more.
SUtf8Run SDecodeUtf8Quick(const unsigned char* in, const unsigned char* end, WCHAR* out);

// What stands where decoding stopped.
struct SUtf8Obstacle {
  std::ptrdiff_t length;  // bytes to pass over: a whole sequence of four, or the longest beginning of one
  bool isIllegal;         // no UTF-8 at all
  bool isCut;             // the end came before the sequence could be judged
};
// Looks at the place where a decoder stopped, which is not the end.
SUtf8Obstacle SLookAtUtf8(const unsigned char* in, const unsigned char* end);
