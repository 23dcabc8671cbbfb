// SFile's operations that need no object: files by name, folders, the disk.

#include <algorithm>

#include "qxcore/platform/internal/path_parts.h"
#include "qxcore/system/file/file.h"
#include "qxcore/system/file/internal/result.h"

namespace {

DWORD AttributesOf(const SString& name) {
  return name.IsEmpty() ? INVALID_FILE_ATTRIBUTES : ::GetFileAttributesW(name);
}

// The text that one of the platform's buffer-filling calls returns; empty on failure.
template <class Call>
SString Fetch(Call call) {
  WCHAR local[MAX_PATH];
  const DWORD length = call(DWORD{MAX_PATH}, local);
  if (length == 0) return SString();
  if (length < MAX_PATH) return SString(local);
  SString text;
  const DWORD size = length + 1;
  const DWORD got = call(size, text.Lock(static_cast<int>(size)));
  text.Unlock(got < size ? static_cast<int>(got) : 0);
  return text;
}

SString CurrentPath() {
  return Fetch([](DWORD size, WCHAR* buffer) { return ::GetCurrentDirectoryW(size, buffer); });
}

enum class Space { kFree, kTotal };

std::uint64_t AskSpace(const SString& path, Space which) {
  ULARGE_INTEGER available, total;
  if (!::GetDiskFreeSpaceExW(path, &available, &total, nullptr)) return 0;
  return which == Space::kFree ? available.QuadPart : total.QuadPart;
}

}  // namespace

int SFile::Exists(const SString& name) { return AttributesOf(name) != INVALID_FILE_ATTRIBUTES; }

int SFile::IsFile(const SString& name) {
  const DWORD attributes = AttributesOf(name);
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) == 0;
}

int SFile::IsDirectory(const SString& name) {
  const DWORD attributes = AttributesOf(name);
  return attributes != INVALID_FILE_ATTRIBUTES && (attributes & FILE_ATTRIBUTE_DIRECTORY) != 0;
}

HRESULT SFile::GetSize(const SString& name, unsigned long& low, unsigned long& high) {
  WIN32_FILE_ATTRIBUTE_DATA data;
  if (!::GetFileAttributesExW(name, GetFileExInfoStandard, &data) ||
      (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0)
    return Result(false, kGetSizeFailed);
  low = data.nFileSizeLow;
  high = data.nFileSizeHigh;
  return Result(true, kOk);
}

HRESULT SFile::Delete(const SString& name) { return Result(::DeleteFileW(name) != FALSE, kDeleteFailed); }

SString SFile::GetCurrentDirectoryW() {
  const SString path = CurrentPath();
  return path.Mid(static_cast<int>(platform::DriveLength(path.View())));
}

SString SFile::GetCurrentDrive() {
  const SString path = CurrentPath();
  return path.IsEmpty() ? path : path.Left(static_cast<int>(platform::DriveLength(path.View()))) + WTEXT("\\");
}

HRESULT SFile::SetCurrentDirectoryW(const SString& path) {
  return Result(::SetCurrentDirectoryW(path) != FALSE, kSetDirectoryFailed);
}

HRESULT SFile::CreateDirectoryW(const SString& path) {
  return Result(::CreateDirectoryW(path, nullptr) != FALSE, kCreateDirectoryFailed);
}

HRESULT SFile::RemoveDirectoryW(const SString& path) {
  return Result(::RemoveDirectoryW(path) != FALSE, kRemoveDirectoryFailed);
}

HRESULT SFile::CreateFilePath(const SString& path, SString* created, int isFile) {
  if (created != nullptr) *created = SString();
  SString folder = path;
  if (isFile != 0) {
    // The platform takes both slashes.
    const std::size_t last = path.View().find_last_of(WTEXT("\\/"));
    if (last == SStringView::npos || last == 0) return Result(true, kOk);
    folder = path.Left(static_cast<int>(last));
    if (folder[folder.Length() - 1] == ':') folder += WCHAR('\\');
  }
  folder = NormalizeDirectoryName(folder);
  if (folder.IsEmpty()) return Result(false, kCreateDirectoryFailed);
  // From the top down; what is there already is passed over.
  const SStringView view = folder.View();
  const bool isServer = view.size() >= 2 && view[0] == '\\' && view[1] == '\\';
  std::size_t end = isServer ? view.find(WCHAR('\\'), view.find(WCHAR('\\'), 2) + 1) : 2;
  while (end != SStringView::npos && end < view.size()) {
    end = std::min(view.find(WCHAR('\\'), end + 1), view.size());
    const SString part = folder.Left(static_cast<int>(end));
    if (IsDirectory(part)) continue;
    // Somebody else may have made it meanwhile, which serves as well.
    const bool made = ::CreateDirectoryW(part, nullptr) != FALSE;
    if (!made && !IsDirectory(part)) return Result(false, kCreateDirectoryFailed);
    if (made && created != nullptr && created->IsEmpty()) *created = part;
  }
  return Result(IsDirectory(folder) != 0, kCreateDirectoryFailed);
}

SString SFile::GetSystemDirectoryW() {
  return Fetch([](DWORD size, WCHAR* buffer) { return static_cast<DWORD>(::GetSystemDirectoryW(buffer, size)); });
}

SString SFile::GetWindowsDirectoryW() {
  return Fetch([](DWORD size, WCHAR* buffer) { return static_cast<DWORD>(::GetWindowsDirectoryW(buffer, size)); });
}

SString SFile::GetTempDirectory() {
  return Fetch([](DWORD size, WCHAR* buffer) { return ::GetTempPathW(size, buffer); });
}

SString SFile::GetTempFileNameW(const SString& directory, const SString& prefix, unsigned unique) {
  WCHAR name[MAX_PATH];
  return ::GetTempFileNameW(directory, prefix, unique, name) != 0 ? SString(name) : SString();
}

std::uint64_t SFile::GetFreeDiskSpace(const SString& path) { return AskSpace(path, Space::kFree); }
std::uint64_t SFile::GetTotalDiskSpace(const SString& path) { return AskSpace(path, Space::kTotal); }
