// The walk over blocks of UTF-8 with AVX2, for both widths of registers: all of the judgement stays in vectors, so that
// nothing needs numbers of 64 bits, which are slow in 32-bit programs.
#pragma once

#include "qxcore/stream/encoding/internal/utf8_block_walk.h"

#if defined(__x86_64__) || defined(__i386__)
#define QXCORE_HAS_UTF8_BLOCKS_AVX2

// Like SWalkUtf8Blocks. The processor must have AVX2.
SUtf8BlockWalk SWalkUtf8BlocksAvx2(const unsigned char* at, const unsigned char* end, SUtf8BlockRules rules);

#endif
