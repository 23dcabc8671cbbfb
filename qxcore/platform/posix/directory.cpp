// The current directory, full paths and temporary names.

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/statvfs.h>
#include <unistd.h>

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

DWORD GetLongPathNameW(LPCWSTR path, LPWSTR buffer, DWORD size) {
  return Guarded(DWORD{0}, [&]() -> DWORD {
    const Resolved entry = ResolvePath(path);
    if (entry.error != ERROR_SUCCESS || !entry.exists) {
      SetLastError(entry.error != ERROR_SUCCESS ? entry.error : ERROR_FILE_NOT_FOUND);
      return 0;
    }
    return Deliver(ToWindowsPath(entry.path), size, buffer);
  });
}

DWORD GetShortPathNameW(LPCWSTR path, LPWSTR buffer, DWORD size) { return GetLongPathNameW(path, buffer, size); }

UINT GetSystemDirectoryW(LPWSTR buffer, UINT size) { return Deliver(u"C:\\usr\\lib", size, buffer); }

UINT GetWindowsDirectoryW(LPWSTR buffer, UINT size) { return Deliver(u"C:\\usr", size, buffer); }

BOOL GetDiskFreeSpaceExW(LPCWSTR directory, ULARGE_INTEGER* available, ULARGE_INTEGER* total, ULARGE_INTEGER* free) {
  return Succeeds([&]() -> DWORD {
    const Resolved entry = ResolvePath(directory != nullptr ? directory : u".");
    if (entry.error != ERROR_SUCCESS) return entry.error;
    struct statvfs info;
    if (!entry.exists) return ERROR_PATH_NOT_FOUND;
    if (statvfs(entry.path.c_str(), &info) != 0) return ErrorFromErrno(errno);
    const ULONGLONG block = info.f_frsize;
    if (available != nullptr) available->QuadPart = info.f_bavail * block;
    if (total != nullptr) total->QuadPart = info.f_blocks * block;
    if (free != nullptr) free->QuadPart = info.f_bfree * block;
    return ERROR_SUCCESS;
  });
}
