#include "qxcore/stream/encoding/internal/utf8_blocks.h"

#include "qxcore/platform/internal/processor.h"

#if defined(__x86_64__) || defined(__i386__)
#include <immintrin.h>
#endif

namespace {

// Without the processor's own instruction, which not every one has.
inline int CountBits(std::uint64_t bits) {
  bits -= bits >> 1 & 0x5555555555555555u;
  bits = (bits & 0x3333333333333333u) + (bits >> 2 & 0x3333333333333333u);
  bits = (bits + (bits >> 4)) & 0x0F0F0F0F0F0F0F0Fu;
  return static_cast<int>(bits * 0x0101010101010101u >> 56);
}

constexpr std::uint64_t kEven = 0x5555555555555555u;

#ifdef __SSE2__

template <bool kFull>
SUtf8Block Load(const unsigned char* at) {
  SUtf8Block block;
  const auto of = [](int byte) { return _mm_set1_epi8(static_cast<char>(byte)); };
  for (int part = 0; part < 4; ++part) {
    const __m128i bytes = _mm_loadu_si128(reinterpret_cast<const __m128i*>(at) + part);
    const auto put = [part](std::uint64_t& mask, __m128i found) {
      mask |= static_cast<std::uint64_t>(static_cast<unsigned>(_mm_movemask_epi8(found))) << (part * 16);
    };
    const auto atLeast = [&](int byte) { return _mm_cmpeq_epi8(_mm_max_epu8(bytes, of(byte)), bytes); };
    const auto atMost = [&](int byte) { return _mm_cmpeq_epi8(_mm_min_epu8(bytes, of(byte)), bytes); };
    put(block.above, bytes);
    put(block.zeros, _mm_cmpeq_epi8(bytes, _mm_setzero_si128()));
    put(block.continuation, _mm_cmplt_epi8(bytes, of(0xC0)));  // as signed numbers those below 0xC0
    put(block.fromE0, atLeast(0xE0));
    put(block.fromF0, atLeast(0xF0));
    if constexpr (kFull) {
      put(block.never, _mm_or_si128(_mm_cmpeq_epi8(_mm_and_si128(bytes, of(0xFE)), of(0xC0)), atLeast(0xF5)));
      put(block.isE0, _mm_cmpeq_epi8(bytes, of(0xE0)));
      put(block.isED, _mm_cmpeq_epi8(bytes, of(0xED)));
      put(block.isF0, _mm_cmpeq_epi8(bytes, of(0xF0)));
      put(block.isF4, _mm_cmpeq_epi8(bytes, of(0xF4)));
      put(block.below90, atMost(0x8F));
      put(block.belowA0, atMost(0x9F));
    }
  }
  return block;
}

template <bool kFull>
const unsigned char* WalkPlain(const unsigned char* at, const unsigned char* end, SUtf8BlockWalk& walk,
                               SUtf8BlockCounts& counts) {
  for (; end - at > SUtf8Block::kSize; at += SUtf8Block::kSize) {
    const SUtf8Block block = Load<kFull>(at);
    if (!walk.Accept<kFull>(block)) break;
    counts.leads += CountBits(block.above & ~block.continuation);
    counts.continuations += CountBits(block.continuation);
    if (block.zeros == 0) continue;
    counts.zeros[0] += CountBits(block.zeros & kEven);
    counts.zeros[1] += CountBits(block.zeros & ~kEven);
  }
  return at;
}

#endif

#if defined(__x86_64__) || defined(__i386__)
#define QXCORE_TARGET __attribute__((target("avx512f,avx512bw,avx512vl,popcnt,bmi,bmi2")))

template <bool kFull>
QXCORE_TARGET const unsigned char* WalkAvx512(const unsigned char* at, const unsigned char* end, SUtf8BlockWalk& walked,
                                              SUtf8BlockCounts& counted) {
  SUtf8BlockWalk walk = walked;
  SUtf8BlockCounts counts = counted;
  for (; end - at > SUtf8Block::kSize; at += SUtf8Block::kSize) {
    const __m512i bytes = _mm512_loadu_si512(at);
    SUtf8Block block;
    block.above = _mm512_movepi8_mask(bytes);
    block.zeros = _mm512_testn_epi8_mask(bytes, bytes);
    if (block.above != 0) {
      block.continuation = _mm512_cmplt_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xC0)));
      block.fromE0 = _mm512_cmpge_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xE0)));
      block.fromF0 = _mm512_cmpge_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xF0)));
      if constexpr (kFull) {
        block.never = _mm512_cmpge_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xF5))) |
                      _mm512_cmpeq_epi8_mask(_mm512_and_si512(bytes, _mm512_set1_epi8(static_cast<char>(0xFE))),
                                             _mm512_set1_epi8(static_cast<char>(0xC0)));
        block.isE0 = _mm512_cmpeq_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xE0)));
        block.isED = _mm512_cmpeq_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xED)));
        block.isF0 = _mm512_cmpeq_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xF0)));
        block.isF4 = _mm512_cmpeq_epi8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xF4)));
      }
    }
    if constexpr (kFull) {
      // Plain bytes count here, too: behind a lead byte they are refused as they are no continuation.
      block.below90 = _mm512_cmplt_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0x90)));
      block.belowA0 = _mm512_cmplt_epu8_mask(bytes, _mm512_set1_epi8(static_cast<char>(0xA0)));
    }
    if (!walk.Accept<kFull>(block)) break;
    counts.leads += __builtin_popcountll(block.above & ~block.continuation);
    counts.continuations += __builtin_popcountll(block.continuation);
    if (block.zeros == 0) continue;
    counts.zeros[0] += __builtin_popcountll(block.zeros & kEven);
    counts.zeros[1] += __builtin_popcountll(block.zeros & ~kEven);
  }
  walked = walk;
  counted = counts;
  return at;
}
#endif

}  // namespace

const unsigned char* SWalkUtf8Blocks(const unsigned char* at, const unsigned char* end, bool full, SUtf8BlockWalk& walk,
                                     SUtf8BlockCounts& counts) {
#if defined(__x86_64__) || defined(__i386__)
  static const bool usesAvx512 = platform::CanUse(platform::Instructions::kAvx512);
  if (usesAvx512) return full ? WalkAvx512<true>(at, end, walk, counts) : WalkAvx512<false>(at, end, walk, counts);
#endif
#ifdef __SSE2__
  return full ? WalkPlain<true>(at, end, walk, counts) : WalkPlain<false>(at, end, walk, counts);
#else
  (void)end, (void)full, (void)walk, (void)counts;
  return at;
#endif
}
