// Single-byte code pages to UTF-16 through a table of 256 characters.
#pragma once

#include <cstddef>

#include "qxcore/platform/win32.h"

struct SSingleByteRun {
  const unsigned char* in;  // first byte not used
  WCHAR* out;               // behind the last character
};

// Decodes until the end or the first byte whose character is `none`. `out` has room for end - in
// characters. `keepsASCII`: bytes below 0x80 are themselves.
SSingleByteRun SDecodeSingleByte(const WCHAR* table, WCHAR none, bool keepsASCII, const unsigned char* in,
                                 const unsigned char* end, WCHAR* out);
