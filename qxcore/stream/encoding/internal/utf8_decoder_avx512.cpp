// 64 bytes are checked at once with one bit a byte. Then each of 32 positions is taken for the start of a
// character and decoded together with the two bytes behind it, and the positions that are no start are
// squeezed out. That costs the same for every mixture of lengths, where a loop over characters stumbles
// over each change.

#include "qxcore/stream/encoding/internal/utf8_decoder_avx512.h"

#if QXCORE_HAS_AVX512_DECODER

#include <immintrin.h>

#include <cstdint>

#include "qxcore/platform/internal/processor.h"
#include "qxcore/platform/internal/utf.h"

bool SCanDecodeUtf8Avx512() { return platform::CanUse(platform::Instructions::kAvx512Vbmi); }

#define QXCORE_TARGET __attribute__((target("avx512f,avx512bw,avx512vl,avx512vbmi2,bmi2,popcnt")))

namespace {

constexpr std::ptrdiff_t kBlock = 64;
constexpr std::ptrdiff_t kHalf = 32;
constexpr std::ptrdiff_t kReach = kBlock + 2;  // bytes looked at

// What stands where in a block, one bit a byte.
struct Layout {
  std::uint64_t continuation;
  std::uint64_t three;    // lead bytes of three
  std::uint64_t expects;  // continuation bytes that this block expects at the start of the next one
  bool isGood;
};

using platform::IsUtf8Continuation;

QXCORE_TARGET inline Layout Check(const unsigned char* in, __m512i bytes, std::uint64_t above, std::uint64_t expected,
                                  bool full) {
  Layout layout;
  // As signed numbers the continuation bytes are those below 0xC0.
  layout.continuation = _mm512_cmplt_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xC0)));
  const std::uint64_t fromE0 = _mm512_cmpge_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xE0)));
  const std::uint64_t fromF0 = _mm512_cmpge_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xF0)));
  const std::uint64_t belowA0 = _mm512_cmplt_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xA0)));
  const std::uint64_t isE0 = _mm512_cmpeq_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xE0)));
  const std::uint64_t belowC2 = _mm512_cmplt_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xC2)));
  const std::uint64_t leads = above & ~layout.continuation;
  layout.three = fromE0;
  expected |= leads << 1 | fromE0 << 2;
  const std::uint64_t overlong = (leads & belowC2) | (isE0 << 1 & belowA0);
  layout.expects = leads >> 63 | fromE0 >> 62;
  const std::uint64_t surrogates =
      full ? _mm512_cmpeq_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xED))) << 1 & ~belowA0 : 0;
  layout.isGood = ((expected ^ layout.continuation) | fromF0 | overlong | surrogates) == 0;
  if (layout.expects != 0) {  // the characters that reach beyond the block are decoded with it
    layout.isGood = layout.isGood && IsUtf8Continuation(in[kBlock]) &&
                    ((layout.expects & 2) == 0 || IsUtf8Continuation(in[kBlock + 1])) &&
                    !(in[kBlock - 1] == 0xE0 && in[kBlock] < 0xA0) &&
                    !(full && in[kBlock - 1] == 0xED && in[kBlock] >= 0xA0);
  }
  return layout;
}

QXCORE_TARGET inline __m512i Widen(const unsigned char* at) {
  return _mm512_cvtepu8_epi16(_mm256_loadu_si256(reinterpret_cast<const __m256i*>(at)));
}

// Decodes half a block; returns the end of the output.
QXCORE_TARGET inline WCHAR* DecodeHalf(const unsigned char* in, std::uint32_t above, std::uint32_t three,
                                       std::uint32_t continuation, WCHAR* out) {
  const __m512i low6 = _mm512_set1_epi16(0x3F);
  const __m512i first = Widen(in);
  const __m512i second6 = _mm512_and_si512(Widen(in + 1), low6);
  constexpr int kAndOr = 0xEA;  // (a & b) | c
  constexpr int kOr = 0xFE;     // a | b | c
  const __m512i ofTwo =
      _mm512_ternarylogic_epi32(_mm512_slli_epi16(first, 6), _mm512_set1_epi16(0x7C0), second6, kAndOr);
  __m512i characters = _mm512_mask_mov_epi16(first, above, ofTwo);
  if (three != 0) {
    const __m512i third6 = _mm512_and_si512(Widen(in + 2), low6);
    const __m512i ofThree =
        _mm512_ternarylogic_epi32(_mm512_slli_epi16(first, 12), _mm512_slli_epi16(second6, 6), third6, kOr);
    characters = _mm512_mask_mov_epi16(characters, three, ofThree);
  }
  const std::uint32_t starts = ~continuation;
  _mm512_storeu_si512(out, _mm512_maskz_compress_epi16(starts, characters));
  return out + __builtin_popcount(starts);
}

}  // namespace

QXCORE_TARGET SUtf8Run SDecodeUtf8Avx512(const unsigned char* in, const unsigned char* end, WCHAR* out, bool full) {
  std::uint64_t expected = 0;  // continuation bytes that belong to the block before
  for (; end - in >= kReach; in += kBlock) {
    const __m512i bytes = _mm512_loadu_si512(in);
    const std::uint64_t above = _mm512_movepi8_mask(bytes);
    if (above == 0) {
      _mm512_storeu_si512(out, Widen(in));
      _mm512_storeu_si512(out + kHalf, Widen(in + kHalf));
      out += kBlock;
      continue;
    }
    const Layout layout = Check(in, bytes, above, expected, full);
    if (!layout.isGood) break;
    const auto lower = [](std::uint64_t mask) { return static_cast<std::uint32_t>(mask); };
    const auto upper = [](std::uint64_t mask) { return static_cast<std::uint32_t>(mask >> kHalf); };
    out = DecodeHalf(in, lower(above), lower(layout.three), lower(layout.continuation), out);
    out = DecodeHalf(in + kHalf, upper(above), upper(layout.three), upper(layout.continuation), out);
    expected = layout.expects;
  }
  // The last character of the block before may reach beyond it.
  return {in + __builtin_popcountll(expected), out};
}

#endif
