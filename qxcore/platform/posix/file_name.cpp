#include "qxcore/platform/posix/file_name.h"

#include <algorithm>
#include <array>

namespace platform {
namespace {

// Windows allows these bytes in no name; the slash cannot stand in one here either.
constexpr bool IsForbidden(unsigned byte) {
  return (byte > 0 && byte < 0x20) || byte == '"' || byte == '*' || byte == ':' || byte == '<' || byte == '>' ||
         byte == '?' || byte == '|' || byte == '\\';
}

// A byte that stands mapped in a Windows name.
bool IsMappedByte(unsigned byte) { return byte >= 0x80 || IsForbidden(byte); }

// The bytes that stand for themselves in both kinds of names.
constexpr std::array<bool, 256> kPlain = [] {
  std::array<bool, 256> plain{};
  for (unsigned byte = 0; byte < 0x80; ++byte) plain[byte] = !IsForbidden(byte);
  return plain;
}();

// Length of the valid UTF-8 sequence at the start, 0 for none.
std::size_t Utf8Length(std::string_view text) {
  const auto byte = [&](std::size_t i) { return i < text.size() ? static_cast<unsigned char>(text[i]) : 0u; };
  const auto trail = [&](std::size_t i) { return (byte(i) & 0xC0) == 0x80; };
  const unsigned lead = byte(0);
  if (lead < 0x80) return 1;
  if (lead >= 0xC2 && lead <= 0xDF) return trail(1) ? 2 : 0;
  if (lead >= 0xE0 && lead <= 0xEF) {
    if (!trail(1) || !trail(2) || (lead == 0xE0 && byte(1) < 0xA0) || (lead == 0xED && byte(1) > 0x9F)) return 0;
    return 3;
  }
  if (lead >= 0xF0 && lead <= 0xF4) {
    if (!trail(1) || !trail(2) || !trail(3) || (lead == 0xF0 && byte(1) < 0x90) || (lead == 0xF4 && byte(1) > 0x8F))
      return 0;
    return 4;
  }
  return 0;
}

void AppendUtf8(std::string& name, char32_t c) {
  if (c < 0x80) {
    name += static_cast<char>(c);
  } else if (c < 0x800) {
    name += static_cast<char>(0xC0 | c >> 6);
    name += static_cast<char>(0x80 | (c & 0x3F));
  } else if (c < 0x10000) {
    name += static_cast<char>(0xE0 | c >> 12);
    name += static_cast<char>(0x80 | (c >> 6 & 0x3F));
    name += static_cast<char>(0x80 | (c & 0x3F));
  } else {
    name += static_cast<char>(0xF0 | c >> 18);
    name += static_cast<char>(0x80 | (c >> 12 & 0x3F));
    name += static_cast<char>(0x80 | (c >> 6 & 0x3F));
    name += static_cast<char>(0x80 | (c & 0x3F));
  }
}

WCHAR* PutMapped(std::string_view bytes, WCHAR* at) {
  for (const char byte : bytes) *at++ = static_cast<WCHAR>(0xF000 + static_cast<unsigned char>(byte));
  return at;
}

// What is not plain: one byte that is mapped, or one UTF-8 sequence.
WCHAR* PutForeign(std::string_view sequence, WCHAR* at) {
  if (sequence.size() == 1) return PutMapped(sequence, at);
  char32_t c = static_cast<unsigned char>(sequence[0]) & (0x7Fu >> sequence.size());
  for (const char trail : sequence.substr(1)) c = c << 6 | (static_cast<unsigned char>(trail) & 0x3F);
  if (c >= 0xF000 && c <= 0xF0FF) return PutMapped(sequence, at);
  if (c >= 0x10000) {
    *at++ = static_cast<WCHAR>(0xD7C0 + (c >> 10));
    c = 0xDC00 + (c & 0x3FF);
  }
  *at++ = static_cast<WCHAR>(c);
  return at;
}

}  // namespace

bool StandsForItself(char16_t c) { return c < 0x80 && kPlain[c]; }

void AppendName(std::string& bytes, std::u16string_view name) {
  for (std::size_t i = 0; i < name.size(); ++i) {
    char32_t c = name[i];
    if (c >= 0xF000 && c <= 0xF0FF && IsMappedByte(c & 0xFF)) {
      bytes += static_cast<char>(c & 0xFF);
      continue;
    }
    if (c >= 0xD800 && c < 0xDC00 && i + 1 < name.size() && name[i + 1] >= 0xDC00 && name[i + 1] <= 0xDFFF)
      c = 0x10000 + ((c - 0xD800) << 10) + (name[++i] - 0xDC00u);
    AppendUtf8(bytes, c);
  }
}

std::string ToFileSystemName(std::u16string_view name) {
  std::string result;
  result.reserve(name.size());
  AppendName(result, name);
  return result;
}

std::size_t ToWindowsName(std::string_view name, WCHAR* buffer) {
  WCHAR* at = buffer;
  for (std::size_t i = 0; i < name.size();) {
    const unsigned lead = static_cast<unsigned char>(name[i]);
    if (kPlain[lead]) {
      *at++ = static_cast<WCHAR>(lead);
      ++i;
    } else {
      const std::size_t size = std::max<std::size_t>(Utf8Length(name.substr(i)), 1);
      at = PutForeign(name.substr(i, size), at);
      i += size;
    }
  }
  return static_cast<std::size_t>(at - buffer);
}

std::u16string ToWindowsName(std::string_view name) {
  std::u16string result(name.size(), u'\0');
  result.resize(ToWindowsName(name, result.data()));
  return result;
}

}  // namespace platform
