// Widening and narrowing of 7-bit characters and swapping of bytes, a register at a time where the processor can.
#pragma once

#include <cstddef>

#include "platform/win32.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

// Copies bytes below 0x80 to characters, up to `size` of them, and stops at the first other byte. Gives
// their number. `out` has room for `size` characters.
inline std::size_t SWidenASCII(const unsigned char* in, std::size_t size, WCHAR* out) {
  std::size_t done = 0;
#ifdef __SSE2__
  constexpr std::size_t kBlock = 16;
  const __m128i zero = _mm_setzero_si128();
  for (; size - done >= kBlock; done += kBlock) {
    __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + done));
    unsigned high = static_cast<unsigned>(_mm_movemask_epi8(block));
    __m128i* target = reinterpret_cast<__m128i*>(out + done);
    // Written whole even if not all of it is plain: the room is there, and what follows overwrites it.
    _mm_storeu_si128(target, _mm_unpacklo_epi8(block, zero));
    _mm_storeu_si128(target + 1, _mm_unpackhi_epi8(block, zero));
    if (high != 0) return done + static_cast<std::size_t>(__builtin_ctz(high));
  }
#endif
  while (done < size && in[done] < 0x80) {
    out[done] = in[done];
    ++done;
  }
  return done;
}

// Copies bytes to the characters of the same value.
inline void SWidenBytes(const unsigned char* in, std::size_t size, WCHAR* out) {
  std::size_t done = 0;
#ifdef __SSE2__
  constexpr std::size_t kBlock = 16;
  const __m128i zero = _mm_setzero_si128();
  for (; size - done >= kBlock; done += kBlock) {
    const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + done));
    __m128i* target = reinterpret_cast<__m128i*>(out + done);
    _mm_storeu_si128(target, _mm_unpacklo_epi8(block, zero));
    _mm_storeu_si128(target + 1, _mm_unpackhi_epi8(block, zero));
  }
#endif
  for (; done < size; ++done) out[done] = in[done];
}

// The other way: copies characters below 0x80 to bytes, and stops at the first other one, and at kStop. Gives
// their number. `out` has room for `size` bytes.
template <WCHAR kStop>
std::size_t SNarrowASCII(const WCHAR* in, std::size_t size, char* out) {
  std::size_t done = 0;
#ifdef __SSE2__
  constexpr std::size_t kBlock = 8;
  const __m128i zero = _mm_setzero_si128();
  const __m128i high = _mm_set1_epi16(static_cast<short>(0xFF80));
  const __m128i stop = _mm_set1_epi16(static_cast<short>(kStop));
  for (; size - done >= kBlock; done += kBlock) {
    const __m128i block = _mm_loadu_si128(reinterpret_cast<const __m128i*>(in + done));
    const __m128i plain =
        _mm_andnot_si128(_mm_cmpeq_epi16(block, stop), _mm_cmpeq_epi16(_mm_and_si128(block, high), zero));
    const unsigned others = ~static_cast<unsigned>(_mm_movemask_epi8(plain)) & 0xFFFF;
    // Written whole even if not all of it is plain: the room is there, and what follows overwrites it.
    _mm_storel_epi64(reinterpret_cast<__m128i*>(out + done), _mm_packus_epi16(block, block));
    if (others != 0) return done + static_cast<std::size_t>(__builtin_ctz(others)) / 2;
  }
#endif
  while (done < size && in[done] < 0x80 && in[done] != kStop) {
    out[done] = static_cast<char>(in[done]);
    ++done;
  }
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
