// The shared buffer behind every SString: a fixed header, then the characters.
//
// One allocation holds both; the SString points at the first character. Invariants:
//  1. the character at index m_length is 0 (except while a buffer is lent out);
//  2. there is room for m_allocLength + 1 characters;
//  3. a buffer whose count is kStatic is never written and never freed.
// Threads: the count is changed with interlocked operations only; everything else belongs to the holder that writes.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/interlocked.h"
#include "qxcore/platform/win32.h"

struct SStringData {
  static constexpr std::int32_t kStatic = -1;  // constant data, shared without counting
  static constexpr std::int32_t kLocked = -2;  // lent out as a writable pointer, never shared

  std::int32_t m_refs;         // strings that share the buffer, or one of the two above
  std::int32_t m_length;       // characters before the terminator
  std::int32_t m_allocLength;  // characters that fit, the terminator not counted

  // The text behind the header.
  WCHAR* Text() { return reinterpret_cast<WCHAR*>(this + 1); }
  // By way of an integer: compilers take a step back from a pointer to characters for a mistake.
  static SStringData* Of(WCHAR* text) {
    return reinterpret_cast<SStringData*>(reinterpret_cast<std::uintptr_t>(text) - sizeof(SStringData));
  }
  static const SStringData* Of(const WCHAR* text) { return Of(const_cast<WCHAR*>(text)); }

  // The count, read atomically.
  std::int32_t Refs() const { return __atomic_load_n(&m_refs, __ATOMIC_ACQUIRE); }
};

static_assert(sizeof(SStringData) == 12 && offsetof(SStringData, m_length) == 4 &&
                  offsetof(SStringData, m_allocLength) == 8,
              "debugger printers and clients rely on the layout");

// A constant string with its header in front, as every shared buffer has it.
template <int kLength>
struct SStaticString {
  SStringData m_header;       // kStatic, and the length
  WCHAR m_text[kLength + 2];  // terminated

  // Made of a literal.
  static constexpr SStaticString Of(const WCHAR (&text)[kLength + 1]) {
    SStaticString made{{SStringData::kStatic, kLength, kLength + 1}, {}};
    for (int i = 0; i < kLength; ++i) made.m_text[i] = text[i];
    return made;
  }
};
