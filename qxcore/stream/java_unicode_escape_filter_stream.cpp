#include "qxcore/stream/java_unicode_escape_filter_stream.h"

#include <algorithm>
#include <array>
#include <cstdint>
#include <cstring>
#include <limits>
#include <utility>

#include "qxcore/core/exception.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/stream/internal/add_clipped.h"

QXCORE_IMPLEMENT_CLASS(SJavaUnicodeEscapeFilterStream, SInputStream, 0)

using Filter = SJavaUnicodeEscapeFilterStream;

namespace {

constexpr int kDigits = 4;
constexpr unsigned long kEscapeLength = 2 + kDigits;

// Two digits for each byte.
constexpr auto kPairs = [] {
  std::array<std::array<char, 2>, 256> pairs{};
  for (unsigned i = 0; i < 256; ++i) pairs[i] = {"0123456789ABCDEF"[i >> 4], "0123456789ABCDEF"[i & 15]};
  return pairs;
}();

void PutDigits(unsigned character, char* digits) {
  std::memcpy(digits, kPairs[character >> 8].data(), 2);
  std::memcpy(digits + 2, kPairs[character & 0xFF].data(), 2);
}

// Values of the hexadecimal digits by character; 16 for others.
constexpr auto kDigitValues = [] {
  std::array<unsigned char, 256> values{};
  for (unsigned char& value : values) value = 16;
  for (unsigned char i = 0; i < 10; ++i) values['0' + i] = i;
  for (unsigned char i = 0; i < 6; ++i) values['A' + i] = values['a' + i] = static_cast<unsigned char>(10 + i);
  return values;
}();

// The value of a hexadecimal digit, or 16; of four of them, or more than 0xFFFF.
unsigned DigitValue(int c) { return c >= 0 && c < 256 ? kDigitValues[static_cast<unsigned>(c)] : 16; }
unsigned ValueOf(const char* digits) {
  const auto* at = reinterpret_cast<const unsigned char*>(digits);
  const unsigned a = kDigitValues[at[0]], b = kDigitValues[at[1]], c = kDigitValues[at[2]], d = kDigitValues[at[3]];
  return (a | b | c | d) < 16 ? a << 12 | b << 8 | c << 4 | d : 0x10000;
}

}  // namespace

Filter::~SJavaUnicodeEscapeFilterStream() = default;

// --- escaping ---

// The next character of the inner stream, or -1.
int Filter::Take() {
  m_failure.Throw();
  return m_at != m_end ? *m_at++ : m_in->Read();
}

// The same while an escape is being looked at, which must not get lost: a failure is thrown by the next read.
int Filter::TakeAhead() {
  try {
    return Take();
  } catch (...) {
    m_failure.Keep();
    return kNone;
  }
}

int Filter::Read() {
  if (m_letters > 0) {
    --m_letters;
    return 'u';
  }
  if (m_digitCount > 0) {
    const char digit = m_digits[0];
    std::memmove(m_digits, m_digits + 1, sizeof m_digits - 1);
    --m_digitCount;
    return digit;
  }
  const int character = m_next != kNone ? std::exchange(m_next, kNone) : Take();
  if (character == '\\') return EscapeBackslash();
  if (character < 128) return character;  // the end, too
  PutDigits(static_cast<unsigned>(character), m_digits);
  m_letters = 1;
  m_digitCount = kDigits;
  return '\\';
}

// Behind a backslash: what looks like an escape gets one more letter.
int Filter::EscapeBackslash() {
  m_next = TakeAhead();
  for (; m_next == 'u'; m_next = TakeAhead()) ++m_letters;
  if (m_letters == 0) return '\\';
  while (m_digitCount < kDigits && DigitValue(m_next) < 16) {
    m_digits[m_digitCount++] = static_cast<char>(m_next);
    m_next = m_digitCount < kDigits ? TakeAhead() : kNone;
  }
  if (m_digitCount == kDigits) ++m_letters;
  return '\\';
}

unsigned long Filter::Read(void* buffer, unsigned long count) {
  char* out = static_cast<char*>(buffer);
  unsigned long done = 0;
  try {
    while (done < count) {
      const unsigned long got = ReadBlock(out + done, count - done);
      if (got == 0) break;
      done += got;
    }
  } catch (...) {
    if (done == 0) throw;
    m_failure.Keep();
  }
  return done;
}

// Something of what is wanted; 0 at the end.
unsigned long Filter::ReadBlock(char* out, unsigned long count) {
  if (!HasPending() && count >= 2 * kEscapeLength) return ReadRun(out, count);
  const int character = Read();
  if (character < 0) return 0;
  *out = static_cast<char>(character);
  return 1;
}

