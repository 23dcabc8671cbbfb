#include "qxcore/platform/posix/path.h"

#include <dirent.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <vector>

#include "qxcore/platform/wide.h"

namespace platform {
namespace {

bool IsDriveLetter(WCHAR c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z'); }

// Absolute on a drive, with backslashes only, and without empty, "." and ".." parts: its own full path.
bool IsFull(std::u16string_view path) {
  if (path.size() < 3 || path[1] != ':' || path[2] != '\\' || !IsDriveLetter(path[0])) return false;
  for (std::size_t i = 3; i < path.size(); ++i) {
    if (path[i] == '/') return false;
    if (path[i - 1] != '\\') continue;
    if (path[i] == '\\') return false;
    if (path[i] != '.') continue;
    const std::u16string_view part = path.substr(i, std::min(path.find(u'\\', i), path.size()) - i);
    if (part.find('/') != std::u16string_view::npos || part == u"." || part == u"..") return false;
  }
  return true;
}

// Empty when there is none: somebody may have removed it.
std::u16string CurrentDirectory() {
  std::vector<char> buffer(256);
  while (getcwd(buffer.data(), buffer.size()) == nullptr) {
    if (errno != ERANGE) return std::u16string();
    buffer.resize(buffer.size() * 2);
  }
  return ToWindowsPath(buffer.data());
}

// Appends the parts of `rest`, taking "." and ".." out; `root` characters stay whatever comes.
void AppendParts(std::u16string& full, std::size_t root, std::u16string_view rest) {
  std::size_t at = 0;
  while (at < rest.size()) {
    std::size_t end = at;
    while (end < rest.size() && !IsSeparator(rest[end])) ++end;
    const std::u16string_view part = rest.substr(at, end - at);
    if (part == u"..") {
      const std::size_t last = full.find_last_of(u'\\');
      full.resize(last == std::u16string::npos || last < root ? root : last);
    } else if (!part.empty() && part != u".") {
      if (full.back() != '\\') full += u'\\';
      full += part;
    }
    at = end + 1;
  }
}

// The entry of a folder that has this name but for case; empty when none does.
std::string FindNoCase(const std::string& folder, const std::u16string& name) {
  DIR* stream = opendir(folder.c_str());
  if (stream == nullptr) return std::string();
  std::string found;
  WCHAR candidate[sizeof(dirent::d_name) + 1];
  while (const dirent* entry = readdir(stream)) {
    candidate[ToWindowsName(entry->d_name, candidate)] = 0;
    if (WideCompareNoCase(candidate, name.c_str()) == 0) {
      found = entry->d_name;
      break;
    }
  }
  closedir(stream);
  return found;
}

std::vector<std::u16string> SplitParts(std::u16string_view full) {
  std::vector<std::u16string> parts;
  for (std::size_t at = 3; at < full.size();) {
    const std::size_t end = std::min(full.find(u'\\', at), full.size());
    parts.emplace_back(full.substr(at, end - at));
    at = end + 1;
  }
  return parts;
}

std::string Join(const std::string& folder, const std::string& name) {
  return folder == "/" ? "/" + name : folder + "/" + name;
}

// Goes down the parts, each in its exact spelling or without regard to case.
void Walk(const std::vector<std::u16string>& parts, Resolved& resolved) {
  std::string path = "/";
  for (std::size_t i = 0; i < parts.size(); ++i) {
    const bool last = i + 1 == parts.size();
    std::string next = Join(path, ToFileSystemName(parts[i]));
    bool there = lstat(next.c_str(), &resolved.info) == 0;
    if (!there && errno == ENOENT) {
      const std::string other = FindNoCase(path, parts[i]);
      if (!other.empty()) {
        next = Join(path, other);
        there = lstat(next.c_str(), &resolved.info) == 0;
      }
    } else if (!there) {
      resolved.error = errno == ENOTDIR ? ERROR_PATH_NOT_FOUND : ErrorFromErrno(errno);
      return;
    }
    if (!there && !last) {
      resolved.error = ERROR_PATH_NOT_FOUND;
      return;
    }
    resolved.exists = there;
    path = next;
  }
  resolved.path = path;
}

}  // namespace

std::u16string ToWindowsPath(std::string_view path) {
  std::u16string result = u"C:";
  std::size_t at = 0;
  while (at < path.size()) {
    const std::size_t end = std::min(path.find('/', at), path.size());
    if (end > at) {
      result += u'\\';
      result += ToWindowsName(path.substr(at, end - at));
    }
    at = end + 1;
  }
  if (result.size() == 2) result += u'\\';
  return result;
}

std::u16string MakeFullPath(std::u16string_view path) {
  if (path.empty()) return std::u16string();
  std::u16string full;
  if (path.size() >= 6 && path.substr(0, 4) == u"\\\\?\\" && IsDriveLetter(path[4]) && path[5] == ':')
    path.remove_prefix(4);
  if (path.size() >= 2 && IsSeparator(path[0]) && IsSeparator(path[1])) {
    // The server and the share are the root.
    full = u"\\\\";
    std::size_t at = 2;
    for (int part = 0; part < 2 && at < path.size(); ++part) {
      if (part > 0) full += u'\\', ++at;
      while (at < path.size() && !IsSeparator(path[at])) full += path[at++];
    }
    AppendParts(full, full.size(), path.substr(std::min(at, path.size())));
  } else if (path.size() >= 2 && path[1] == ':' && IsDriveLetter(path[0])) {
    const bool rooted = path.size() >= 3 && IsSeparator(path[2]);
    const bool thisDrive = path[0] == 'C' || path[0] == 'c';
    full = !rooted && thisDrive ? CurrentDirectory() : std::u16string{path[0], u':', u'\\'};
    if (!full.empty()) AppendParts(full, 3, path.substr(2));
  } else if (IsSeparator(path[0])) {
    full = u"C:\\";
    AppendParts(full, 3, path);
  } else {
    full = CurrentDirectory();
    if (!full.empty()) AppendParts(full, 3, path);
  }
  const bool trailing = IsSeparator(path.back()) && full.size() > 3 && full.back() != '\\';
  if (trailing) full += u'\\';
  return full;
}

namespace {

// There are no servers; what is wrong with a path that names one, or a device.
DWORD ErrorOfServer(std::u16string_view full) {
  const std::u16string_view name = full.substr(2);
  if (name.starts_with(u"?\\") || name.starts_with(u".\\"))
    return name.size() == 2 ? ERROR_INVALID_NAME : ERROR_FILE_NOT_FOUND;
  return name.find(u'\\') == std::u16string_view::npos ? ERROR_PATH_NOT_FOUND : ERROR_BAD_NETPATH;
}

}  // namespace

FullPath::FullPath(std::u16string_view path) {
  if (IsFull(path)) {
    m_view = path;
  } else {
    m_made = MakeFullPath(path);
    m_view = m_made;
  }
}

DWORD SpellExactly(std::u16string_view full, std::string& exact) {
  exact.clear();
  if (full.empty()) return ERROR_PATH_NOT_FOUND;
  if (full[0] == '\\') return ErrorOfServer(full);
  if (full[0] != 'C' && full[0] != 'c') return ERROR_PATH_NOT_FOUND;
  if (full.back() == '\\') full.remove_suffix(1);
  exact.reserve(full.size());
  for (std::size_t i = 2; i < full.size(); ++i) {
    if (full[i] == '\\') {
      exact += '/';
    } else if (StandsForItself(full[i])) {
      exact += static_cast<char>(full[i]);
    } else if (full[i] < 0x80) {
      return ERROR_INVALID_NAME;
    } else {
      const std::size_t start = i;
      while (i + 1 < full.size() && full[i + 1] >= 0x80) ++i;
      AppendName(exact, full.substr(start, i + 1 - start));
    }
  }
  if (exact.empty()) exact = "/";
  return ERROR_SUCCESS;
}

Resolved ResolvePath(LPCWSTR given) {
  Resolved resolved;
  if (given == nullptr || *given == 0) {
    resolved.error = ERROR_PATH_NOT_FOUND;
    return resolved;
  }
  const FullPath path(given);
  std::u16string_view full = path.View();
  std::string exact;
  resolved.error = SpellExactly(full, exact);
  if (resolved.error != ERROR_SUCCESS) return resolved;
  if (full.size() > 3 && full.back() == '\\') {
    resolved.wantsFolder = true;
    full.remove_suffix(1);
  }
  // The exact spelling first, in one look.
  if (lstat(exact.c_str(), &resolved.info) == 0) {
    resolved.path = std::move(exact);
    resolved.exists = true;
    return resolved;
  }
  if (errno != ENOENT && errno != ENOTDIR) {
    resolved.error = ErrorFromErrno(errno);
    return resolved;
  }
  Walk(SplitParts(full), resolved);
  return resolved;
}

std::string SpelledAsGiven(const Resolved& resolved, LPCWSTR path) {
  std::u16string full = MakeFullPath(path);
  if (!full.empty() && full.back() == '\\') full.pop_back();
  const std::size_t slash = resolved.path.find_last_of('/');
  return resolved.path.substr(0, slash + 1) + ToFileSystemName(full.substr(full.find_last_of(u'\\') + 1));
}

bool IsNameOf(const char* path, int descriptor) {
  struct stat named, opened;
  return stat(path, &named) == 0 && fstat(descriptor, &opened) == 0 && named.st_dev == opened.st_dev &&
         named.st_ino == opened.st_ino;
}

DWORD ErrorFromErrno(int error) {
  switch (error) {
    case 0:
      return ERROR_SUCCESS;
    case ENOENT:
      return ERROR_FILE_NOT_FOUND;
    case ENOTDIR:
      return ERROR_PATH_NOT_FOUND;
    case EACCES:
    case EPERM:
    case EISDIR:
      return ERROR_ACCESS_DENIED;
    case EEXIST:
      return ERROR_FILE_EXISTS;
    case ENOTEMPTY:
      return ERROR_DIR_NOT_EMPTY;
    case EMFILE:
    case ENFILE:
      return ERROR_TOO_MANY_OPEN_FILES;
    case ENOSPC:
    case EDQUOT:
      return ERROR_DISK_FULL;
    case EFBIG:
      return ERROR_FILE_TOO_LARGE;
    case EROFS:
      return ERROR_WRITE_PROTECT;
    case ENAMETOOLONG:
      return ERROR_FILENAME_EXCED_RANGE;
    case ELOOP:
      return ERROR_CANT_RESOLVE_FILENAME;
    case EXDEV:
      return ERROR_NOT_SAME_DEVICE;
    case EBADF:
      return ERROR_INVALID_HANDLE;
    case EINVAL:
      return ERROR_INVALID_PARAMETER;
    case ENOMEM:
      return ERROR_NOT_ENOUGH_MEMORY;
    case EBUSY:
      return ERROR_BUSY;
    case ETXTBSY:
      return ERROR_SHARING_VIOLATION;
    case EPIPE:
      return ERROR_BROKEN_PIPE;
    case EFAULT:
      return ERROR_NOACCESS;
    case EIO:
      return ERROR_IO_DEVICE;
    default:
      return ERROR_GEN_FAILURE;
  }
}

}  // namespace platform
