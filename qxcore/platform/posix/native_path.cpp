#include "qxcore/platform/internal/native_path.h"

#include "qxcore/platform/posix/path.h"

namespace platform {

std::u16string FromNativePath(std::string_view path) {
  std::u16string text;
  if (!path.empty() && path.front() == '/') text = u"C:";
  while (!path.empty()) {
    const std::size_t slash = path.find('/');
    text += ToWindowsName(path.substr(0, slash));
    if (slash == std::string_view::npos) break;
    text += u'\\';
    path.remove_prefix(slash + 1);
  }
  return text;
}

std::string ToNativePath(SStringView path) {
  std::string bytes;
  if (path.size() >= 2 && path[1] == ':') {
    if (path[0] != 'C' && path[0] != 'c') return bytes;
    // Relative to the drive's current directory, which is the process's, where no backslash follows.
    path.remove_prefix(2);
  } else if (path.size() >= 2 && IsSeparator(path[0]) && IsSeparator(path[1])) {
    return bytes;
  }
  while (!path.empty()) {
    const std::size_t end = path.find_first_of(u"\\/");
    AppendName(bytes, path.substr(0, end));
    if (end == SStringView::npos) break;
    bytes += '/';
    path.remove_prefix(end + 1);
  }
  return bytes;
}

}  // namespace platform
