// UTF-8 by the standard, in and out of SString.

#include <climits>
#include <string>

#include "qxcore/core/exception.h"
#include "qxcore/platform/internal/utf.h"
#include "qxcore/platform/internal/widen.h"
#include "qxcore/string/string.h"

SString SString::FromUtf8(std::string_view text) {
  if (text.size() > static_cast<std::size_t>(INT_MAX)) throw SEOutOfMemory();
  SString result;
  if (text.empty()) return result;
  const auto* at = reinterpret_cast<const unsigned char*>(text.data());
  const auto* end = at + text.size();
  // No sequence has more units than bytes.
  WCHAR* const first = result.GetBufferSetLength(static_cast<int>(text.size()));
  WCHAR* out = first;
  for (;;) {
    const std::size_t plain = SWidenASCII(at, static_cast<std::size_t>(end - at), out);
    at += plain;
    out += plain;
    if (at == end) break;
    const platform::Utf8Step step = platform::StepUtf8(at, end);
    out = platform::PutUtf16(step.isValid ? step.character : platform::kReplacementCharacter, out);
    at += step.length;
  }
  result.Unlock(static_cast<int>(out - first));
  return result;
}

std::string SString::ToUtf8() const {
  const auto forEach = [this](auto use) {
    for (const WCHAR* unit = begin(); unit != end();) {
      const char32_t character = platform::TakeUtf16(unit, end());
      use(platform::IsSurrogate(character) ? char32_t{platform::kReplacementCharacter} : character);
    }
  };
  std::size_t size = 0;
  forEach([&size](char32_t character) { size += platform::Utf8Length(character); });
  std::string result(size, '\0');
  char* out = result.data();
  forEach([&out](char32_t character) { out = platform::PutUtf8(character, out); });
  return result;
}
