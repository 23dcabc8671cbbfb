// One-level searches with wildcards.

#include <dirent.h>
#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>
#include <new>

#include "platform/posix/file_info.h"
#include "platform/posix/handle.h"
#include "platform/posix/wildcard.h"
#include "platform/wide.h"

namespace {

using namespace platform;

class Search final : public HandleObject {
 public:
  Search(DIR* stream, std::u16string pattern, bool isRoot)
      : m_stream(stream), m_pattern(std::move(pattern)), m_isRoot(isRoot) {}
  ~Search() override { closedir(m_stream); }

  // The next entry that fits the pattern; otherwise the error, ERROR_NO_MORE_FILES at the end.
  DWORD Next(WIN32_FIND_DATAW& data) {
    for (;;) {
      errno = 0;
      const dirent* entry = readdir(m_stream);
      if (entry == nullptr) return errno == 0 ? ERROR_NO_MORE_FILES : ErrorFromErrno(errno);
      if (m_isRoot && (std::strcmp(entry->d_name, ".") == 0 || std::strcmp(entry->d_name, "..") == 0)) continue;
      const std::u16string name = ToWindowsName(entry->d_name);
      if (name.size() >= MAX_PATH || !MatchesWildcard(m_pattern, name)) continue;
      if (Describe(entry->d_name, name, data)) return ERROR_SUCCESS;
      // Gone between the two looks.
      if (errno != ENOENT) return ErrorFromErrno(errno);
    }
  }

 private:
  bool Describe(const char* entryName, const std::u16string& name, WIN32_FIND_DATAW& data) const {
    EntryInfo info;
    if (!GetEntryInfo(dirfd(m_stream), entryName, info)) return false;
    data.dwFileAttributes = info.attributes;
    data.ftCreationTime = info.times.creation;
    data.ftLastAccessTime = info.times.access;
    data.ftLastWriteTime = info.times.write;
    data.nFileSizeHigh = static_cast<DWORD>(info.size >> 32);
    data.nFileSizeLow = static_cast<DWORD>(info.size);
    data.dwReserved0 = (info.attributes & FILE_ATTRIBUTE_REPARSE_POINT) != 0 ? 0xA000000Cu : 0;  // a symbolic link
    data.dwReserved1 = 0;
    name.copy(data.cFileName, name.size());
    data.cFileName[name.size()] = 0;
    data.cAlternateFileName[0] = 0;
    return true;
  }

  DIR* m_stream;
  std::u16string m_pattern;
  bool m_isRoot;
};

HANDLE FindFails(DWORD error) {
  SetLastError(error);
  return INVALID_HANDLE_VALUE;
}

struct Pattern {
  std::u16string folder, mask;
};

// The folder, and the last part of the path, which alone may hold wildcards.
Pattern SplitPattern(LPCWSTR path) {
  const std::u16string_view text(path);
  std::size_t last = text.find_last_of(u"\\/");
  if (last == std::u16string_view::npos && text.size() >= 2 && text[1] == ':') last = 1;
  if (last == std::u16string_view::npos) return {u".", std::u16string(text)};
  return {std::u16string(text.substr(0, last + 1)), std::u16string(text.substr(last + 1))};
}

HANDLE StartSearch(LPCWSTR path, WIN32_FIND_DATAW* data) {
  Pattern pattern = SplitPattern(path);
  if (pattern.mask.empty()) return FindFails(ERROR_FILE_NOT_FOUND);
  const Resolved folder = ResolvePath(pattern.folder.c_str());
  if (folder.error != ERROR_SUCCESS) return FindFails(folder.error);
  if (!folder.exists) return FindFails(ERROR_PATH_NOT_FOUND);
  DIR* stream = opendir(folder.path.c_str());
  if (stream == nullptr) return FindFails(errno == ENOTDIR ? ERROR_DIRECTORY : ErrorFromErrno(errno));
  const auto search = std::make_shared<Search>(stream, CompileWildcard(pattern.mask), folder.path == "/");
  const DWORD error = search->Next(*data);
  if (error != ERROR_SUCCESS) return FindFails(error == ERROR_NO_MORE_FILES ? ERROR_FILE_NOT_FOUND : error);
  return AddHandle(search, 0);
}

}  // namespace

HANDLE FindFirstFileW(LPCWSTR pattern, WIN32_FIND_DATAW* data) {
  if (pattern == nullptr || *pattern == 0) return FindFails(ERROR_PATH_NOT_FOUND);
  try {
    return StartSearch(pattern, data);
  } catch (const std::bad_alloc&) {
    return FindFails(ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL FindNextFileW(HANDLE handle, WIN32_FIND_DATAW* data) {
  const HandleUse use = UseHandle(handle);
  auto* search = dynamic_cast<Search*>(use.object.get());
  if (search == nullptr) return FailWith(ERROR_INVALID_HANDLE);
  try {
    const DWORD error = search->Next(*data);
    return error == ERROR_SUCCESS ? TRUE : FailWith(error);
  } catch (const std::bad_alloc&) {
    return FailWith(ERROR_NOT_ENOUGH_MEMORY);
  }
}

BOOL FindClose(HANDLE handle) {
  const HandleUse use = UseHandle(handle);
  if (dynamic_cast<Search*>(use.object.get()) == nullptr) return FailWith(ERROR_INVALID_HANDLE);
  RemoveHandle(handle);
  return TRUE;
}
