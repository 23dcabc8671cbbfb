// What the tests of texts share.
#pragma once

#include <gtest/gtest.h>

#include <random>
#include <string>

#include "qxcore/string/string.h"

// Failed comparisons show the text readably.
inline void PrintTo(const SString& text, std::ostream* out) {
  *out << '"';
  for (WCHAR c : text) {
    if (c >= 0x20 && c < 0x7F) {
      *out << static_cast<char>(c);
    } else {
      static const char* kDigits = "0123456789abcdef";
      *out << "\\u" << kDigits[c >> 12] << kDigits[c >> 8 & 15] << kDigits[c >> 4 & 15] << kDigits[c & 15];
    }
  }
  *out << '"';
}

using WideString = std::basic_string<WCHAR>;

// Random texts over a small alphabet, so that matches and repetitions are frequent.
class RandomText {
 public:
  explicit RandomText(unsigned seed) : m_random(seed) {}
  int Number(int below) { return static_cast<int>(m_random() % static_cast<unsigned>(below)); }
  WideString Make(int maxLength, SStringView alphabet) {
    WideString text;
    for (int length = Number(maxLength + 1); length > 0; --length) {
      text += alphabet[static_cast<std::size_t>(Number(static_cast<int>(alphabet.size())))];
    }
    return text;
  }

 private:
  std::mt19937 m_random;
};
