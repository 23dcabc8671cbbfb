// Opening, writing and deleting; reading is in registry_read.cpp.

#include "qxcore/system/settings/registry.h"

#include <algorithm>
#include <cstring>

#include "qxcore/core/memory.h"
#include "qxcore/system/hglobal.h"

namespace {

constexpr unsigned int kApplicationKeyText = 280;

bool Is(LSTATUS result, DWORD code) { return static_cast<DWORD>(result) == code; }

HRESULT Result(LSTATUS result) { return Is(result, ERROR_SUCCESS) ? S_OK : E_FAIL; }

}  // namespace

HRESULT SRegistry::Init(HKEY root, const SString& path, int create) {
  if (m_key != nullptr && m_path == path && m_create == create) return S_OK;
  // The path may be the object's own.
  const SString wanted = path;
  if (root != nullptr) return Open(root, wanted, create);
  const HRESULT result = Init(HKEY_CURRENT_USER, wanted, 0);
  if (result == S_OK || Init(HKEY_LOCAL_MACHINE, wanted, 0) == S_OK) return S_OK;
  return create ? Init(HKEY_CURRENT_USER, wanted, create) : result;
}

HRESULT SRegistry::Open(HKEY root, const SString& path, int create) {
  Close();
  SString trimmed = path;
  trimmed.TrimRight(static_cast<WCHAR>('\\'));
  LSTATUS result;
  if (!create || root == HKEY_LOCAL_MACHINE) {
    result = RegOpenKeyExW(root, trimmed, 0, KEY_ALL_ACCESS, &m_key);
    if (Is(result, ERROR_ACCESS_DENIED)) result = RegOpenKeyExW(root, trimmed, 0, KEY_READ, &m_key);
  } else {
    result =
        RegCreateKeyExW(root, trimmed, 0, nullptr, REG_OPTION_NON_VOLATILE, KEY_ALL_ACCESS, nullptr, &m_key, nullptr);
  }
  if (!Is(result, ERROR_SUCCESS)) {
    m_key = nullptr;
    return E_FAIL;
  }
  m_path = path;
  m_create = create;
  return S_OK;
}

void SRegistry::Close() {
  if (m_key != nullptr) RegCloseKey(m_key);
  m_key = nullptr;
}

void SRegistry::Done() {
  Close();
  m_path.Done();
  m_create = 0;
}

SString SRegistry::GetApplicationPath(const SString& subKey) {
  SString path;
  path.LoadStringW(kApplicationKeyText);
  return path + subKey;
}

// --- writing ---

HRESULT SRegistry::Write(const SString& name, DWORD type, const void* data, DWORD size) {
  if (m_key == nullptr) return S_OK;
  return Result(RegSetValueExW(m_key, name, 0, type, static_cast<const BYTE*>(data), size));
}

HRESULT SRegistry::WriteProfile(const SString& name, int value) {
  return WriteProfile(name, value ? SString::Yes : SString::No);
}

HRESULT SRegistry::WriteProfile(const SString& name, long value, int asNumber) {
  if (!asNumber) return WriteProfile(name, SString(value));
  const DWORD number = static_cast<DWORD>(value);
  return Write(name, REG_DWORD, &number, sizeof number);
}

HRESULT SRegistry::WriteProfile(const SString& name, const SString& value) {
  if (m_key == nullptr) return S_OK;
  // The platform may look behind the given size for the rest of the terminator and take it, too.
  const std::size_t length = static_cast<std::size_t>(value.Length()), room = (length + 2) * sizeof(WCHAR);
  BYTE small[512];
  BYTE* const copy = room <= sizeof small ? small : static_cast<BYTE*>(SMemAlloc(room));
  std::memcpy(copy, value.GetSafePointer(), length * sizeof(WCHAR));
  std::memset(copy + length * sizeof(WCHAR), 0, 2 * sizeof(WCHAR));
  const HRESULT result = Write(name, REG_SZ, copy, static_cast<DWORD>(length * 2 + 1));
  if (copy != small) SMemFree(copy);
  return result;
}

HRESULT SRegistry::WriteProfile(const SString& name, void* globalBlock, unsigned long size) {
  if (m_key == nullptr) return S_OK;
  if (globalBlock == nullptr || size == 0) return E_INVALIDARG;
  const SHGlobal block(globalBlock);
  const unsigned long count = std::min(size, block.Size());
  const void* bytes = count == 0 ? nullptr : block.Lock();
  if (bytes == nullptr) return E_INVALIDARG;
  const HRESULT result = Write(name, REG_BINARY, bytes, static_cast<DWORD>(count));
  block.Unlock();
  return result;
}

// --- deletion ---

HRESULT SRegistry::DeleteProfile(const SString& name, int recursive) {
  if (m_key == nullptr) return S_OK;
  const LSTATUS result = RegDeleteValueW(m_key, name);
  return Is(result, ERROR_FILE_NOT_FOUND) ? DeleteKey(name, recursive) : Result(result);
}

HRESULT SRegistry::DeleteKey(const SString& name, int recursive) {
  if (m_key == nullptr) return S_OK;
  if (recursive) {
    SRegistry below;
    SRegistry* subKey = this;
    if (!name.IsEmpty()) {
      below.Init(m_key, name, 0);
      subKey = &below;
    }
    SString child, last;
    // What is deleted makes room for the next at the same index. A name that comes again cannot be deleted
    // whatever the platform says: one with a NUL inside, which only the system itself can make.
    for (long index = 0; subKey->GetEnumKey(index, &child) == 0; last = child)
      if (child == last || subKey->DeleteKey(child, recursive) != S_OK) ++index;
  }
  const LSTATUS result = RegDeleteKeyW(m_key, name);
  return Is(result, ERROR_FILE_NOT_FOUND) || Is(result, ERROR_PATH_NOT_FOUND) ? S_OK : Result(result);
}
