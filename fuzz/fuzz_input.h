// The bytes of one fuzz input, taken apart from the front; past their end everything is zero.
#pragma once

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <string>
#include <string_view>
#include <utility>

#include "qxcore/platform/win32.h"

// Ends the run with the place, when something that has to hold does not.
#define FUZZ_CHECK(condition)                                                             \
  do {                                                                                    \
    if (!(condition)) {                                                                   \
      std::fprintf(stderr, "%s:%d: does not hold: %s\n", __FILE__, __LINE__, #condition); \
      std::abort();                                                                       \
    }                                                                                     \
  } while (false)

class FuzzInput {
 public:
  FuzzInput(const std::uint8_t* data, std::size_t size) : m_rest(reinterpret_cast<const char*>(data), size) {}

  std::uint8_t Byte() {
    if (m_rest.empty()) return 0;
    auto byte = static_cast<std::uint8_t>(m_rest.front());
    m_rest.remove_prefix(1);
    return byte;
  }
  template <class T>
  T Number() {
    T number = 0;
    std::memcpy(&number, m_rest.data(), m_rest.size() < sizeof number ? m_rest.size() : sizeof number);
    m_rest.remove_prefix(m_rest.size() < sizeof number ? m_rest.size() : sizeof number);
    return number;
  }
  // What is left, or what lies before the next `separator` bytes.
  std::string_view Rest() { return std::exchange(m_rest, {}); }
  std::string_view Part(std::string_view separator) {
    std::size_t end = m_rest.find(separator);
    std::string_view part = m_rest.substr(0, end);
    m_rest.remove_prefix(end == std::string_view::npos ? m_rest.size() : end + separator.size());
    return part;
  }

 private:
  std::string_view m_rest;
};

// Text of characters: a byte below 0x80 is one; a higher one begins a character of two bytes. So most
// inputs are readable, and every character can occur. NULs are left out.
inline std::basic_string<WCHAR> ToText(std::string_view bytes) {
  std::basic_string<WCHAR> text;
  for (std::size_t i = 0; i < bytes.size(); ++i) {
    auto unit = static_cast<std::uint8_t>(bytes[i]);
    auto character = static_cast<WCHAR>(unit);
    if (unit >= 0x80 && i + 1 < bytes.size()) {
      character = static_cast<WCHAR>(unit << 8 | static_cast<std::uint8_t>(bytes[++i]));
    }
    if (character != 0) text += character;
  }
  return text;
}
