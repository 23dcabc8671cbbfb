#include "platform/posix/path.h"

#include <dirent.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <vector>

#include "platform/wide.h"

namespace platform {
namespace {

bool IsSeparator(WCHAR c) { return c == '\\' || c == '/'; }
bool IsDriveLetter(WCHAR c) { return (c >= 'A' && c <= 'Z') || (c >= 'a' && c <= 'z'); }

// Windows allows these bytes in no name; the slash cannot stand in one here either.
constexpr bool IsForbidden(unsigned byte) {
  return (byte > 0 && byte < 0x20) || byte == '"' || byte == '*' || byte == ':' || byte == '<' || byte == '>' ||
         byte == '?' || byte == '|' || byte == '\\';
}

// A byte that stands mapped in a Windows name.
bool IsMappedByte(unsigned byte) { return byte >= 0x80 || IsForbidden(byte); }

// The bytes that stand for themselves in both kinds of names.
constexpr std::array<bool, 256> kPlain = [] {
  std::array<bool, 256> plain{};
  for (unsigned byte = 0; byte < 0x80; ++byte) plain[byte] = !IsForbidden(byte);
  return plain;
}();

bool IsPlain(char16_t c) { return c < 0x80 && kPlain[c]; }

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

// One name as bytes of the file system.
void AppendName(std::string& bytes, std::u16string_view name) {
  for (std::size_t i = 0; i < name.size(); ++i) {
    char32_t c = name[i];
    if (c >= 0xF000 && c <= 0xF0FF && IsMappedByte(c & 0xFF)) {
      bytes += static_cast<char>(c & 0xFF);
      continue;
    }
    if (c >= 0xD800 && c < 0xDC00 && i + 1 < name.size() && name[i + 1] >= 0xDC00 && name[i + 1] <= 0xDFFF)
      c = 0x10000 + ((c - 0xD800) << 10) + (name[++i] - 0xDC00u);
    AppendUtf8(bytes, c);
  }
}

WCHAR* PutMapped(std::string_view bytes, WCHAR* at) {
  for (const char byte : bytes) *at++ = static_cast<WCHAR>(0xF000 + static_cast<unsigned char>(byte));
  return at;
}

// What is not plain: one byte that is mapped, or one UTF-8 sequence.
WCHAR* PutForeign(std::string_view sequence, WCHAR* at) {
  if (sequence.size() == 1) return PutMapped(sequence, at);
  char32_t c = static_cast<unsigned char>(sequence[0]) & (0x7Fu >> sequence.size());
  for (const char trail : sequence.substr(1)) c = c << 6 | (static_cast<unsigned char>(trail) & 0x3F);
  if (c >= 0xF000 && c <= 0xF0FF) return PutMapped(sequence, at);
  if (c >= 0x10000) {
    *at++ = static_cast<WCHAR>(0xD7C0 + (c >> 10));
    c = 0xDC00 + (c & 0x3FF);
  }
  *at++ = static_cast<WCHAR>(c);
  return at;
}

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

std::string ToFileSystemName(std::u16string_view name) {
  std::string result;
  result.reserve(name.size());
  AppendName(result, name);
  return result;
}

std::size_t ToWindowsName(std::string_view name, WCHAR* buffer) {
  WCHAR* at = buffer;
  for (std::size_t i = 0; i < name.size();) {
    const unsigned lead = static_cast<unsigned char>(name[i]);
    if (kPlain[lead]) {
      *at++ = static_cast<WCHAR>(lead);
      ++i;
    } else {
      const std::size_t size = std::max<std::size_t>(Utf8Length(name.substr(i)), 1);
      at = PutForeign(name.substr(i, size), at);
      i += size;
    }
  }
  return static_cast<std::size_t>(at - buffer);
}

std::u16string ToWindowsName(std::string_view name) {
  std::u16string result(name.size(), u'\0');
  result.resize(ToWindowsName(name, result.data()));
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
  if (full[0] == '\\') return ERROR_BAD_NETPATH;
  if (full[0] != 'C' && full[0] != 'c') return ERROR_PATH_NOT_FOUND;
  if (full.back() == '\\') full.remove_suffix(1);
  exact.reserve(full.size());
  for (std::size_t i = 2; i < full.size(); ++i) {
    if (full[i] == '\\') {
      exact += '/';
    } else if (IsPlain(full[i])) {
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
