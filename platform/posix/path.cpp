#include "platform/posix/path.h"

#include <dirent.h>
#include <unistd.h>

#include <cerrno>
#include <climits>
#include <vector>

#include "platform/wide.h"

namespace platform {
namespace {

bool IsSeparator(WCHAR c) { return c == '\\' || c == '/'; }

// Windows allows these bytes in no name; the slash cannot stand in one here either.
bool IsForbidden(unsigned byte) {
  return (byte > 0 && byte < 0x20) || byte == '"' || byte == '*' || byte == ':' || byte == '<' || byte == '>' ||
         byte == '?' || byte == '|' || byte == '\\';
}

// A byte that stands mapped in a Windows name.
bool IsMappedByte(unsigned byte) { return byte >= 0x80 || IsForbidden(byte); }

// Length of the valid UTF-8 sequence at the start, 0 for none.
std::size_t Utf8Length(std::string_view text) {
  const auto byte = [&](std::size_t i) { return i < text.size() ? static_cast<unsigned char>(text[i]) : 0u; };
  const auto trail = [&](std::size_t i) { return (byte(i) & 0xC0) == 0x80; };
  const unsigned lead = byte(0);
  if (lead < 0x80) return 1;
  if (lead >= 0xC2 && lead <= 0xDF) return trail(1) ? 2 : 0;
  if (lead >= 0xE0 && lead <= 0xEF) {
    if (!trail(1) || !trail(2) || (lead == 0xE0 && byte(1) < 0xA0) || (lead == 0xED && byte(1) > 0x9F)) return 0;
    return 3;
  }
  if (lead >= 0xF0 && lead <= 0xF4) {
    if (!trail(1) || !trail(2) || !trail(3) || (lead == 0xF0 && byte(1) < 0x90) || (lead == 0xF4 && byte(1) > 0x8F))
      return 0;
    return 4;
  }
  return 0;
}

void AppendUtf8(std::string& name, char32_t c) {
  if (c < 0x80) {
    name += static_cast<char>(c);
  } else if (c < 0x800) {
    name += static_cast<char>(0xC0 | c >> 6);
    name += static_cast<char>(0x80 | (c & 0x3F));
  } else if (c < 0x10000) {
    name += static_cast<char>(0xE0 | c >> 12);
    name += static_cast<char>(0x80 | (c >> 6 & 0x3F));
    name += static_cast<char>(0x80 | (c & 0x3F));
  } else {
    name += static_cast<char>(0xF0 | c >> 18);
    name += static_cast<char>(0x80 | (c >> 12 & 0x3F));
    name += static_cast<char>(0x80 | (c >> 6 & 0x3F));
    name += static_cast<char>(0x80 | (c & 0x3F));
  }
}

std::u16string CurrentDirectory() {
  std::vector<char> buffer(256);
  while (getcwd(buffer.data(), buffer.size()) == nullptr) {
    if (errno != ERANGE) return u"C:\\";
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

bool IsDriveLetter(WCHAR c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z'); }

// The entry of a folder that has this name but for case; empty when none does.
std::string FindNoCase(const std::string& folder, const std::u16string& name) {
  DIR* stream = opendir(folder.c_str());
  if (stream == nullptr) return std::string();
  std::string found;
  while (const dirent* entry = readdir(stream)) {
    const std::u16string candidate = ToWindowsName(entry->d_name);
    if (WideCompareNoCase(candidate.c_str(), name.c_str()) == 0) {
      found = entry->d_name;
      break;
    }
  }
  closedir(stream);
  return found;
}

std::vector<std::u16string> SplitParts(const std::u16string& full) {
  std::vector<std::u16string> parts;
  for (std::size_t at = 3; at < full.size();) {
    std::size_t end = full.find(u'\\', at);
    if (end == std::u16string::npos) end = full.size();
    parts.emplace_back(full, at, end - at);
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

std::string ToFileSystemName(std::u16string_view name) {
  std::string result;
  result.reserve(name.size());
  for (std::size_t i = 0; i < name.size(); ++i) {
    char32_t c = name[i];
    if (c >= 0xF000 && c <= 0xF0FF && IsMappedByte(c & 0xFF)) {
      result += static_cast<char>(c & 0xFF);
      continue;
    }
    if (c >= 0xD800 && c < 0xDC00 && i + 1 < name.size() && name[i + 1] >= 0xDC00 && name[i + 1] <= 0xDFFF)
      c = 0x10000 + ((c - 0xD800) << 10) + (name[++i] - 0xDC00u);
    AppendUtf8(result, c);
  }
  return result;
}

std::u16string ToWindowsName(std::string_view name) {
  std::u16string result;
  result.reserve(name.size());
  while (!name.empty()) {
    std::size_t size = Utf8Length(name);
    const unsigned lead = static_cast<unsigned char>(name[0]);
    if (size <= 1) {
      const bool mapped = size == 0 || IsForbidden(lead);
      result += static_cast<WCHAR>(mapped ? 0xF000 + lead : lead);
      name.remove_prefix(1);
      continue;
    }
    char32_t c = lead & (0x7Fu >> size);
    for (std::size_t i = 1; i < size; ++i) c = c << 6 | (static_cast<unsigned char>(name[i]) & 0x3F);
    if (c >= 0xF000 && c <= 0xF0FF) {
      for (std::size_t i = 0; i < size; ++i) result += static_cast<WCHAR>(0xF000 + static_cast<unsigned char>(name[i]));
    } else if (c >= 0x10000) {
      result += static_cast<WCHAR>(0xD7C0 + (c >> 10));
      result += static_cast<WCHAR>(0xDC00 + (c & 0x3FF));
    } else {
      result += static_cast<WCHAR>(c);
    }
    name.remove_prefix(size);
  }
  return result;
}

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
  if (path.size() >= 4 && path.substr(0, 4) == u"\\\\?\\") path.remove_prefix(4);
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
    AppendParts(full, 3, path.substr(2));
  } else if (IsSeparator(path[0])) {
    full = u"C:\\";
    AppendParts(full, 3, path);
  } else {
    full = CurrentDirectory();
    AppendParts(full, 3, path);
  }
  const bool trailing = IsSeparator(path.back()) && full.size() > 3 && full.back() != '\\';
  if (trailing) full += u'\\';
  return full;
}

Resolved ResolvePath(LPCWSTR given) {
  Resolved resolved;
  if (given == nullptr || *given == 0) {
    resolved.error = ERROR_PATH_NOT_FOUND;
    return resolved;
  }
  std::u16string full = MakeFullPath(given);
  if (full[0] == '\\') {
    resolved.error = ERROR_BAD_NETPATH;
    return resolved;
  }
  if (full[0] != 'C' && full[0] != 'c') {
    resolved.error = ERROR_PATH_NOT_FOUND;
    return resolved;
  }
  for (std::size_t i = 3; i < full.size(); ++i)
    if (full[i] != '\\' && full[i] < 0x80 && IsForbidden(full[i])) {
      resolved.error = ERROR_INVALID_NAME;
      return resolved;
    }
  if (full.size() > 3 && full.back() == '\\') {
    resolved.wantsFolder = true;
    full.pop_back();
  }
  // The exact spelling first, in one look.
  const std::vector<std::u16string> parts = SplitParts(full);
  std::string exact;
  for (const std::u16string& part : parts) exact += "/" + ToFileSystemName(part);
  if (exact.empty()) exact = "/";
  if (lstat(exact.c_str(), &resolved.info) == 0) {
    resolved.path = exact;
    resolved.exists = true;
    return resolved;
  }
  if (errno != ENOENT && errno != ENOTDIR) {
    resolved.error = ErrorFromErrno(errno);
    return resolved;
  }
  Walk(parts, resolved);
  return resolved;
}

std::string SpelledAsGiven(const Resolved& resolved, LPCWSTR path) {
  std::u16string full = MakeFullPath(path);
  if (full.back() == '\\') full.pop_back();
  const std::size_t slash = resolved.path.find_last_of('/');
  return resolved.path.substr(0, slash + 1) + ToFileSystemName(full.substr(full.find_last_of(u'\\') + 1));
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
    case EIO:
      return ERROR_IO_DEVICE;
    default:
      return ERROR_GEN_FAILURE;
  }
}

}  // namespace platform
