// IsTextUnicode against the answers that Windows' side gives for a thousand random buffers, and against
// its documentation where Wine does not follow it (ASCII16 and illegal characters).

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

#include "qxcore/platform/win32.h"

namespace {

int Verdict(const std::vector<unsigned char>& bytes, int tests) {
  IsTextUnicode(bytes.data(), static_cast<int>(bytes.size()), &tests);
  return tests;
}

// The same numbers on every machine.
class Random {
 public:
  unsigned Below(unsigned limit) {
    m_state = m_state * 1664525u + 1013904223u;
    return (m_state >> 8) % limit;
  }

 private:
  std::uint32_t m_state = 12345;
};

std::vector<unsigned char> RandomBuffer(Random& random) {
  std::vector<unsigned char> bytes(1 + random.Below(random.Below(5) == 0 ? 1400 : 20));
  const unsigned high = 1u << random.Below(9), low = 1u << random.Below(9);
  for (std::size_t i = 0; i < bytes.size(); ++i)
    bytes[i] = static_cast<unsigned char>(random.Below(i % 2 == 0 ? low : high) + (random.Below(6) == 0 ? 0x20 : 0));
  return bytes;
}

TEST(TextUnicode, RandomBuffersGetTheSameAnswers) {
  const int tests = IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_CONTROLS | IS_TEXT_UNICODE_SIGNATURE | 0xF0 |
                    IS_TEXT_UNICODE_ODD_LENGTH | IS_TEXT_UNICODE_NULL_BYTES;
  Random random;
  std::uint32_t hash = 2166136261u;
  for (int round = 0; round < 3000; ++round) {
    const std::vector<unsigned char> bytes = RandomBuffer(random);
    const int verdict = Verdict(bytes, tests & ~IS_TEXT_UNICODE_REVERSE_ASCII16);
    hash = (hash ^ static_cast<unsigned>(verdict)) * 16777619u;
  }
  EXPECT_EQ(hash, 3842515007u);  // as Windows answers
}

#ifndef _WIN32
TEST(TextUnicode, DocumentedTestsThatWineLacks) {
  const int all = IS_TEXT_UNICODE_ASCII16 | IS_TEXT_UNICODE_REVERSE_ASCII16 | IS_TEXT_UNICODE_ILLEGAL_CHARS;
  EXPECT_EQ(Verdict({'H', 0, 'i', 0}, all), IS_TEXT_UNICODE_ASCII16);
  EXPECT_EQ(Verdict({0, 'H', 0, 'i'}, all), IS_TEXT_UNICODE_REVERSE_ASCII16);
  EXPECT_EQ(Verdict({'H', 0, 0xE9, 0}, all), 0);
  EXPECT_EQ(Verdict({'H', 0, 'i', 1}, all), 0);
  EXPECT_EQ(Verdict({'H', 'i', 'H', 'i'}, all), 0);
  std::vector<unsigned char> longText(20000);
  for (std::size_t i = 0; i < longText.size(); i += 2) longText[i] = 'x';
  EXPECT_EQ(Verdict(longText, all), IS_TEXT_UNICODE_ASCII16);
  longText[19999] = 0x4E;
  EXPECT_EQ(Verdict(longText, all), 0);
  for (std::size_t at = 2; at < 5000; at += 2) {  // wherever it stands
    std::vector<unsigned char> han(5000, 0x4E);
    EXPECT_EQ(Verdict(han, all), 0);
    han[at] = 0x0D, han[at + 1] = 0x0A;
    EXPECT_EQ(Verdict(han, all), IS_TEXT_UNICODE_ILLEGAL_CHARS);
    std::vector<unsigned char> ascii(5000, 0);
    for (std::size_t i = 1; i < 5000; i += 2) ascii[i] = 'x';
    EXPECT_EQ(Verdict(ascii, all), IS_TEXT_UNICODE_REVERSE_ASCII16);
    ascii[at] = 1;
    EXPECT_EQ(Verdict(ascii, all), 0);
  }
  EXPECT_EQ(Verdict({0x41, 0x4E, 0xFF, 0xFF}, all), IS_TEXT_UNICODE_ILLEGAL_CHARS);
  EXPECT_EQ(Verdict({0x41, 0x4E, 0xFE, 0xFF}, all), IS_TEXT_UNICODE_ILLEGAL_CHARS);
  EXPECT_EQ(Verdict({0x41, 0x4E, 0x0D, 0x0A}, all), IS_TEXT_UNICODE_ILLEGAL_CHARS);
}
#endif

TEST(TextUnicode, ResultTellsUnicode) {
  const std::basic_string<WCHAR> text = WTEXT("Hello, world");
  EXPECT_TRUE(IsTextUnicode(text.data(), 24, nullptr));
  EXPECT_FALSE(IsTextUnicode("Hello, world", 12, nullptr));
  int tests = IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_ODD_LENGTH;
  EXPECT_FALSE(IsTextUnicode(text.data(), 25, &tests));
  EXPECT_EQ(tests, IS_TEXT_UNICODE_STATISTICS | IS_TEXT_UNICODE_ODD_LENGTH);
}

}  // namespace
