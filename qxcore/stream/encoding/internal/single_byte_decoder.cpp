#include "qxcore/stream/encoding/internal/single_byte_decoder.h"

#include <algorithm>

#include "qxcore/platform/internal/processor.h"
#include "qxcore/platform/internal/widen.h"

#if defined(__x86_64__) || defined(__i386__)
#include <immintrin.h>

// The upper half of the table lies in four registers; 32 bytes at a time are looked up in all of them.
#define QXCORE_TARGET __attribute__((target("avx512f,avx512bw,avx512vl")))

QXCORE_TARGET static SSingleByteRun DecodeBlocks(const WCHAR* table, WCHAR none, const unsigned char* in,
                                                 const unsigned char* end, WCHAR* out) {
  constexpr std::ptrdiff_t kBlock = 32;
  constexpr int kHalf = 128;
  const __m512i quarter0 = _mm512_loadu_si512(table + kHalf);
  const __m512i quarter1 = _mm512_loadu_si512(table + kHalf + 32);
  const __m512i quarter2 = _mm512_loadu_si512(table + kHalf + 64);
  const __m512i quarter3 = _mm512_loadu_si512(table + kHalf + 96);
  const __m512i missing = _mm512_set1_epi16(static_cast<short>(none));
  for (; end - in >= kBlock; in += kBlock, out += kBlock) {
    const __m256i bytes = _mm256_loadu_si256(reinterpret_cast<const __m256i*>(in));
    const __mmask32 above = _mm256_movepi8_mask(bytes);
    __m512i characters = _mm512_cvtepu8_epi16(bytes);
    if (above != 0) {
      // The look-up uses the low six bits of an index; bit 6 selects between the two pairs.
      const __mmask32 upper = _mm512_test_epi16_mask(characters, _mm512_set1_epi16(0x40));
      const __m512i low = _mm512_permutex2var_epi16(quarter0, characters, quarter1);
      const __m512i high = _mm512_permutex2var_epi16(quarter2, characters, quarter3);
      characters = _mm512_mask_mov_epi16(characters, above, _mm512_mask_mov_epi16(low, upper, high));
      if (_mm512_mask_cmpeq_epi16_mask(above, characters, missing) != 0) break;
    }
    _mm512_storeu_si512(out, characters);
  }
  return {in, out};
}
#endif

SSingleByteRun SDecodeSingleByte(const WCHAR* table, WCHAR none, bool keepsASCII, const unsigned char* in,
                                 const unsigned char* end, WCHAR* out) {
#if defined(__x86_64__) || defined(__i386__)
  static const bool usesAvx512 = platform::CanUse(platform::Instructions::kAvx512);
  if (usesAvx512 && keepsASCII) {
    SSingleByteRun run = DecodeBlocks(table, none, in, end, out);
    in = run.in;
    out = run.out;
  }
#endif
  constexpr std::ptrdiff_t kStretch = 8;  // bytes through the table before looking for plain text again
  while (in != end) {
    if (keepsASCII && *in < 0x80) {
      std::size_t plain = SWidenASCII(in, static_cast<std::size_t>(end - in), out);
      in += plain;
      out += plain;
    }
    const unsigned char* stretch = in + std::min(end - in, kStretch);
    for (; in != stretch; ++in, ++out) {
      const WCHAR character = table[*in];
      if (character == none) [[unlikely]]
        return {in, out};
      *out = character;
    }
  }
  return {in, out};
}
