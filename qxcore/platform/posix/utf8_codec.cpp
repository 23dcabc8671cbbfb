// UTF-8, strictly: shortest forms only, no surrogates, nothing above U+10FFFF.

#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/posix/code_page.h"
#include "qxcore/platform/posix/table_codec.h"

namespace platform {
Decoded DecodeUtf8(const char* bytes, std::size_t count, WCHAR* text, std::size_t capacity, bool stopAtInvalid) {
  const auto* data = reinterpret_cast<const std::uint8_t*>(bytes);
  std::size_t at = 0, length = 0;
  bool valid = true;
  const auto put = [&](unsigned c) {
    if (length < capacity) text[length] = static_cast<WCHAR>(c);
    ++length;
  };
  while (at < count) {
    const std::uint8_t lead = data[at];
    if (lead < 0x80) {
      const std::size_t run = AsciiPrefix(bytes + at, count - at);
      if (length < capacity) {
        const std::size_t room = run < capacity - length ? run : capacity - length;
        for (std::size_t i = 0; i < room; ++i) text[length + i] = data[at + i];
      }
      at += run;
      length += run;
      continue;
    }
    // The two common lengths, without further questions.
    if (lead >= 0xC2 && lead < 0xE0 && at + 1 < count && IsUtf8Continuation(data[at + 1])) {
      put(static_cast<unsigned>((lead & 0x1F) << 6 | (data[at + 1] & 0x3F)));
      at += 2;
      continue;
    }
    if (lead > 0xE0 && lead < 0xF0 && lead != 0xED && at + 2 < count && IsUtf8Continuation(data[at + 1]) &&
        IsUtf8Continuation(data[at + 2])) {
      put(static_cast<unsigned>((lead & 0x0F) << 12 | (data[at + 1] & 0x3F) << 6 | (data[at + 2] & 0x3F)));
      at += 3;
      continue;
    }
    const Utf8Step step = StepUtf8(data + at, data + count);
    if (!step.isValid && stopAtInvalid) return {length, false};
    valid = valid && step.isValid;
    WCHAR units[2];
    const WCHAR* end = PutUtf16(step.isValid ? step.character : char32_t{kReplacementCharacter}, units);
    for (const WCHAR* unit = units; unit != end; ++unit) put(*unit);
    at += static_cast<std::size_t>(step.length);
  }
  return {length, valid};
}

Decoded EncodeUtf8(const WCHAR* text, std::size_t count, char* bytes, std::size_t capacity) {
  std::size_t length = 0;
  bool valid = true;
  for (const WCHAR *at = text, *end = text + count; at != end;) {
    char32_t c = TakeUtf16(at, end);
    if (IsSurrogate(c)) {
      c = kReplacementCharacter;
      valid = false;
    }
    const std::size_t size = Utf8Length(c);
    if (length + size <= capacity) {
      PutUtf8(c, bytes + length);
    } else {
      capacity = 0;
    }
    length += size;
  }
  return {length, valid};
}

}  // namespace platform
