#include "qxcore/stream/java_unicode_escape_filter_stream.h"

#include <algorithm>
#include <cstring>
#include <limits>
#include <utility>

#include "qxcore/core/exception.h"
#include "qxcore/string/widen.h"

QXCORE_IMPLEMENT_CLASS(SJavaUnicodeEscapeFilterStream, SInputStream, 0)

using Filter = SJavaUnicodeEscapeFilterStream;

namespace {

constexpr char kAlphabet[] = "0123456789ABCDEF";
constexpr int kDigits = 4;
constexpr unsigned long kEscapeLength = 2 + kDigits;

void PutDigits(unsigned character, char* digits) {
  for (int i = 0; i < kDigits; ++i) digits[i] = kAlphabet[character >> (12 - 4 * i) & 15];
}

// The value of a hexadecimal digit, or -1.
int DigitValue(int c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  return -1;
}

}  // namespace

Filter::~SJavaUnicodeEscapeFilterStream() {
  if (m_owns) delete m_in;
}

// --- escaping ---

// The next character of the inner stream, or -1.
int Filter::Take() {
  if (m_pending != nullptr) std::rethrow_exception(std::exchange(m_pending, nullptr));
  return m_at != m_end ? *m_at++ : m_in->Read();
}

// The same while an escape is being looked at, which must not get lost: a failure is told with the next read.
int Filter::TakeAhead() {
  try {
    return Take();
  } catch (...) {
    m_pending = std::current_exception();
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
  while (m_digitCount < kDigits && DigitValue(m_next) >= 0) {
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
    m_pending = std::current_exception();
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
  if (m_pending != nullptr) Take();  // throws
  m_at = characters;
  m_end = characters + m_in->ReadCharacters(characters, wanted);
  char* to = out;
  while (m_at != m_end) {
    const std::size_t plain = SNarrowASCII<WTEXT('\\')>(m_at, static_cast<std::size_t>(m_end - m_at), to);
    to += plain;
    m_at += plain;
    if (m_at == m_end) break;
    if (*m_at != '\\') {
      to[0] = '\\';
      to[1] = 'u';
      PutDigits(*m_at++, to + 2);
      to += kEscapeLength;
      continue;
    }
    // One by one, and perhaps with characters behind these, so that what waits may exceed the room.
    do {
      *to++ = static_cast<char>(Read());
    } while (HasPending() && static_cast<unsigned long>(to - out) < room);
  }
  m_at = m_end = nullptr;
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
  return static_cast<unsigned long>(m_letters + m_digitCount + (m_next != kNone)) + m_in->Available();
}

int Filter::IsEOF() { return !HasPending() && m_pending == nullptr && m_in->IsEOF(); }

void Filter::Close() {
  m_letters = m_digitCount = 0;
  m_next = kNone;
  m_pending = nullptr;
  m_in->Close();
}

// --- unescaping ---

namespace {

// What a backslash begins: its letters, and the value of four digits behind them, or -1.
struct Escape {
  const char* afterLetters;
  long letters;
  int value;
};

Escape LookAt(const char* backslash, const char* end) {
  const char* at = backslash + 1;
  while (at != end && *at == 'u') ++at;
  const long letters = static_cast<long>(at - backslash - 1);
  int value = -1;
  if (letters > 0 && end - at >= kDigits) {
    value = 0;
    for (int i = 0; i < kDigits && value >= 0; ++i) {
      const int digit = DigitValue(at[i]);
      value = digit < 0 ? -1 : value << 4 | digit;
    }
  }
  return {at, letters, value};
}

// Writes the text to `out`, which has room for as many characters as there are bytes; gives the end.
WCHAR* UnescapeTo(WCHAR* out, const char* at, const char* end) {
  auto copy = [&out](const char* from, const char* to) {
    const std::size_t size = static_cast<std::size_t>(to - from);
    SWidenBytes(reinterpret_cast<const unsigned char*>(from), size, out);
    out += size;
  };
  for (;;) {
    const void* found = at != end ? std::memchr(at, '\\', static_cast<std::size_t>(end - at)) : nullptr;
    if (found == nullptr) break;
    const char* backslash = static_cast<const char*>(found);
    copy(at, backslash);
    const Escape escape = LookAt(backslash, end);
    if (escape.letters == 1 && escape.value >= 0) {
      *out++ = static_cast<WCHAR>(escape.value);
      at = escape.afterLetters + kDigits;
    } else {
      *out++ = WTEXT('\\');
      at = backslash + (escape.value >= 0 ? 2 : 1);
    }
    if (escape.letters > 1) {  // the letters that stay need no second look
      copy(at, escape.afterLetters);
      at = escape.afterLetters;
    }
  }
  copy(at, end);
  return out;
}

}  // namespace

SString Filter::Unescape(const char* text, SString* copy) {
  return Unescape(text, text != nullptr ? text + std::strlen(text) : nullptr, copy);
}

SString Filter::Unescape(const char* begin, const char* end, SString* copy) {
  SString result;
  if (begin != nullptr && begin < end) {
    const char* last = static_cast<const char*>(std::memchr(begin, 0, static_cast<std::size_t>(end - begin)));
    if (last == nullptr) last = end;
    const std::ptrdiff_t size = last - begin;
    if (size > (std::numeric_limits<int>::max)() - 1) throw SEOutOfMemory();
    WCHAR* out = result.GetBufferSetLength(static_cast<int>(size));
    const std::ptrdiff_t length = UnescapeTo(out, begin, last) - out;
    result.Unlock(static_cast<int>(length));
    if (length < size / 2) result = SString(SStringView(result.View()));  // gives back what the escapes took
  }
  if (copy != nullptr) *copy = result;
  return result;
}
