// Room for a text whose greatest length is known before it is written: no check and no filling at each append.
#pragma once

#include <cstdint>
#include <cstdlib>
#include <cstring>
#include <new>
#include <string_view>
#include <utility>

namespace platform::rich {

class TextBuffer {
 public:
  TextBuffer() = default;
  TextBuffer(const TextBuffer&) = delete;
  TextBuffer& operator=(const TextBuffer&) = delete;
  TextBuffer(TextBuffer&& other) noexcept { Swap(other); }
  TextBuffer& operator=(TextBuffer&& other) noexcept { return Swap(other), *this; }
  ~TextBuffer() { std::free(m_text); }

  // Empties the buffer and makes room. Throws std::bad_alloc.
  void Reserve(std::size_t characters) {
    void* room = characters <= SIZE_MAX / sizeof(char16_t) ? std::malloc((characters + 1) * sizeof(char16_t)) : nullptr;
    if (room == nullptr) throw std::bad_alloc();
    std::free(m_text);
    m_text = static_cast<char16_t*>(room);
    m_length = 0;
  }
  // Gives back what is not used.
  void Shrink() {
    void* smaller = std::realloc(m_text, (m_length + 1) * sizeof(char16_t));
    if (smaller != nullptr) m_text = static_cast<char16_t*>(smaller);
  }

  void Add(char16_t unit) { m_text[m_length++] = unit; }
  void Add(const char16_t* text, std::size_t count) {
    std::memcpy(m_text + m_length, text, count * sizeof(char16_t));
    m_length += count;
  }
  // Bytes below 0x80.
  void Add(const unsigned char* text, std::size_t count) {
    char16_t* to = m_text + m_length;
    for (std::size_t i = 0; i < count; ++i) to[i] = text[i];
    m_length += count;
  }
  TextBuffer& operator+=(char16_t unit) { return Add(unit), *this; }
  void Cut(std::size_t length) { m_length = length; }

  std::size_t Length() const { return m_length; }
  std::u16string_view View() const { return {m_text, m_length}; }
  bool EndsWith(std::u16string_view end) const { return View().ends_with(end); }

 private:
  void Swap(TextBuffer& other) noexcept {
    std::swap(m_text, other.m_text);
    std::swap(m_length, other.m_length);
  }

  char16_t* m_text = nullptr;
  std::size_t m_length = 0;
};

}  // namespace platform::rich
