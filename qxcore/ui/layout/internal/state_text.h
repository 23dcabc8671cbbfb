// The text that keeps the state of a splitter or tab window: words and numbers with one space between.
#pragma once

#include "qxcore/string/string.h"

class SStateWriter {
 public:
  SStateWriter& Word(SStringView word) {
    if (m_text.Length() > 0) m_text += WTEXT(' ');
    m_text += word;
    return *this;
  }
  SStateWriter& Number(int number) {
    SString digits;
    digits.Format(WTEXT("%d"), number);
    return Word(digits);
  }
  const SString& Text() const { return m_text; }

 private:
  SString m_text;
};

// Reads it back. After the first failure everything fails.
class SStateReader {
 public:
  explicit SStateReader(SStringView text) : m_rest(text) {}

  SStateReader& Word(SStringView expected) {
    if (Next() != expected) m_isValid = false;
    return *this;
  }
  // A decimal number from 0 to `limit`.
  SStateReader& Number(int* number, int limit) {
    const SStringView digits = Next();
    long long value = 0;
    m_isValid = m_isValid && !digits.empty() && digits.size() <= 10;
    for (std::size_t i = 0; m_isValid && i < digits.size(); ++i) {
      m_isValid = digits[i] >= '0' && digits[i] <= '9';
      value = value * 10 + (digits[i] - '0');
    }
    m_isValid = m_isValid && value <= limit;
    if (m_isValid) *number = static_cast<int>(value);
    return *this;
  }
  bool IsValid() const { return m_isValid; }
  bool IsAtEnd() const { return m_isValid && m_rest.empty(); }

 private:
  SStringView Next() {
    const std::size_t end = m_rest.find(WTEXT(' '));
    const SStringView word = m_rest.substr(0, end);
    const bool isLast = end == SStringView::npos;
    m_rest = isLast ? SStringView() : m_rest.substr(end + 1);
    if (!isLast && m_rest.empty()) m_isValid = false;
    return word;
  }

  SStringView m_rest;
  bool m_isValid = true;
};
