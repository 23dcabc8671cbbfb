// One-level searches with wildcards.

#include <dirent.h>
#include <fcntl.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <cstring>

#include "qxcore/platform/internal/path_parts.h"
#include "qxcore/platform/posix/file_info.h"
#include "qxcore/platform/posix/handle.h"
#include "qxcore/platform/posix/wildcard.h"
#include "qxcore/platform/wide.h"

namespace {

using namespace platform;

// The names in a folder, asked of the kernel directly: the C library's streams lock and copy.
class FolderReader {
 public:
  explicit FolderReader(int descriptor) : m_descriptor(descriptor) {}
  FolderReader(const FolderReader&) = delete;
  FolderReader& operator=(const FolderReader&) = delete;
  ~FolderReader() { close(m_descriptor); }

  int Descriptor() const { return m_descriptor; }
  // The next entry, valid until the next call; null at the end and, with errno, on failure.
  const dirent64* Next() {
    if (m_at == m_end && !Fill()) return nullptr;
    const auto* entry = reinterpret_cast<const dirent64*>(m_buffer + m_at);
    m_at += entry->d_reclen;
    return entry;
  }

 private:
  bool Fill() {
    errno = 0;
    const ssize_t count = getdents64(m_descriptor, m_buffer, sizeof m_buffer);
    m_at = 0;
    m_end = count > 0 ? static_cast<std::size_t>(count) : 0;
    if (count < 0 && errno == ENOENT) errno = 0;  // the folder was removed: nothing is left in it
    return count > 0;
  }

  int m_descriptor;
  std::size_t m_at = 0, m_end = 0;
  alignas(dirent64) char m_buffer[32768];
};

// Whether the listing alone says that this is neither a folder nor a link, which may lead to one.
bool IsPlainFile(const dirent64& entry) {
  return entry.d_type != DT_DIR && entry.d_type != DT_LNK && entry.d_type != DT_UNKNOWN;
}

class Search final : public HandleObject {
 public:
  Search(int folder, std::u16string pattern, bool isRoot, bool foldersOnly)
      : m_entries(folder), m_pattern(std::move(pattern)), m_isRoot(isRoot), m_foldersOnly(foldersOnly) {}

  // The next entry that fits the pattern; otherwise the error, ERROR_NO_MORE_FILES at the end.
  DWORD Next(WIN32_FIND_DATAW& data) {
    for (;;) {
      const dirent64* const entry = m_entries.Next();
      if (entry == nullptr) return errno == 0 ? ERROR_NO_MORE_FILES : ErrorFromErrno(errno);
      if ((m_isRoot && IsDotName(entry->d_name)) || (m_foldersOnly && IsPlainFile(*entry))) continue;
      const std::string_view native(entry->d_name);
      WCHAR name[NAME_MAX + 1];
      if (native.size() >= MAX_PATH || native.size() > NAME_MAX) continue;
      const std::size_t length = ToWindowsName(native, name);
      if (!MatchesWildcard(m_pattern, {name, length})) continue;
      if (Describe(entry->d_name, {name, length}, data)) return ERROR_SUCCESS;
      // Gone between the two looks.
      if (errno != ENOENT) return ErrorFromErrno(errno);
    }
  }

