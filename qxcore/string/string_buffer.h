// SStringBuffer: builds long texts by repeated appending, with room that grows by a ratio.
//
// The first append reserves 262,144 characters by default; for short texts, set a small
// capacity or use SString. Appending is amortised O(1). Not for use by two threads at once.
// An append may come from the buffer's own content. Failure throws SEOutOfMemory and changes nothing.
#pragma once

#include <cstddef>
#include <cstdint>

#include "qxcore/platform/export.h"
#include "qxcore/platform/win32.h"
#include "qxcore/string/string.h"

class QXCORE_API SStringBuffer {
 public:
  // In characters, and the ratio by which it grows.
  enum Defaults : unsigned { kDefaultCapacity = 0x40000, kDefaultNumerator = 5, kDefaultDenominator = 3 };

  // Capacity in characters and the ratio numerator / denominator by which it grows; 0 means the
  // default. The text, where given, is the first content.
  SStringBuffer() : SStringBuffer(0u, 0, 0) {}
  explicit SStringBuffer(unsigned capacity, unsigned numerator = 0, unsigned denominator = 0);
  explicit SStringBuffer(const SString& text, unsigned capacity = 0, unsigned numerator = 0, unsigned denominator = 0);

  // Releases the text and sets capacity and ratio; a ratio that would not grow the capacity becomes 5/3.
  void Reset(unsigned capacity = 0, unsigned numerator = 0, unsigned denominator = 0);
  // Empties the text; the settings and the room stay.
  void Clear();
  // Releases the text; the settings stay.
  void Done() { m_text.Release(); }

  // Appends at most n characters, stopping at a NUL.
  void Concat(const WCHAR* text, int n);
  // Appends what lies between two pointers, NULs included.
  void Concat(const WCHAR* begin, const WCHAR* end) { Append(begin, end - begin); }
  SStringBuffer& operator+=(const SString& text) {
    Append(text.GetSafePointer(), text.Length());
    return *this;
  }
  SStringBuffer& operator+=(const WCHAR* text) { return *this += SString::ViewOf(text); }
  SStringBuffer& operator+=(SStringView text) {
    Append(text.data(), static_cast<std::ptrdiff_t>(text.size()));
    return *this;
  }
  SStringBuffer& operator+=(WCHAR character) {
    Append(&character, 1);
    return *this;
  }
  SStringBuffer& operator+=(char character);  // converted with the ANSI code page
  SStringBuffer& operator+=(int) = delete;    // neither a number's digits nor a character
  SStringBuffer& operator=(const SString& text);
  SStringBuffer& operator=(const WCHAR* text);

  // The content in a buffer of its own size, not of the capacity.
  operator SString() const { return SString(m_text.View()); }
  // The content; the builder is left empty. Handed over without copying when it fills at least half of
  // its room, else copied to size.
  SString Detach();
  operator const WCHAR*() const { return m_text; }  // valid until the next change
  SStringView View() const { return m_text.View(); }
  bool IsEmpty() const { return m_text.IsEmpty(); }
  int Length() const { return m_text.Length(); }
  int GetCapacity() const { return m_text.GetAllocLength(); }
  unsigned GetNumerator() const { return m_numerator; }
  unsigned GetDenominator() const { return m_denominator; }

 private:
  void Append(const WCHAR* text, std::ptrdiff_t n) {
    SStringData* data = m_text.Data();
    if (n > 0 && n <= data->m_allocLength - data->m_length && data->m_refs == 1) [[likely]] {
      SString::AppendInPlace(data, static_cast<int>(n), text);
    } else if (n > 0) {
      AppendGrown(text, n);
    }
  }
  void AppendGrown(const WCHAR* text, std::ptrdiff_t n);
  void AppendResized(const WCHAR* text, int n, int capacity);

  SString m_text;  // its allocated length is the capacity
  std::uint32_t m_capacity;
  std::uint32_t m_numerator;
  std::uint32_t m_denominator;
};

static_assert(sizeof(void*) != 4 || sizeof(SStringBuffer) == 16, "the layout is public");
