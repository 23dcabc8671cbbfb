// The current directory, full paths and temporary names.

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <ctime>

#include "qxcore/platform/posix/open_file.h"
#include "qxcore/platform/wide.h"

namespace {

using namespace platform;

// The convention of all calls that fill a buffer: the length when the text fits, else the size needed.
DWORD Deliver(std::u16string_view text, DWORD size, LPWSTR buffer) {
  if (text.size() >= size || buffer == nullptr) return static_cast<DWORD>(text.size() + 1);
  std::char_traits<WCHAR>::move(buffer, text.data(), text.size());  // it may be the same place
  buffer[text.size()] = 0;
  return static_cast<DWORD>(text.size());
}

}  // namespace

DWORD GetCurrentDirectoryW(DWORD size, LPWSTR buffer) { return GetFullPathNameW(u".", size, buffer, nullptr); }

BOOL SetCurrentDirectoryW(LPCWSTR path) {
  if (path == nullptr || *path == 0) return FailWith(ERROR_INVALID_NAME);
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (entry.error != ERROR_SUCCESS) return entry.error;
    if (entry.exists && chdir(entry.path.c_str()) == 0) return ERROR_SUCCESS;
    return !entry.exists || errno == ENOENT ? ERROR_FILE_NOT_FOUND
           : errno == ENOTDIR               ? ERROR_DIRECTORY
                                            : ErrorFromErrno(errno);
  });
}

DWORD GetFullPathNameW(LPCWSTR path, DWORD size, LPWSTR buffer, LPWSTR* filePart) {
  if (filePart != nullptr) *filePart = nullptr;
  if (path == nullptr || *path == 0) return FailWith(ERROR_INVALID_NAME, DWORD{0});
  return Guarded(DWORD{0}, [&] {
    const FullPath full(path);
    if (full.View().empty()) return FailWith(ERROR_PATH_NOT_FOUND, DWORD{0});
    const DWORD length = Deliver(full.View(), size, buffer);
    if (filePart == nullptr || length >= size) return length;
    const std::size_t name = full.View().find_last_of(u'\\') + 1;
    if (name < full.View().size()) *filePart = buffer + name;
    return length;
  });
}

DWORD GetTempPathW(DWORD size, LPWSTR buffer) {
  return Guarded(DWORD{0}, [&] {
    const char* folder = std::getenv("TMPDIR");
    std::u16string path = ToWindowsPath(folder != nullptr && folder[0] == '/' ? folder : "/tmp");
    if (path.back() != '\\') path += u'\\';
    if (path.size() >= size && buffer != nullptr) std::fill_n(buffer, size, u'\0');
    return Deliver(path, size, buffer);
  });
}

