#include "qxcore/platform/posix/display/sdl/sdl.h"

namespace platform::sdl {

std::string ToUtf8(std::u16string_view text) {
  std::string bytes(text.size() * 3, 0);
  const int length = ::WideCharToMultiByte(CP_UTF8, 0, text.data(), static_cast<int>(text.size()), bytes.data(),
                                           static_cast<int>(bytes.size()), nullptr, nullptr);
  bytes.resize(static_cast<std::size_t>(length));
  return bytes;
}

std::u16string FromUtf8(std::string_view bytes) {
  std::u16string text(bytes.size(), 0);
  const int length = ::MultiByteToWideChar(CP_UTF8, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                           static_cast<int>(text.size()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

}  // namespace platform::sdl
