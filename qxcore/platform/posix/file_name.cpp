#include "qxcore/platform/posix/file_name.h"

#include <array>

#include "qxcore/platform/internal/utf.h"

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

WCHAR* PutMapped(std::string_view bytes, WCHAR* at) {
  for (const char byte : bytes) *at++ = static_cast<WCHAR>(0xF000 + static_cast<unsigned char>(byte));
  return at;
}

// What is not plain: one byte that is mapped, or one UTF-8 sequence. Moves `from` behind it.
WCHAR* PutForeign(const unsigned char*& from, const unsigned char* end, WCHAR* at) {
  const Utf8Step step = StepUtf8(from, end);
  const bool isMapped = !step.isValid || step.length == 1 || (step.character >= 0xF000 && step.character <= 0xF0FF);
  const std::string_view bytes(reinterpret_cast<const char*>(from),
                               step.isValid ? static_cast<std::size_t>(step.length) : 1);
  from += bytes.size();
  return isMapped ? PutMapped(bytes, at) : PutUtf16(step.character, at);
}

}  // namespace

bool StandsForItself(char16_t c) { return c < 0x80 && kPlain[c]; }

void AppendName(std::string& bytes, std::u16string_view name) {
  for (const WCHAR *at = name.data(), *end = at + name.size(); at != end;) {
    const char32_t c = TakeUtf16(at, end);
    if (c >= 0xF000 && c <= 0xF0FF && IsMappedByte(c & 0xFF)) {
      bytes += static_cast<char>(c & 0xFF);
    } else {
      char sequence[4];
      bytes.append(sequence, PutUtf8(c, sequence));
    }
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
  const auto* from = reinterpret_cast<const unsigned char*>(name.data());
  for (const unsigned char* end = from + name.size(); from != end;) {
    if (kPlain[*from]) {
      *at++ = *from++;
    } else {
      at = PutForeign(from, end, at);
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
