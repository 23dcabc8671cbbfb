// A folder of a test's own, removed with all that is in it.
#pragma once

#include <cstddef>
#include <string>

#include "qxcore/platform/wide.h"
#include "qxcore/platform/win32.h"

namespace test {

using Text = std::basic_string<WCHAR>;

inline std::string Narrow(const Text& text) {
  std::string result(text.size() * 3 + 1, '\0');
  const int length = WideCharToMultiByte(CP_UTF8, 0, text.c_str(), static_cast<int>(text.size() + 1), result.data(),
                                         static_cast<int>(result.size()) + 3, nullptr, nullptr);
  result.resize(length > 0 ? static_cast<std::size_t>(length) - 1 : 0);
  return result;
}

// Deletes a file or a folder with its content, read-only ones, too; links are not followed.
inline void RemoveAll(const Text& path) {
  const DWORD attributes = GetFileAttributesW(path.c_str());
  if (attributes == INVALID_FILE_ATTRIBUTES) return;
  if ((attributes & FILE_ATTRIBUTE_DIRECTORY) == 0) {
    SetFileAttributesW(path.c_str(), FILE_ATTRIBUTE_NORMAL);
    DeleteFileW(path.c_str());
    return;
  }
  WIN32_FIND_DATAW data;
  if ((attributes & FILE_ATTRIBUTE_REPARSE_POINT) == 0) {
    const HANDLE search = FindFirstFileW((path + WTEXT("\\*")).c_str(), &data);
    for (BOOL more = search != INVALID_HANDLE_VALUE; more; more = FindNextFileW(search, &data)) {
      const Text name = data.cFileName;
      if (name != WTEXT(".") && name != WTEXT("..")) RemoveAll(path + WTEXT("\\") + name);
    }
    if (search != INVALID_HANDLE_VALUE) FindClose(search);
  }
  RemoveDirectoryW(path.c_str());
}

class TempFolder {
 public:
  TempFolder() {
    WCHAR folder[MAX_PATH], name[MAX_PATH];
    GetTempPathW(MAX_PATH, folder);
    GetTempFileNameW(folder, WTEXT("qxt"), 0, name);
    DeleteFileW(name);
    CreateDirectoryW(name, nullptr);
    m_path = name;
  }
  TempFolder(const TempFolder&) = delete;
  TempFolder& operator=(const TempFolder&) = delete;
  ~TempFolder() { RemoveAll(m_path); }

  const Text& Path() const { return m_path; }
  Text File(const WCHAR* name) const { return m_path + WTEXT("\\") + name; }

 private:
  Text m_path;
};

inline bool WriteAll(const Text& path, const std::string& bytes) {
  const HANDLE file = CreateFileW(path.c_str(), GENERIC_WRITE, 0, nullptr, CREATE_ALWAYS, 0, nullptr);
  if (file == INVALID_HANDLE_VALUE) return false;
  DWORD done = 0;
  const BOOL written = WriteFile(file, bytes.data(), static_cast<DWORD>(bytes.size()), &done, nullptr);
  return CloseHandle(file) && written && done == bytes.size();
}

inline std::string ReadAll(const Text& path) {
  const HANDLE file =
      CreateFileW(path.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr, OPEN_EXISTING, 0, nullptr);
  if (file == INVALID_HANDLE_VALUE) return "cannot be opened";
  std::string bytes(1 << 20, '\0');
  DWORD done = 0;
  std::string all;
  while (ReadFile(file, bytes.data(), static_cast<DWORD>(bytes.size()), &done, nullptr) && done > 0)
    all.append(bytes, 0, done);
  CloseHandle(file);
  return all;
}

}  // namespace test