// Takes as many characters as have room even if all of them need escapes, and escapes them.
unsigned long Filter::ReadRun(char* out, unsigned long room) {
  WCHAR characters[2048];
  const unsigned long wanted = (std::min)(room / kEscapeLength, static_cast<unsigned long>(std::size(characters)));
  m_failure.Throw();
  const WCHAR* at = characters;
  const WCHAR* end = characters + m_in->ReadCharacters(characters, wanted);
  char* to = out;
  while (at != end) {
    const std::size_t plain = SNarrowASCII<WTEXT('\\')>(at, static_cast<std::size_t>(end - at), to);
    to += plain;
    at += plain;
    for (; at != end && *at >= 128; ++at, to += kEscapeLength) {
      std::memcpy(to, "\\u", 2);
      PutDigits(*at, to + 2);
    }
    if (at == end || *at != '\\') continue;
    // One by one, and perhaps with characters behind these, so that what waits may exceed the room.
    m_at = at;
    m_end = end;
    do {
      *to++ = static_cast<char>(Read());
    } while (HasPending() && static_cast<unsigned long>(to - out) < room);
    at = std::exchange(m_at, nullptr);
    m_end = nullptr;
  }
  return static_cast<unsigned long>(to - out);
}

unsigned long Filter::Skip(unsigned long count) {
  unsigned long done = 0;
  while (done < count) {
    char passed[1024];
    const unsigned long wanted = (std::min)(count - done, static_cast<unsigned long>(sizeof passed));
    const unsigned long got = Read(passed, wanted);
    done += got;
    if (got < wanted) break;
  }
  return done;
}

unsigned long Filter::Available() {
  return SAddClipped(static_cast<unsigned long>(m_letters + m_digitCount + (m_next != kNone)), m_in->Available());
}

int Filter::IsEOF() { return !HasPending() && !m_failure.IsThere() && m_in->IsEOF(); }

void Filter::Close() {
  m_letters = m_digitCount = 0;
  m_next = kNone;
  m_failure.Forget();
  m_in->Close();
}

// --- unescaping ---

namespace {

// Copies what begins with a backslash but is no plain escape; `at` is moved behind it. Returns the end.
WCHAR* CopyBackslash(WCHAR* out, const char*& at, const char* end) {
  const char* afterLetters = at + 1;
  while (afterLetters != end && *afterLetters == 'u') ++afterLetters;
  const bool isMarked = afterLetters - at > 2 && end - afterLetters >= kDigits && ValueOf(afterLetters) <= 0xFFFF;
  *out++ = WTEXT('\\');
  for (at += isMarked ? 2 : 1; at < afterLetters; ++at) *out++ = WTEXT('u');  // these need no second look
  return out;
}

// Writes the text up to its NUL to `out`, which has room for as many characters as there are bytes; returns the end.
WCHAR* UnescapeTo(WCHAR* out, const char* at, const char* end) {
  constexpr std::ptrdiff_t kLength = kEscapeLength;
  for (;;) {
    const std::size_t plain = SWidenUntil<SStopAtBackslashAndNUL>(reinterpret_cast<const unsigned char*>(at),
                                                                  static_cast<std::size_t>(end - at), out);
    out += plain;
    at += plain;
    if (at == end || *at == 0) return out;
    do {
      const unsigned value = end - at >= kLength && at[1] == 'u' ? ValueOf(at + 2) : 0x10000;
      if (value > 0xFFFF) {
        out = CopyBackslash(out, at, end);
        break;
      }
      *out++ = static_cast<WCHAR>(value);
      at += kLength;
    } while (at != end && *at == '\\');
  }
}

}  // namespace

SString Filter::Unescape(const char* text, SString* copy) {
  return Unescape(text, text != nullptr ? text + std::strlen(text) : nullptr, copy);
}

SString Filter::Unescape(const char* begin, const char* end, SString* copy) {
  SString result;
  if (begin != nullptr && begin < end) {
    const std::ptrdiff_t size = end - begin;
    if (size > (std::numeric_limits<int>::max)() - 1) throw SEOutOfMemory();
    WCHAR* out = result.GetBufferSetLength(static_cast<int>(size));
    const std::ptrdiff_t length = UnescapeTo(out, begin, end) - out;
    result.Unlock(static_cast<int>(length));
    if (length < size / 2) result = SString(result.View());  // frees what the escapes took
  }
  if (copy != nullptr) *copy = result;
  return result;
}
