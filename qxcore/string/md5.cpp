#include "qxcore/string/md5.h"

#include <algorithm>
#include <bit>
#include <cstring>

namespace {

static_assert(std::endian::native == std::endian::little, "words are read from memory as they lie there");

constexpr std::size_t kBlockSize = 64;

std::uint32_t Word(const unsigned char* block, int i) {
  std::uint32_t word;
  std::memcpy(&word, block + i * 4, sizeof word);
  return word;
}

// The four functions of RFC 1321, 3.4. G is written as a sum of two terms that share no bit, so that
// the one which does not wait for b can be added early.
#define QXCORE_F(b, c, d) ((d) ^ ((b) & ((c) ^ (d))))
#define QXCORE_H(b, c, d) ((b) ^ (c) ^ (d))
#define QXCORE_I(b, c, d) ((c) ^ ((b) | ~(d)))
#define QXCORE_STEP(f, a, b, c, d, i, shift, constant)        \
  a += Word(block, i) + static_cast<std::uint32_t>(constant); \
  a += f(b, c, d);                                            \
  a = std::rotl(a, shift) + b;
#define QXCORE_STEP_G(a, b, c, d, i, shift, constant)         \
  a += Word(block, i) + static_cast<std::uint32_t>(constant); \
  a += ~(d) & (c);                                            \
  a += (d) & (b);                                             \
  a = std::rotl(a, shift) + b;
#define QXCORE_ROUND(f, i0, i1, i2, i3, s0, s1, s2, s3, k0, k1, k2, k3) \
  QXCORE_STEP(f, a, b, c, d, i0, s0, k0)                                \
  QXCORE_STEP(f, d, a, b, c, i1, s1, k1)                                \
  QXCORE_STEP(f, c, d, a, b, i2, s2, k2)                                \
  QXCORE_STEP(f, b, c, d, a, i3, s3, k3)
#define QXCORE_ROUND_G(i0, i1, i2, i3, k0, k1, k2, k3) \
  QXCORE_STEP_G(a, b, c, d, i0, 5, k0)                 \
  QXCORE_STEP_G(d, a, b, c, i1, 9, k1)                 \
  QXCORE_STEP_G(c, d, a, b, i2, 14, k2)                \
  QXCORE_STEP_G(b, c, d, a, i3, 20, k3)

void AddBlocks(std::uint32_t state[4], const unsigned char* block, std::size_t blocks) {
  std::uint32_t a = state[0], b = state[1], c = state[2], d = state[3];
  for (; blocks > 0; --blocks, block += kBlockSize) {
    const std::uint32_t a0 = a, b0 = b, c0 = c, d0 = d;
    QXCORE_ROUND(QXCORE_F, 0, 1, 2, 3, 7, 12, 17, 22, 0xd76aa478, 0xe8c7b756, 0x242070db, 0xc1bdceee)
    QXCORE_ROUND(QXCORE_F, 4, 5, 6, 7, 7, 12, 17, 22, 0xf57c0faf, 0x4787c62a, 0xa8304613, 0xfd469501)
    QXCORE_ROUND(QXCORE_F, 8, 9, 10, 11, 7, 12, 17, 22, 0x698098d8, 0x8b44f7af, 0xffff5bb1, 0x895cd7be)
    QXCORE_ROUND(QXCORE_F, 12, 13, 14, 15, 7, 12, 17, 22, 0x6b901122, 0xfd987193, 0xa679438e, 0x49b40821)
    QXCORE_ROUND_G(1, 6, 11, 0, 0xf61e2562, 0xc040b340, 0x265e5a51, 0xe9b6c7aa)
    QXCORE_ROUND_G(5, 10, 15, 4, 0xd62f105d, 0x02441453, 0xd8a1e681, 0xe7d3fbc8)
    QXCORE_ROUND_G(9, 14, 3, 8, 0x21e1cde6, 0xc33707d6, 0xf4d50d87, 0x455a14ed)
    QXCORE_ROUND_G(13, 2, 7, 12, 0xa9e3e905, 0xfcefa3f8, 0x676f02d9, 0x8d2a4c8a)
    QXCORE_ROUND(QXCORE_H, 5, 8, 11, 14, 4, 11, 16, 23, 0xfffa3942, 0x8771f681, 0x6d9d6122, 0xfde5380c)
    QXCORE_ROUND(QXCORE_H, 1, 4, 7, 10, 4, 11, 16, 23, 0xa4beea44, 0x4bdecfa9, 0xf6bb4b60, 0xbebfbc70)
    QXCORE_ROUND(QXCORE_H, 13, 0, 3, 6, 4, 11, 16, 23, 0x289b7ec6, 0xeaa127fa, 0xd4ef3085, 0x04881d05)
    QXCORE_ROUND(QXCORE_H, 9, 12, 15, 2, 4, 11, 16, 23, 0xd9d4d039, 0xe6db99e5, 0x1fa27cf8, 0xc4ac5665)
    QXCORE_ROUND(QXCORE_I, 0, 7, 14, 5, 6, 10, 15, 21, 0xf4292244, 0x432aff97, 0xab9423a7, 0xfc93a039)
    QXCORE_ROUND(QXCORE_I, 12, 3, 10, 1, 6, 10, 15, 21, 0x655b59c3, 0x8f0ccc92, 0xffeff47d, 0x85845dd1)
    QXCORE_ROUND(QXCORE_I, 8, 15, 6, 13, 6, 10, 15, 21, 0x6fa87e4f, 0xfe2ce6e0, 0xa3014314, 0x4e0811a1)
    QXCORE_ROUND(QXCORE_I, 4, 11, 2, 9, 6, 10, 15, 21, 0xf7537e82, 0xbd3af235, 0x2ad7d2bb, 0xeb86d391)
    a += a0, b += b0, c += c0, d += d0;
  }
  state[0] = a, state[1] = b, state[2] = c, state[3] = d;
}

}  // namespace

