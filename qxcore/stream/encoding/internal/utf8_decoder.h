// UTF-8 to UTF-16, as far as all is well; what stands in the way is looked at with platform::StepUtf8.
#pragma once

#include "qxcore/stream/encoding/internal/utf8_run.h"

// Decodes sequences of one to three bytes until the end or the first sequence that is cut, illegal or longer.
// Surrogates in three bytes each are taken as they stand, because files of the library hold them so; overlong forms are
// illegal (Unicode 15, table 3-7). `out` has room for end - in characters.
SUtf8Run SDecodeUtf8(const unsigned char* in, const unsigned char* end, WCHAR* out);

// The same by the standard alone: sequences of four bytes become surrogate pairs, surrogates are illegal.
SUtf8Run SDecodeFullUtf8(const unsigned char* in, const unsigned char* end, WCHAR* out);

// Like SDecodeUtf8 without checking continuation bytes: stops at a cut sequence, a stray continuation byte
// or a lead byte of four and more.
SUtf8Run SDecodeUtf8Quick(const unsigned char* in, const unsigned char* end, WCHAR* out);