 private:
  bool Describe(const char* entryName, std::u16string_view name, WIN32_FIND_DATAW& data) const {
    EntryInfo info;
    if (!GetEntryInfo(m_entries.Descriptor(), entryName, info)) return false;
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

  FolderReader m_entries;
  std::u16string m_pattern;
  bool m_isRoot;
  bool m_foldersOnly;
};

HANDLE FailsWith(DWORD error) { return FailWith(error, INVALID_HANDLE_VALUE); }

struct Pattern {
  std::u16string_view folder, mask;
};

// The folder, and the last part of the path, which alone may hold wildcards.
Pattern SplitPattern(std::u16string_view path) {
  const std::size_t folder = FolderLength(path);
  return {folder != 0 ? path.substr(0, folder) : u".", path.substr(folder)};
}

// Opens the folder: a descriptor, or -1 and the error.
int OpenFolder(std::u16string_view folder, bool& isRoot, DWORD& error) {
  constexpr int kMode = O_RDONLY | O_DIRECTORY | O_NONBLOCK | O_CLOEXEC;
  std::string exact;
  error = SpellExactly(FullPath(folder).View(), exact);
  if (error != ERROR_SUCCESS) return -1;
  int descriptor = open(exact.c_str(), kMode);
  if (descriptor < 0 && (errno == ENOENT || errno == ENOTDIR)) {
    const Resolved resolved = ResolvePath(std::u16string(folder).c_str());
    error = resolved.error != ERROR_SUCCESS ? resolved.error : resolved.exists ? ERROR_SUCCESS : ERROR_PATH_NOT_FOUND;
    if (error != ERROR_SUCCESS) return -1;
    exact = resolved.path;
    descriptor = open(exact.c_str(), kMode);
  }
  if (descriptor < 0) error = errno == ENOTDIR ? ERROR_DIRECTORY : ErrorFromErrno(errno);
  isRoot = exact == "/";
  return descriptor;
}

HANDLE StartSearch(LPCWSTR path, WIN32_FIND_DATAW* data, bool foldersOnly) {
  Pattern pattern = SplitPattern(path);
  // "folder\." is the entry of the folder itself.
  const FullPath full(path);
  if (pattern.mask == u"." || pattern.mask == u"..") pattern = SplitPattern(full.View());
  if (pattern.mask.empty()) return FailsWith(ERROR_FILE_NOT_FOUND);
  bool isRoot = false;
  DWORD error = ERROR_SUCCESS;
  const int folder = OpenFolder(pattern.folder, isRoot, error);
  if (folder < 0) return FailsWith(error);
  std::shared_ptr<Search> search;
  try {
    search = std::make_shared<Search>(folder, CompileWildcard(pattern.mask), isRoot, foldersOnly);
  } catch (...) {
    close(folder);
    throw;
  }
  error = search->Next(*data);
  if (error != ERROR_SUCCESS) return FailsWith(error == ERROR_NO_MORE_FILES ? ERROR_FILE_NOT_FOUND : error);
  return AddHandle(search, 0);
}

}  // namespace

HANDLE FindFirstFileW(LPCWSTR pattern, WIN32_FIND_DATAW* data) {
  return FindFirstFileExW(pattern, FindExInfoStandard, data, FindExSearchNameMatch, nullptr, 0);
}

HANDLE FindFirstFileExW(LPCWSTR pattern, FINDEX_INFO_LEVELS, LPVOID data, FINDEX_SEARCH_OPS search, LPVOID filter,
                        DWORD) {
  if (pattern == nullptr || *pattern == 0) return FailsWith(ERROR_PATH_NOT_FOUND);
  if (filter != nullptr) return FailsWith(ERROR_INVALID_PARAMETER);
  return Guarded(INVALID_HANDLE_VALUE, [&] {
    return StartSearch(pattern, static_cast<WIN32_FIND_DATAW*>(data), search == FindExSearchLimitToDirectories);
  });
}

BOOL FindNextFileW(HANDLE handle, WIN32_FIND_DATAW* data) {
  const HandleUse use = UseHandle(handle);
  auto* search = dynamic_cast<Search*>(use.object.get());
  if (search == nullptr) return FailWith(ERROR_INVALID_HANDLE);
  return Succeeds([&] { return search->Next(*data); });
}

BOOL FindClose(HANDLE handle) {
  const HandleUse use = UseHandle(handle);
  if (dynamic_cast<Search*>(use.object.get()) == nullptr) return FailWith(ERROR_INVALID_HANDLE);
  RemoveHandle(handle);
  return TRUE;
}
