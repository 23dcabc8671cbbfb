// Widening and narrowing of 7-bit characters and swapping of bytes, a register at a time where the processor can.
#pragma once

#include <cstddef>

#include "qxcore/platform/win32.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

// Where widening stops: at bytes from 0x80 on.
struct SStopAtHigh {
  // Whether it stops at the byte.
  static constexpr bool Is(unsigned char c) { return c >= 0x80; }
#ifdef __SSE2__
  // The same for the bytes of a register: the highest bit of each counts.
  static __m128i Mask(__m128i bytes) { return bytes; }
#endif
};
// At these and at NUL.
struct SStopAtHighAndNUL {
  // Whether it stops at the byte.
  static constexpr bool Is(unsigned char c) { return c >= 0x80 || c == 0; }
#ifdef __SSE2__
  static __m128i Mask(__m128i bytes) { return _mm_or_si128(bytes, _mm_cmpeq_epi8(bytes, _mm_setzero_si128())); }
#endif
};
// At a backslash and at NUL.
struct SStopAtBackslashAndNUL {
  // Whether it stops at the byte.
  static constexpr bool Is(unsigned char c) { return c == 0x5C || c == 0; }
#ifdef __SSE2__
  static __m128i Mask(__m128i bytes) {
    return _mm_or_si128(_mm_cmpeq_epi8(bytes, _mm_set1_epi8(0x5C)), _mm_cmpeq_epi8(bytes, _mm_setzero_si128()));
  }
#endif
};

// Copies bytes to the characters of the same value, up to `size` of them, and stops where Stop says. Returns
// their number. `out` has room for `size` characters, of which those behind the stop are undefined.
template <class Stop>
std::size_t SWidenUntil(const unsigned char* in, std::size_t size, WCHAR* out) {
  std::size_t done = 0;
#ifdef __SSE2__
  // A block is written whole even if not all of it is wanted, and the last one lies over the one before.
  const __m128i zero = _mm_setzero_si128();
  constexpr std::size_t kBlock = 16, kHalf = 8;
  auto whole = [&](std::size_t at) {
    const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + at));
    __m128i* target = reinterpret_cast<__m128i*>(out + at);
    _mm_storeu_si128(target, _mm_unpacklo_epi8(block, zero));
    _mm_storeu_si128(target + 1, _mm_unpackhi_epi8(block, zero));
    return static_cast<unsigned>(_mm_movemask_epi8(Stop::Mask(block)));
  };
  auto half = [&](std::size_t at) {
    const __m128i block = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(in + at));
    _mm_storeu_si128(reinterpret_cast<__m128i*>(out + at), _mm_unpacklo_epi8(block, zero));
    return static_cast<unsigned>(_mm_movemask_epi8(Stop::Mask(block))) & 0xFF;
  };
  for (; size - done >= kBlock; done += kBlock) {
    if (unsigned stops = whole(done)) return done + static_cast<std::size_t>(__builtin_ctz(stops));
  }
  if (done == size) return size;
  if (size >= kBlock) {
    const unsigned stops = whole(size - kBlock);
    return stops != 0 ? size - kBlock + static_cast<std::size_t>(__builtin_ctz(stops)) : size;
  }
  if (size >= kHalf) {
    const unsigned stops = half(0) | half(size - kHalf) << (size - kHalf);
    return stops != 0 ? static_cast<std::size_t>(__builtin_ctz(stops)) : size;
  }
#endif
  for (; done < size && !Stop::Is(in[done]); ++done) out[done] = in[done];
  return done;
}

// The same for bytes below 0x80.
inline std::size_t SWidenASCII(const unsigned char* in, std::size_t size, WCHAR* out) {
  return SWidenUntil<SStopAtHigh>(in, size, out);
}

// The other way: copies characters below 0x80 to bytes, and stops at the first other one, and at kStop. Returns
// their number. `out` has room for `size` bytes, of which those behind the stop are undefined.
template <WCHAR kStop>
std::size_t SNarrowASCII(const WCHAR* in, std::size_t size, char* out) {
  std::size_t done = 0;
#ifdef __SSE2__
  constexpr std::size_t kBlock = 8;
  // Two bits of the result for each character that is not plain.
  auto block = [&](std::size_t at) {
    const __m128i characters = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + at));
    const __m128i low =
        _mm_cmpeq_epi16(_mm_and_si128(characters, _mm_set1_epi16(static_cast<short>(0xFF80))), _mm_setzero_si128());
    const __m128i plain = _mm_andnot_si128(_mm_cmpeq_epi16(characters, _mm_set1_epi16(static_cast<short>(kStop))), low);
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out + at), _mm_packus_epi16(characters, characters));
    return ~static_cast<unsigned>(_mm_movemask_epi8(plain)) & 0xFFFF;
  };
  for (; size - done >= kBlock; done += kBlock) {
    if (unsigned others = block(done)) return done + static_cast<std::size_t>(__builtin_ctz(others)) / 2;
  }
  if (done == size) return size;
  if (size >= kBlock) {
    const unsigned others = block(size - kBlock);
    return others != 0 ? size - kBlock + static_cast<std::size_t>(__builtin_ctz(others)) / 2 : size;
  }
#endif
  for (; done < size && in[done] < 0x80 && in[done] != kStop; ++done) out[done] = static_cast<char>(in[done]);
  return done;
}

// Swaps the two bytes of each character.
inline void SSwapBytes(WCHAR* text, std::size_t count) {
  std::size_t done = 0;
#ifdef __SSE2__
  constexpr std::size_t kBlock = 8;
  for (; count - done >= kBlock; done += kBlock) {
    __m128i* at = reinterpret_cast<__m128i*>(text + done);
    __m128i block = _mm_loadu_si128(at);
    _mm_storeu_si128(at, _mm_or_si128(_mm_slli_epi16(block, 8), _mm_srli_epi16(block, 8)));
  }
#endif
  for (; done < count; ++done) text[done] = static_cast<WCHAR>(text[done] << 8 | (text[done] >> 8 & 0xFF));
}
