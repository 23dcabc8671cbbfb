#include "qxcore/platform/internal/native_path.h"

#include "qxcore/platform/internal/utf.h"

namespace platform {

std::wstring FromNativePath(std::string_view path) {
  std::wstring text(path.size(), L'\0');
  const auto* at = reinterpret_cast<const unsigned char*>(path.data());
  const unsigned char* const end = at + path.size();
  WCHAR* out = text.data();
  while (at != end) {
    const Utf8Step step = StepUtf8(at, end);
    out = PutUtf16(step.isValid ? step.character : char32_t{kReplacementCharacter}, out);
    at += step.length;
  }
  text.resize(static_cast<std::size_t>(out - text.data()));
  return text;
}

std::string ToNativePath(SStringView path) {
  std::string text(path.size() * 3, '\0');
  char* out = text.data();
  const WCHAR* const end = path.data() + path.size();
  for (const WCHAR* at = path.data(); at != end;) {
    const char32_t character = TakeUtf16(at, end);
    out = PutUtf8(IsSurrogate(character) ? char32_t{kReplacementCharacter} : character, out);
  }
  text.resize(static_cast<std::size_t>(out - text.data()));
  return text;
}

}  // namespace platform
