// Judges UTF-8 in blocks of 64 bytes, with one bit for each byte.
#pragma once

#include <cstddef>
#include <cstdint>

// What a processor finds out about 64 bytes at once. The second group is looked at by the full rules only.
struct SUtf8Block {
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

// The walk from block to block: what the sequences that begin in one block expect of the next.
class SUtf8BlockWalk {
 public:
  // Whether all of the block is well-formed, as far as its sequences lie in it. The basic rules know sequences of
  // up to three bytes, whatever they mean. A block that is refused changes nothing.
  template <bool kFull>
  bool Accept(const SUtf8Block& block) {
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

// What the accepted blocks hold.
struct SUtf8BlockCounts {
  std::int64_t leads = 0;
  std::int64_t continuations = 0;
  std::int64_t zeros[2] = {0, 0};  // at even and at odd offsets from the first block
};

// Walks whole blocks as long as they are well-formed and more than one block is left; adds up what they hold.
// Returns where it stopped: at the end of a sequence, or within the one that `walk` says.
const unsigned char* SWalkUtf8Blocks(const unsigned char* at, const unsigned char* end, bool full, SUtf8BlockWalk& walk,
                                     SUtf8BlockCounts& counts);
