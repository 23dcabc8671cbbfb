// References to environment variables in texts.

#include <strings.h>
#include <unistd.h>

#include <cstdlib>
#include <cstring>
#include <string>

#include "qxcore/platform/posix/failure.h"

namespace {

std::string ToUtf8(std::u16string_view text) {
  std::string bytes(text.size() * 3, 0);
  const int length = WideCharToMultiByte(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), bytes.data(),
                                         static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

std::u16string FromUtf8(std::string_view bytes) {
  std::u16string text(bytes.size(), 0);
  const int length = MultiByteToWideChar(CP_UTF8, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                         static_cast<int>(text.size()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

// The variable's value; null when there is none.
const char* FindVariable(const std::string& name) {
  if (name.empty()) return nullptr;
  if (const char* value = std::getenv(name.c_str())) return value;
  for (char** entry = environ; entry != nullptr && *entry != nullptr; ++entry) {
    if (strncasecmp(*entry, name.c_str(), name.size()) == 0 && (*entry)[name.size()] == '=')
      return *entry + name.size() + 1;
  }
  return nullptr;
}

// What no variable stands behind is left as it is, the percent sign that closes it included.
std::u16string Expand(std::u16string_view text) {
  std::u16string expanded;
  while (!text.empty()) {
    const std::size_t start = text.find('%');
    expanded += text.substr(0, start);
    if (start == std::u16string_view::npos) break;
    text.remove_prefix(start);
    const std::size_t end = text.find('%', 1);
    if (end == std::u16string_view::npos) {
      expanded += text;
      break;
    }
    const char* value = FindVariable(ToUtf8(text.substr(1, end - 1)));
    expanded += value == nullptr ? std::u16string(text.substr(0, end + 1)) : FromUtf8(value);
    text.remove_prefix(end + 1);
  }
  return expanded;
}

}  // namespace

DWORD ExpandEnvironmentStringsW(LPCWSTR text, LPWSTR expanded, DWORD capacity) {
  using namespace platform;
  if (text == nullptr) return FailWith(ERROR_INVALID_PARAMETER, DWORD{0});
  return Guarded(DWORD{0}, [&] {
    const std::u16string result = Expand(text);
    const DWORD needed = static_cast<DWORD>(result.size()) + 1;
    if (needed > capacity || expanded == nullptr) return FailWith(ERROR_INSUFFICIENT_BUFFER, needed);
    std::memcpy(expanded, result.c_str(), needed * sizeof(WCHAR));
    return needed;
  });
}
