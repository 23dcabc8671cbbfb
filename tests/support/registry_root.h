// A key of the registry of a test's own, removed with all that is in it; on Linux in a database of its own.
#pragma once

#include <cstdlib>
#include <string>

#include "qxcore/platform/win32.h"
#include "tests/support/temp_folder.h"
#include "tests/support/wine.h"

namespace test {

inline void SetVariable(const char* name, const std::string& value) {
#ifdef _WIN32
  _putenv((std::string(name) + "=" + value).c_str());
  SetEnvironmentVariableA(name, value.c_str());
#else
  value.empty() ? unsetenv(name) : setenv(name, value.c_str(), 1);
#endif
}

inline void DeleteTree(HKEY root, const WCHAR* path) {
  HKEY key;
  if (RegOpenKeyExW(root, path, 0, KEY_ALL_ACCESS, &key) != 0) return;
  WCHAR name[300];
  for (DWORD length = 300; RegEnumKeyExW(key, 0, name, &length, nullptr, nullptr, nullptr, nullptr) == 0; length = 300)
    DeleteTree(key, name);
  RegCloseKey(key);
  RegDeleteKeyW(root, path);
}

class RegistryRoot {
 public:
  RegistryRoot() {
    // "C:\tmp\x" is "/tmp/x".
    m_file = Narrow(m_folder.File(WTEXT("registry.db")));
    for (char& c : m_file)
      if (c == '\\') c = '/';
    m_file.erase(0, 2);
    if (const char* former = std::getenv("QXCORE_REGISTRY")) m_former = former;
    if (!IsWindows()) SetVariable("QXCORE_REGISTRY", m_file);
    DeleteTree(HKEY_CURRENT_USER, Path());
  }
  RegistryRoot(const RegistryRoot&) = delete;
  RegistryRoot& operator=(const RegistryRoot&) = delete;
  ~RegistryRoot() {
    DeleteTree(HKEY_CURRENT_USER, Path());
    if (!IsWindows()) SetVariable("QXCORE_REGISTRY", m_former);
  }

  // Below HKEY_CURRENT_USER.
  static const WCHAR* Path() { return WTEXT("Software\\qxcore test"); }
  const std::string& File() const { return m_file; }

 private:
  TempFolder m_folder;
  std::string m_file, m_former;
};

// All that this process knows of the user lies in such a key: for what the library keeps in places of its own, where
// other tests that run at the same time would see it.
class OwnUser {
 public:
#ifdef _WIN32
  OwnUser() {
    RegCreateKeyExW(HKEY_CURRENT_USER, RegistryRoot::Path(), 0, nullptr, 0, KEY_ALL_ACCESS, nullptr, &m_key, nullptr);
    RegOverridePredefKey(HKEY_CURRENT_USER, m_key);
  }
  ~OwnUser() {
    RegOverridePredefKey(HKEY_CURRENT_USER, nullptr);
    RegCloseKey(m_key);
  }
#else
  OwnUser() = default;
#endif
  OwnUser(const OwnUser&) = delete;
  OwnUser& operator=(const OwnUser&) = delete;

  const RegistryRoot& Root() const { return m_root; }

 private:
  RegistryRoot m_root;
#ifdef _WIN32
  HKEY m_key = nullptr;
#endif
};

}  // namespace test
