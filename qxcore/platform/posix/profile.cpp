// The functions for initialisation files: finding them and reading. Changes: profile_change.cpp.

#include <fcntl.h>
#include <sys/stat.h>

#include <algorithm>
#include <cerrno>

#include "qxcore/platform/posix/descriptor.h"
#include "qxcore/platform/posix/profile_change.h"
#include "qxcore/platform/posix/share_mode.h"

namespace {

using namespace platform;

// The whole content. A pipe is not waited for.
DWORD ReadProfile(LPCWSTR name, std::string& bytes) {
  ProfilePath path(name);
  if (path.error != ERROR_SUCCESS) return path.error;
  const Descriptor file(open(path.path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC));
  if (file < 0) return ErrorFromErrno(errno);
  if (IsReadDenied(file)) return ERROR_SHARING_VIOLATION;
  return ReadToEnd(file, bytes) ? ERROR_SUCCESS : ErrorFromErrno(errno);
}

// Copies with a terminator, cut to the room. Returns the length.
DWORD CopyOut(std::u16string_view text, LPWSTR buffer, DWORD capacity) {
  const std::size_t length = std::min<std::size_t>(text.size(), capacity - 1);
  text.copy(buffer, length);
  buffer[length] = 0;
  return static_cast<DWORD>(length);
}

// Names one behind the other, each terminated, and one terminator more. Cut, it is two less than the room.
DWORD CopyOut(const std::vector<std::u16string>& names, LPWSTR buffer, DWORD capacity) {
  std::u16string all;
  for (const std::u16string& name : names) all += name + u'\0';
  if (capacity == 1) return CopyOut(u"", buffer, capacity);
  const std::size_t length = std::min<std::size_t>(all.size(), capacity - 1);
  all.copy(buffer, length);
  if (length < all.size()) {
    buffer[capacity - 2] = buffer[capacity - 1] = 0;
    return capacity - 2;
  }
  buffer[length] = 0;
  if (all.empty()) buffer[1] = 0;
  return static_cast<DWORD>(length);
}

}  // namespace

DWORD GetPrivateProfileStringW(LPCWSTR section, LPCWSTR key, LPCWSTR standard, LPWSTR text, DWORD capacity,
                               LPCWSTR file) {
  if (text == nullptr || capacity == 0) return 0;
  std::u16string_view fallback = standard == nullptr ? u"" : standard;
  while (!fallback.empty() && fallback.back() == ' ') fallback.remove_suffix(1);
  text[0] = 0;
  return Guarded(DWORD{0}, [&] {
    std::string bytes;
    const DWORD error = file == nullptr ? ERROR_FILE_NOT_FOUND : ReadProfile(file, bytes);
    if (error != ERROR_SUCCESS) bytes.clear();
    const ProfileFile profile(std::move(bytes));
    std::u16string value;
    DWORD length;
    if (section == nullptr) {
      length = CopyOut(profile.Sections(), text, capacity);
    } else if (key == nullptr) {
      // A section without keys is like a key without a value.
      const std::vector<std::u16string> keys = profile.Keys(section);
      length = keys.empty() ? CopyOut(fallback, text, capacity) : CopyOut(keys, text, capacity);
    } else {
      length = CopyOut(profile.Find(section, key, value) ? std::u16string_view(value) : fallback, text, capacity);
    }
    SetLastError(error);
    return length;
  });
}

BOOL WritePrivateProfileStringW(LPCWSTR section, LPCWSTR key, LPCWSTR text, LPCWSTR file) {
  if (file == nullptr || *file == 0) return FailWith(ERROR_ACCESS_DENIED);
  // Nothing is held back that could be written now.
  if (section == nullptr) return FailWith(key == nullptr && text == nullptr ? ERROR_SUCCESS : ERROR_FILE_NOT_FOUND);
  return Succeeds([&] {
    return ChangeProfile(file, [&](ProfileFile& profile) {
      if (key == nullptr) return profile.DeleteSection(section);
      return text == nullptr ? profile.DeleteKey(section, key) : profile.Set(section, key, text);
    });
  });
}
