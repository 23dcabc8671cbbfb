#include "qxcore/stream/encoding/internal/utf8_blocks_avx2.h"

#ifdef QXCORE_HAS_UTF8_BLOCKS_AVX2

#include <immintrin.h>

#include <algorithm>
#include <cstddef>

#define QXCORE_TARGET __attribute__((target("avx2")))

namespace {

constexpr std::ptrdiff_t kHalf = 32;
constexpr std::ptrdiff_t kBlock = 2 * kHalf;

QXCORE_TARGET inline __m256i Of(int byte) { return _mm256_set1_epi8(static_cast<char>(byte)); }

QXCORE_TARGET inline __m256i Load(const unsigned char* at) {
  return _mm256_loadu_si256(reinterpret_cast<const __m256i*>(at));
}

// The bytes that stand kDistance before those of `bytes`, which follow `before`.
template <int kDistance>
QXCORE_TARGET inline __m256i Previous(__m256i bytes, __m256i before) {
  return _mm256_alignr_epi8(bytes, _mm256_permute2x128_si256(before, bytes, 0x21), 16 - kDistance);
}

// 0xFF for each continuation byte: as signed numbers those below 0xC0.
QXCORE_TARGET inline __m256i Continuations(__m256i bytes) { return _mm256_cmpgt_epi8(Of(0xC0), bytes); }

// Not 0 where a byte breaks the basic rules.
QXCORE_TARGET inline __m256i BasicErrors(__m256i bytes, __m256i before) {
  const __m256i second = _mm256_subs_epu8(Previous<1>(bytes, before), Of(0xBF));
  const __m256i third = _mm256_subs_epu8(Previous<2>(bytes, before), Of(0xDF));
  const __m256i isFree = _mm256_cmpeq_epi8(_mm256_or_si256(second, third), _mm256_setzero_si256());
  return _mm256_or_si256(_mm256_cmpeq_epi8(isFree, Continuations(bytes)), _mm256_subs_epu8(bytes, Of(0xEF)));
}

// By the full rules the two halves of the first byte and the upper half of the second tell each what may be wrong with
// the pair; it is wrong when all three agree. Keiser and Lemire, "Validating UTF-8 In Less Than One Instruction Per
// Byte", 2020, describe the method.
enum Error : unsigned char {
  kTooShort = 1,             // a lead byte, and no continuation
  kTooLong = 2,              // a plain byte, and a continuation
  kOverlongOf3 = 4,          // 0xE0, and below 0xA0
  kTooLarge = 8,             // above U+10FFFF, and not below U+11000 in the second byte
  kSurrogate = 16,           // 0xED, and from 0xA0 on
  kOverlongOf2 = 32,         // 0xC0 or 0xC1
  kTooLargeOrOverlong = 64,  // from 0xF5 on, or 0xF0, and below 0x90
  kTwoContinuations = 128    // right only where a sequence of three or four bytes wants it
};
constexpr int kAnyLow = kTooShort | kTooLong | kTwoContinuations;  // whatever the lower half of the first byte is

QXCORE_TARGET inline __m256i LookUp(__m256i halves, int a0, int a1, int a2, int a3, int a4, int a5, int a6, int a7,
                                    int a8, int a9, int aA, int aB, int aC, int aD, int aE, int aF) {
  const auto of = [](int value) { return static_cast<char>(value); };
  const __m128i table = _mm_setr_epi8(of(a0), of(a1), of(a2), of(a3), of(a4), of(a5), of(a6), of(a7), of(a8), of(a9),
                                      of(aA), of(aB), of(aC), of(aD), of(aE), of(aF));
  return _mm256_shuffle_epi8(_mm256_broadcastsi128_si256(table), halves);
}

QXCORE_TARGET inline __m256i UpperHalves(__m256i bytes) {
  return _mm256_and_si256(_mm256_srli_epi16(bytes, 4), Of(0x0F));
}

QXCORE_TARGET inline __m256i WrongPairs(__m256i first, __m256i second) {
  constexpr int kLong = kTooLong, kTwo = kTwoContinuations;
  const __m256i byFirstUpper = LookUp(UpperHalves(first), kLong, kLong, kLong, kLong, kLong, kLong, kLong, kLong,  //
                                      kTwo, kTwo, kTwo, kTwo,                                                      //
                                      kTooShort | kOverlongOf2, kTooShort, kTooShort | kOverlongOf3 | kSurrogate,
                                      kTooShort | kTooLarge | kTooLargeOrOverlong);
  constexpr int kFrom5 = kAnyLow | kTooLarge | kTooLargeOrOverlong;
  const __m256i byFirstLower =
      LookUp(_mm256_and_si256(first, Of(0x0F)), kAnyLow | kOverlongOf3 | kOverlongOf2 | kTooLargeOrOverlong,
             kAnyLow | kOverlongOf2, kAnyLow, kAnyLow, kAnyLow | kTooLarge, kFrom5, kFrom5, kFrom5, kFrom5, kFrom5,
             kFrom5, kFrom5, kFrom5, kFrom5 | kSurrogate, kFrom5, kFrom5);
  constexpr int kContinuation = kTooLong | kOverlongOf2 | kTwoContinuations;
  constexpr int kFromA0 = kContinuation | kSurrogate | kTooLarge;
  const __m256i bySecondUpper =
      LookUp(UpperHalves(second), kTooShort, kTooShort, kTooShort, kTooShort, kTooShort, kTooShort, kTooShort,
             kTooShort, kContinuation | kOverlongOf3 | kTooLargeOrOverlong, kContinuation | kOverlongOf3 | kTooLarge,
             kFromA0, kFromA0, kTooShort, kTooShort, kTooShort, kTooShort);
  return _mm256_and_si256(_mm256_and_si256(byFirstUpper, byFirstLower), bySecondUpper);
}

// Not 0 where a byte, with those before it, breaks the full rules.
QXCORE_TARGET inline __m256i FullErrors(__m256i bytes, __m256i before) {
  const __m256i third = _mm256_subs_epu8(Previous<2>(bytes, before), Of(0xE0 - 0x80));
  const __m256i fourth = _mm256_subs_epu8(Previous<3>(bytes, before), Of(0xF0 - 0x80));
  const __m256i isDue = _mm256_and_si256(_mm256_or_si256(third, fourth), Of(kTwoContinuations));
  return _mm256_xor_si256(isDue, WrongPairs(Previous<1>(bytes, before), bytes));
}

template <bool kFull>
QXCORE_TARGET inline __m256i Errors(__m256i bytes, __m256i before) {
  return kFull ? FullErrors(bytes, before) : BasicErrors(bytes, before);
}

// Counts in each of 32 columns; a column holds up to 255.
struct Columns {
  __m256i above, continuations, zeros;
};
constexpr int kBlocksPerColumns = 127;  // two bytes of each block in a column

QXCORE_TARGET inline void Count(Columns& columns, __m256i bytes) {
  const __m256i zero = _mm256_setzero_si256();
  columns.above = _mm256_sub_epi8(columns.above, _mm256_cmpgt_epi8(zero, bytes));
  columns.continuations = _mm256_sub_epi8(columns.continuations, Continuations(bytes));
  columns.zeros = _mm256_sub_epi8(columns.zeros, _mm256_cmpeq_epi8(bytes, zero));
}

QXCORE_TARGET inline std::int64_t Sum(__m256i columns) {
  alignas(32) std::int64_t parts[4];
  _mm256_store_si256(reinterpret_cast<__m256i*>(parts), _mm256_sad_epu8(columns, _mm256_setzero_si256()));
  return parts[0] + parts[1] + parts[2] + parts[3];
}

QXCORE_TARGET inline void AddTo(SUtf8BlockWalk& walk, const Columns& columns) {
  const __m256i even = _mm256_set1_epi16(0x00FF);
  const std::int64_t continuations = Sum(columns.continuations);
  walk.leads += Sum(columns.above) - continuations;
  walk.continuations += continuations;
  walk.zeros[0] += Sum(_mm256_and_si256(columns.zeros, even));
  walk.zeros[1] += Sum(_mm256_andnot_si256(even, columns.zeros));
}

// How many bytes the last sequence lacks at `stop`; looks back to `begin` at most.
int Lacking(const unsigned char* begin, const unsigned char* stop) {
  const std::ptrdiff_t length = std::min<std::ptrdiff_t>(stop - begin, 3);
  for (int distance = 1; distance <= length; ++distance) {
    const unsigned char byte = stop[-distance];
    const int follow = byte >= 0xF0 ? 3 : byte >= 0xE0 ? 2 : byte >= 0xC0 ? 1 : 0;
    if (follow >= distance) return follow - distance + 1;
  }
  return 0;
}

template <bool kFull>
QXCORE_TARGET SUtf8BlockWalk WalkBlocks(const unsigned char* begin, const unsigned char* end) {
  SUtf8BlockWalk walk;
  const unsigned char* at = begin;
  __m256i before = _mm256_setzero_si256();
  for (bool isSound = true; isSound && end - at > kBlock;) {
    Columns columns = {_mm256_setzero_si256(), _mm256_setzero_si256(), _mm256_setzero_si256()};
    const unsigned char* last = at + std::min((end - at - 1) / kBlock, std::ptrdiff_t{kBlocksPerColumns}) * kBlock;
    for (; at != last; at += kBlock) {
      const __m256i one = Load(at), two = Load(at + kHalf);
      const __m256i errors = _mm256_or_si256(Errors<kFull>(one, before), Errors<kFull>(two, one));
      isSound = _mm256_testz_si256(errors, errors) != 0;
      if (!isSound) break;
      Count(columns, one);
      Count(columns, two);
      before = two;
    }
    AddTo(walk, columns);
  }
  walk.stop = at;
  walk.expected = Lacking(begin, at);
  return walk;
}

}  // namespace

SUtf8BlockWalk SWalkUtf8BlocksAvx2(const unsigned char* at, const unsigned char* end, SUtf8BlockRules rules) {
  return rules == SUtf8BlockRules::kFull ? WalkBlocks<true>(at, end) : WalkBlocks<false>(at, end);
}

#endif
