#include "qxcore/stream/encoding/internal/utf8_blocks.h"

#include <cstddef>

#include "qxcore/platform/internal/processor.h"
#include "qxcore/stream/encoding/internal/utf8_blocks_avx2.h"

#ifdef __SSE2__
#include <emmintrin.h>
#endif

namespace {

#ifdef __SSE2__

// What a processor finds out about 64 bytes at once, one bit for each. The second group is looked at by the full rules
// only.
struct Block {
  static constexpr std::ptrdiff_t kSize = 64;

  std::uint64_t zeros = 0;
  std::uint64_t above = 0;         // 0x80 and more
  std::uint64_t continuation = 0;  // 0x80 to 0xBF
  std::uint64_t fromE0 = 0;
  std::uint64_t fromF0 = 0;

  std::uint64_t never = 0;  // 0xC0, 0xC1 and from 0xF5 on
  std::uint64_t isE0 = 0, isED = 0, isF0 = 0, isF4 = 0;
  std::uint64_t below90 = 0, belowA0 = 0;
};

// What the sequences that begin in one block expect of the next.
class Judge {
 public:
  // Whether all of the block is well-formed, as far as its sequences lie in it. A block that is refused changes
  // nothing.
  template <bool kFull>
  bool Accept(const Block& block) {
    const std::uint64_t leads = block.above & ~block.continuation;
    std::uint64_t due = m_expected | leads << 1 | block.fromE0 << 2;
    if constexpr (kFull) {
      due |= block.fromF0 << 3;
      // The range of the second byte rules out overlong forms, surrogates and values above U+10FFFF.
      const std::uint64_t wrong =
          ((block.isE0 << 1 | m_afterE0) & block.belowA0) | ((block.isED << 1 | m_afterED) & ~block.belowA0) |
          ((block.isF0 << 1 | m_afterF0) & block.below90) | ((block.isF4 << 1 | m_afterF4) & ~block.below90);
      if ((block.never | wrong) != 0) return false;
    } else if (block.fromF0 != 0) {
      return false;
    }
    if (due != block.continuation) return false;
    m_expected = leads >> 63 | block.fromE0 >> 62;
    if constexpr (kFull) {
      m_expected |= block.fromF0 >> 61;
      m_afterE0 = block.isE0 >> 63;
      m_afterED = block.isED >> 63;
      m_afterF0 = block.isF0 >> 63;
      m_afterF4 = block.isF4 >> 63;
    }
    return true;
  }

  // How many continuation bytes the last block expects at the start of the next one.
  int Expected() const { return m_expected == 0 ? 0 : m_expected == 1 ? 1 : m_expected <= 3 ? 2 : 3; }

 private:
  std::uint64_t m_expected = 0;
  std::uint64_t m_afterE0 = 0, m_afterED = 0, m_afterF0 = 0, m_afterF4 = 0;
};

// Without the processor's own instruction, which not every one has.
int CountBits(std::uint64_t bits) {
  bits -= bits >> 1 & 0x5555555555555555u;
  bits = (bits & 0x3333333333333333u) + (bits >> 2 & 0x3333333333333333u);
  bits = (bits + (bits >> 4)) & 0x0F0F0F0F0F0F0F0Fu;
  return static_cast<int>(bits * 0x0101010101010101u >> 56);
}

template <bool kFull>
Block Load(const unsigned char* at) {
  Block block;
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
SUtf8BlockWalk WalkPlain(const unsigned char* at, const unsigned char* end) {
  constexpr std::uint64_t kEven = 0x5555555555555555u;
  SUtf8BlockWalk walk;
  Judge judge;
  for (; end - at > Block::kSize; at += Block::kSize) {
    const Block block = Load<kFull>(at);
    if (!judge.Accept<kFull>(block)) break;
    walk.leads += CountBits(block.above & ~block.continuation);
    walk.continuations += CountBits(block.continuation);
    if (block.zeros == 0) continue;
    walk.zeros[0] += CountBits(block.zeros & kEven);
    walk.zeros[1] += CountBits(block.zeros & ~kEven);
  }
  walk.stop = at;
  walk.expected = judge.Expected();
  return walk;
}

#else

template <bool>
SUtf8BlockWalk WalkPlain(const unsigned char* at, const unsigned char*) {
  return {.stop = at};
}

#endif

}  // namespace

SUtf8BlockWalk SWalkUtf8Blocks(const unsigned char* at, const unsigned char* end, SUtf8BlockRules rules) {
#ifdef QXCORE_HAS_UTF8_BLOCKS_AVX2
  static const bool usesAvx2 = platform::CanUse(platform::Instructions::kAvx2);
  if (usesAvx2) return SWalkUtf8BlocksAvx2(at, end, rules);
#endif
  return rules == SUtf8BlockRules::kFull ? WalkPlain<true>(at, end) : WalkPlain<false>(at, end);
}
