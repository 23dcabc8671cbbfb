// Judges UTF-8 in blocks of 64 bytes.
#pragma once

#include "qxcore/stream/encoding/internal/utf8_block_walk.h"

// Walks whole blocks from `at`, where a sequence begins, as long as they are well-formed and more than one block is
// left before `end`. A block is refused as a whole. By the full rules the last lead byte before the stop may be one
// that no continuation makes good.
SUtf8BlockWalk SWalkUtf8Blocks(const unsigned char* at, const unsigned char* end, SUtf8BlockRules rules);
