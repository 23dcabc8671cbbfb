// What walks over blocks of UTF-8 are asked for, and what they tell.
#pragma once

#include <cstdint>

// How far blocks are well-formed, and what they hold.
struct SUtf8BlockWalk {
  const unsigned char* stop = nullptr;  // at the end of a sequence, or within one
  int expected = 0;                     // how many continuation bytes the last sequence lacks at `stop`
  std::int64_t leads = 0;               // bytes from 0xC0 on
  std::int64_t continuations = 0;
  std::int64_t zeros[2] = {0, 0};  // at even and at odd offsets from the first block
};

// The rules that tell what is well-formed.
enum class SUtf8BlockRules {
  kBasic,  // sequences of up to three bytes, whatever they mean
  kFull    // RFC 3629: up to four bytes, no overlong forms, no surrogates, nothing above U+10FFFF
};
