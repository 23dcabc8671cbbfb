// UTF-7 (RFC 2152), as the platform's conversions have it: a byte outside a shifted run is a character, whatever its
// value; only the characters of set D, blanks, tabs, line ends and NUL are written unshifted; every run is closed.

#include <array>

#include "qxcore/platform/posix/code_page.h"

namespace platform {
namespace {

constexpr std::string_view kDigits = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";

// The value of each base-64 digit; 64 for other bytes.
constexpr std::array<std::uint8_t, 256> kValues = [] {
  std::array<std::uint8_t, 256> values{};
  values.fill(64);
  for (std::size_t i = 0; i < kDigits.size(); ++i)
    values[static_cast<std::uint8_t>(kDigits[i])] = static_cast<std::uint8_t>(i);
  return values;
}();

constexpr bool IsDirect(char16_t c) {
  constexpr std::string_view kOthers = " \t\r\n'(),-./:?";
  if (c == 0) return true;
  if ((c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9')) return true;
  return c < 0x80 && kOthers.find(static_cast<char>(c)) != std::string_view::npos;
}

// Counts all units and keeps those that fit.
template <class Unit>
class Output {
 public:
  Output(Unit* to, std::size_t capacity) : m_to(to), m_capacity(capacity) {}
  void Put(unsigned unit) {
    if (m_length < m_capacity) m_to[m_length] = static_cast<Unit>(unit);
    ++m_length;
  }
  std::size_t Length() const { return m_length; }

 private:
  Unit* m_to;
  std::size_t m_capacity, m_length = 0;
};

// The bits of a shifted run, from either side.
struct Bits {
  std::uint32_t value = 0;
  int count = 0;

  void Add(std::uint32_t bits, int number) {
    value = value << number | bits;
    count += number;
  }
  // The oldest ones.
  std::uint32_t Take(int number) {
    count -= number;
    return value >> count & ((1u << number) - 1);
  }
};

}  // namespace

Decoded DecodeUtf7(const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity) {
  Output<WCHAR> out(text, capacity);
  for (std::size_t at = 0; at < count; ++at) {
    if (bytes[at] != '+') {
      out.Put(static_cast<std::uint8_t>(bytes[at]));
      continue;
    }
    if (at + 1 < count && bytes[at + 1] == '-') {
      out.Put('+');
      ++at;
      continue;
    }
    Bits bits;
    while (at + 1 < count && kValues[static_cast<std::uint8_t>(bytes[at + 1])] < 64) {
      bits.Add(kValues[static_cast<std::uint8_t>(bytes[++at])], 6);
      if (bits.count >= 16) out.Put(bits.Take(16));
    }
    if (at + 1 < count && bytes[at + 1] == '-') ++at;  // which closes the run and is no character
  }
  return {out.Length(), true};
}

Decoded EncodeUtf7(const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity) {
  Output<char> out(bytes, capacity);
  const auto put = [&out](char c) { out.Put(static_cast<std::uint8_t>(c)); };
  for (std::size_t at = 0; at < count; ++at) {
    if (IsDirect(text[at])) {
      put(static_cast<char>(text[at]));
      continue;
    }
    put('+');
    if (text[at] != '+') {
      Bits bits;
      for (; at < count && text[at] != '+' && !IsDirect(text[at]); ++at) {
        bits.Add(text[at], 16);
        while (bits.count >= 6) put(kDigits[bits.Take(6)]);
      }
      --at;
      if (bits.count > 0) {
        bits.Add(0, 6 - bits.count);
        put(kDigits[bits.Take(6)]);
      }
    }
    put('-');
  }
  return {out.Length(), true};
}

}  // namespace platform