UINT GetTempFileNameW(LPCWSTR directory, LPCWSTR prefix, UINT unique, LPWSTR name) {
  const auto fails = [](DWORD error) { return FailWith(error, UINT{0}); };
  if (directory == nullptr || name == nullptr) return fails(ERROR_INVALID_PARAMETER);
  if (WideLength(directory) > MAX_PATH - 14) return fails(ERROR_BUFFER_OVERFLOW);
  const DWORD attributes = GetFileAttributesW(directory);
  if (attributes == INVALID_FILE_ATTRIBUTES || (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0)
    return fails(ERROR_DIRECTORY);
  const WCHAR last = directory[0] != 0 ? directory[WideLength(directory) - 1] : u'\\';
  const WCHAR* separator = last == '\\' || last == '/' ? u"" : u"\\";
  timespec now;
  clock_gettime(CLOCK_REALTIME, &now);
  UINT number = unique & 0xFFFF;
  if (unique == 0) number = static_cast<UINT>(now.tv_nsec / 1000 + now.tv_sec + getpid()) & 0xFFFF;
  for (int attempt = 0; attempt < 0xFFFF; ++attempt, number = (number + 1) & 0xFFFF) {
    if (number == 0) number = 1;
    WideFormat(name, MAX_PATH, u"%s%s%.3s%X.tmp", directory, separator, prefix != nullptr ? prefix : u"", number);
    if (unique != 0) return unique;
    // Others are not to read what is kept here for a while.
    const HANDLE file = Guarded(INVALID_HANDLE_VALUE, [&] {
      return OpenFileAt(ResolvePath(name), {GENERIC_WRITE, 0, CREATE_NEW, 0, false, 0600});
    });
    if (file != INVALID_HANDLE_VALUE) {
      CloseHandle(file);
      return number;
    }
    if (GetLastError() != ERROR_FILE_EXISTS) return 0;
  }
  return fails(ERROR_FILE_EXISTS);
}

namespace {

// The path as it was given, each part in it as it is spelled on disk. ERROR_SUCCESS, or why there is no such path.
DWORD SpellAsOnDisk(std::u16string_view path, std::u16string& spelled) {
  const Resolved whole = ResolvePath(std::u16string(path).c_str());
  if (whole.error != ERROR_SUCCESS) return whole.error;
  struct stat info;
  const bool isFile =
      whole.exists && whole.wantsFolder && stat(whole.path.c_str(), &info) == 0 && !S_ISDIR(info.st_mode);
  if (!whole.exists || isFile) return ERROR_FILE_NOT_FOUND;
  // A drive, or the prefix for long paths and a drive, has no other spelling.
  std::size_t at = path.starts_with(u"\\\\?\\") ? 4 : 0;
  if (path.size() >= at + 2 && path[at + 1] == ':') at += 2;
  spelled = path.substr(0, at);
  while (at < path.size()) {
    std::size_t end = at;
    while (end < path.size() && !IsSeparator(path[end])) ++end;
    const std::u16string_view part = path.substr(at, end - at);
    if (part.empty() || part == u"." || part == u"..") {
      spelled += part;
    } else {
      const std::string there = ResolvePath(std::u16string(path.substr(0, end)).c_str()).path;
      spelled += ToWindowsName(std::string_view(there).substr(there.rfind('/') + 1));
    }
    if (end < path.size()) spelled += path[end];
    at = end + 1;
  }
  return ERROR_SUCCESS;
}

DWORD DeliverSpelled(LPCWSTR path, LPWSTR buffer, DWORD size) {
  return Guarded(DWORD{0}, [&] {
    std::u16string spelled;
    const DWORD error = SpellAsOnDisk(path, spelled);
    return error == ERROR_SUCCESS ? Deliver(spelled, size, buffer) : FailWith(error, DWORD{0});
  });
}

}  // namespace

DWORD GetLongPathNameW(LPCWSTR path, LPWSTR buffer, DWORD size) {
  if (path == nullptr) return FailWith(ERROR_INVALID_PARAMETER, DWORD{0});
  return DeliverSpelled(path, buffer, size);
}

DWORD GetShortPathNameW(LPCWSTR path, LPWSTR buffer, DWORD size) {
  if (path == nullptr) return FailWith(ERROR_INVALID_PARAMETER, DWORD{0});
  if (*path == 0) return FailWith(ERROR_BAD_PATHNAME, DWORD{0});
  return DeliverSpelled(path, buffer, size);
}

UINT GetSystemDirectoryW(LPWSTR buffer, UINT size) { return Deliver(u"C:\\usr\\lib", size, buffer); }

UINT GetWindowsDirectoryW(LPWSTR buffer, UINT size) { return Deliver(u"C:\\usr", size, buffer); }

BOOL GetDiskFreeSpaceExW(LPCWSTR directory, ULARGE_INTEGER* available, ULARGE_INTEGER* total, ULARGE_INTEGER* free) {
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(directory != nullptr ? directory : u".");
    if (entry.error != ERROR_SUCCESS) return entry.error;
    struct statvfs info;
    if (!entry.exists) return ERROR_PATH_NOT_FOUND;
    if ((entry.info.st_mode & S_IFMT) == S_IFREG) return ERROR_DIRECTORY;
    if (statvfs(entry.path.c_str(), &info) != 0) return ErrorFromErrno(errno);
    const ULONGLONG block = info.f_frsize;
    if (available != nullptr) available->QuadPart = info.f_bavail * block;
    if (total != nullptr) total->QuadPart = info.f_blocks * block;
    if (free != nullptr) free->QuadPart = info.f_bfree * block;
    return ERROR_SUCCESS;
  });
}
