// What the program was started with, and where its file lies.

#include <unistd.h>

#include <climits>
#include <fstream>
#include <iterator>
#include <string>

#include "qxcore/platform/posix/path.h"
#include "qxcore/platform/win32.h"

namespace {

using namespace platform;

// A word as the runtime's rules take it apart again: in quotation marks when it is empty or holds blanks or marks;
// backslashes are doubled before a mark.
std::u16string Quoted(const std::u16string& word) {
  if (!word.empty() && word.find_first_of(u" \t\"") == std::u16string::npos) return word;
  std::u16string quoted(1, u'"');
  std::size_t backslashes = 0;
  for (const char16_t c : word) {
    if (c == u'"') quoted.append(backslashes + 1, u'\\');
    backslashes = c == u'\\' ? backslashes + 1 : 0;
    quoted += c;
  }
  quoted.append(backslashes, u'\\');
  return quoted += u'"';
}

std::u16string Wide(const std::string& bytes) {
  std::u16string text(bytes.size(), 0);
  const int length = MultiByteToWideChar(CP_UTF8, 0, bytes.data(), static_cast<int>(bytes.size()), text.data(),
                                         static_cast<int>(text.size()));
  text.resize(static_cast<std::size_t>(length));
  return text;
}

std::u16string ReadCommandLine() {
  std::ifstream file("/proc/self/cmdline", std::ios::binary);
  const std::string bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
  std::u16string line;
  for (std::size_t start = 0; start < bytes.size();) {
    const std::size_t end = std::min(bytes.find('\0', start), bytes.size());
    if (start > 0) line += u' ';
    line += Quoted(Wide(bytes.substr(start, end - start)));
    start = end + 1;
  }
  return line;
}

}  // namespace

LPWSTR GetCommandLineW() {
  static std::u16string line = ReadCommandLine();
  return line.data();
}

DWORD GetModuleFileNameW(HMODULE module, LPWSTR path, DWORD capacity) {
  if (module != nullptr) return FailWith<DWORD>(ERROR_MOD_NOT_FOUND);
  char file[PATH_MAX];
  const ssize_t length = readlink("/proc/self/exe", file, sizeof(file));
  if (length < 0) return FailWith<DWORD>(ErrorFromErrno(errno));
  if (capacity == 0) return FailWith<DWORD>(ERROR_INSUFFICIENT_BUFFER);
  const std::u16string wide = ToWindowsPath(std::string_view(file, static_cast<std::size_t>(length)));
  const bool fits = wide.size() < capacity;
  const std::size_t count = fits ? wide.size() : capacity - 1;
  wide.copy(path, count);
  path[count] = 0;
  SetLastError(fits ? ERROR_SUCCESS : ERROR_INSUFFICIENT_BUFFER);
  return static_cast<DWORD>(fits ? count : capacity);
}
