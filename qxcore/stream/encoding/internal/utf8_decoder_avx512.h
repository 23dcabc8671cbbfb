// The UTF-8 decoder for processors with AVX-512 VBMI2: 64 bytes at a time, whatever they hold.
#pragma once

#include "qxcore/stream/encoding/internal/utf8_run.h"

#if defined(__x86_64__) || defined(__i386__)
#define QXCORE_HAS_AVX512_DECODER 1

// Whether this processor and system can run the function below.
bool SCanDecodeUtf8Avx512();

// Decodes whole blocks and stops before the first block that holds anything but well-formed sequences of
// one to three bytes, or that lies within 66 bytes of the end; the plain decoder goes on from there.
// Stops between two characters always. `full`: surrogates in three bytes are not well-formed.
SUtf8Run SDecodeUtf8Avx512(const unsigned char* in, const unsigned char* end, WCHAR* out, bool full);
#else
#define QXCORE_HAS_AVX512_DECODER 0
#endif
