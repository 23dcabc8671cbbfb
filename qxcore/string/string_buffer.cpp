#include "qxcore/string/string_buffer.h"

#include <algorithm>
#include <functional>

#include "qxcore/core/exception.h"
#include "qxcore/platform/wide.h"
#include "qxcore/string/text_conversion.h"

SStringBuffer::SStringBuffer(unsigned capacity, unsigned numerator, unsigned denominator) {
  Reset(capacity, numerator, denominator);
}

SStringBuffer::SStringBuffer(const SString& text, unsigned capacity, unsigned numerator, unsigned denominator)
    : SStringBuffer(capacity, numerator, denominator) {
  *this += text;
}

void SStringBuffer::Reset(unsigned capacity, unsigned numerator, unsigned denominator) {
  m_text.Release();
  m_capacity = capacity != 0 ? capacity : unsigned{kDefaultCapacity};
  m_numerator = numerator != 0 ? numerator : unsigned{kDefaultNumerator};
  m_denominator = denominator != 0 ? denominator : unsigned{kDefaultDenominator};
  int grown = MulDiv(static_cast<int>(m_capacity), static_cast<int>(m_numerator), static_cast<int>(m_denominator));
  if (grown <= static_cast<int>(m_capacity)) {
    m_numerator = kDefaultNumerator;
    m_denominator = kDefaultDenominator;
  }
}

void SStringBuffer::Clear() {
  if (m_text.IsEmpty()) return;
  if (m_text.Data()->m_refs != 1) {
    m_text.Release();
    return;
  }
  // Emptied in place, so that the room stays.
  m_text.Data()->m_length = 0;
  *m_text.m_text = 0;
}

void SStringBuffer::Concat(const WCHAR* text, int n) {
  if (text == nullptr || n <= 0) return;
  Append(text, static_cast<std::ptrdiff_t>(platform::WideLength(text, static_cast<std::size_t>(n))));
}

// At least one character more each round, so that the capacity also grows where the ratio rounds to nothing.
static int Grown(int capacity, unsigned numerator, unsigned denominator) {
  int grown = MulDiv(capacity, static_cast<int>(numerator), static_cast<int>(denominator));
  return grown > capacity ? grown : grown < 0 ? 0x7FFFFFFF : capacity + 1;
}

void SStringBuffer::AppendGrown(const WCHAR* text, std::ptrdiff_t count) {
  int length = m_text.Length();
  if (count > 0x7FFFFFFF - length) throw SEOutOfMemory();
  const int n = static_cast<int>(count);
  bool isFirst = m_text.IsEmpty() && m_text.GetAllocLength() <= 1;
  int capacity = isFirst ? static_cast<int>(std::min(m_capacity, 0x7FFFFFFFu)) : m_text.GetAllocLength();
  while (capacity < length + n) capacity = Grown(capacity, m_numerator, m_denominator);

  if (m_text.Data()->m_refs == 1 && SString::IsLarge(m_text.Data())) return AppendResized(text, n, capacity);
  SString room(SString::Adopt{}, SString::AllocBuffer(capacity));
  std::copy_n(m_text.GetSafePointer(), length, room.m_text);
  std::copy_n(text, n, room.m_text + length);
  room.m_text[length + n] = 0;
  room.Data()->m_length = length + n;
  m_text.Swap(room);
}

// In the same buffer, made larger: the system moves a large one without copying it.
void SStringBuffer::AppendResized(const WCHAR* text, int n, int capacity) {
  const SStringView content = m_text.View();
  const bool isOwn = !std::less<>()(text, content.data()) && std::less<>()(text, content.data() + content.size());
  const std::ptrdiff_t from = isOwn ? text - content.data() : 0;
  m_text.GrowLarge(capacity);
  SString::AppendInPlace(m_text.Data(), n, isOwn ? m_text.m_text + from : text);
}

SStringBuffer& SStringBuffer::operator+=(char character) {
  return *this += SAnsiToString(&character, character != 0 ? 1 : 0);
}

SStringBuffer& SStringBuffer::operator=(const SString& text) {
  SString kept(text);  // may share this builder's buffer
  Clear();
  return *this += kept;
}

SStringBuffer& SStringBuffer::operator=(const WCHAR* text) {
  SString kept(text);  // may lie in this builder's buffer
  Clear();
  return *this += kept;
}

SString::SString(const SStringBuffer& buffer) : SString(buffer.View()) {}
SString& SString::operator=(const SStringBuffer& buffer) { return *this = SString(buffer); }
SString& SString::operator+=(const SStringBuffer& buffer) { return *this += SString(buffer); }

SString SStringBuffer::Detach() {
  SString content;
  if (m_text.IsEmpty()) {
    m_text.Release();
  } else if (m_text.Length() >= m_text.GetAllocLength() / 2) {
    content.Swap(m_text);
  } else {
    content = SString(m_text.View());
    m_text.Release();
  }
  return content;
}