SMd5::SMd5() noexcept : m_state{0x67452301, 0xefcdab89, 0x98badcfe, 0x10325476} {}

void SMd5::Add(const void* bytes, std::size_t count) noexcept {
  if (count == 0) return;
  const unsigned char* at = static_cast<const unsigned char*>(bytes);
  std::size_t waiting = m_bytes % kBlockSize;
  m_bytes += count;
  if (waiting > 0) {
    std::size_t taken = std::min(count, kBlockSize - waiting);
    std::memcpy(m_block + waiting, at, taken);
    if (waiting + taken < kBlockSize) return;
    AddBlocks(m_state, m_block, 1);
    at += taken;
    count -= taken;
  }
  AddBlocks(m_state, at, count / kBlockSize);
  std::memcpy(m_block, at + count / kBlockSize * kBlockSize, count % kBlockSize);
}

void SMd5::Finish(unsigned char digest[16]) noexcept {
  static constexpr unsigned char kPadding[kBlockSize] = {0x80};
  std::uint64_t bits = m_bytes * 8;
  Add(kPadding, 1 + (kBlockSize + 55 - m_bytes % kBlockSize) % kBlockSize);
  Add(&bits, sizeof bits);
  std::memcpy(digest, m_state, 16);
}

SString MD5(const SString& text) {
  unsigned char digest[16];
  SMd5 md5;
  md5.Add(text.GetSafePointer(), static_cast<std::size_t>(text.LengthByte()));
  md5.Finish(digest);
  WCHAR digits[33];
  for (int i = 0; i < 16; ++i) {
    digits[2 * i] = WTEXT("0123456789abcdef")[digest[i] >> 4];
    digits[2 * i + 1] = WTEXT("0123456789abcdef")[digest[i] & 15];
  }
  digits[32] = 0;
  return SString(digits);
}
