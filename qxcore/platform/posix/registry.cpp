// The registry's functions over the store.

#include <sys/uio.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstring>

#include "qxcore/platform/posix/registry_key.h"

namespace {

using namespace platform;

std::u16string_view ViewOf(LPCWSTR text) { return text == nullptr ? std::u16string_view() : text; }

void CheckPath(std::u16string_view path) {
  if (!path.empty() && path.front() == '\\') throw SqliteError{ERROR_BAD_PATHNAME};
}

template <class Number>
void Store(Number* target, Number value) {
  if (target != nullptr) *target = value;
}

// Text with its terminator; `length` is the room on entry, the length without terminator on return.
DWORD CopyText(const std::u16string& text, LPWSTR buffer, LPDWORD length) {
  if (*length <= text.size()) return ERROR_MORE_DATA;
  text.copy(buffer, text.size());
  buffer[text.size()] = 0;
  *length = static_cast<DWORD>(text.size());
  return ERROR_SUCCESS;
}

void ClearClass(LPWSTR className, LPDWORD length) {
  if (className != nullptr && length != nullptr && *length > 0) *className = 0;
  Store<DWORD>(length, 0);
}

bool IsText(const RegistryValue& value) {
  return value.type == REG_SZ || value.type == REG_EXPAND_SZ || value.type == REG_MULTI_SZ;
}

// The caller's data; false when it cannot be read. Where the system does not let itself be asked to copy, a bad pointer
// is a crash, as with any other call.
bool CopyIn(const BYTE* data, DWORD size, std::string& bytes) {
  bytes.resize(size);
  if (size == 0 || data == nullptr) return size == 0;
  const iovec to{bytes.data(), size}, from{const_cast<BYTE*>(data), size};
  const ssize_t done = process_vm_readv(getpid(), &to, 1, &from, 1, 0);
  if (done < 0 && errno != EFAULT) std::memcpy(bytes.data(), data, size);
  return done == static_cast<ssize_t>(size) || (done < 0 && errno != EFAULT);
}

// A value's type and data; without a buffer its size alone.
DWORD CopyData(const RegistryValue& value, LPDWORD type, BYTE* data, LPDWORD size) {
  Store(type, value.type);
  if (size == nullptr) return ERROR_SUCCESS;
  const DWORD room = *size;
  *size = static_cast<DWORD>(value.data.size());
  if (data == nullptr) return ERROR_SUCCESS;
  if (room < value.data.size()) return ERROR_MORE_DATA;
  std::memcpy(data, value.data.data(), value.data.size());
  // A text without its terminator gets one where there is room; it is not counted.
  if (IsText(value) && room - value.data.size() >= sizeof(WCHAR))
    std::memset(data + value.data.size(), 0, sizeof(WCHAR));
  return ERROR_SUCCESS;
}

}  // namespace

// --- keys ---

LSTATUS RegOpenKeyExW(HKEY key, LPCWSTR path, DWORD, REGSAM access, HKEY* result) {
  if (result == nullptr) return ERROR_INVALID_PARAMETER;
  *result = nullptr;
  return RegistryResult([&]() -> DWORD {
    const RegistryKeyUse use(key, 0);
    CheckPath(ViewOf(path));
    use.MustExist();
    const KeyId found = use->keys.Find(use.Id(), ViewOf(path));
    if (found == 0) return ERROR_FILE_NOT_FOUND;
    *result = use.AddHandle(found, access);
    return ERROR_SUCCESS;
  });
}

LSTATUS RegCreateKeyExW(HKEY key, LPCWSTR path, DWORD, LPWSTR, DWORD, REGSAM access, const SECURITY_ATTRIBUTES*,
                        HKEY* result, LPDWORD disposition) {
  if (result == nullptr || path == nullptr) return ERROR_INVALID_PARAMETER;
  *result = nullptr;
  return RegistryResult([&]() -> DWORD {
    const RegistryKeyUse use(key, 0);
    CheckPath(path);
    bool isNew = false;
    const KeyId made = use->keys.Create(use.Id(), path, isNew);
    if (made == 0) return ERROR_KEY_DELETED;
    *result = use.AddHandle(made, access);
    Store<DWORD>(disposition, isNew ? REG_CREATED_NEW_KEY : REG_OPENED_EXISTING_KEY);
    return ERROR_SUCCESS;
  });
}

LSTATUS RegCloseKey(HKEY key) {
  return RegistryResult([&] { return CloseRegistryHandle(key); });
}

LSTATUS RegDeleteKeyW(HKEY key, LPCWSTR path) {
  if (path == nullptr) return ERROR_INVALID_PARAMETER;
  return RegistryResult([&] {
    const RegistryKeyUse use(key, 0);
    CheckPath(path);
    return use->keys.Delete(use.Id(), path);
  });
}

LSTATUS RegEnumKeyExW(HKEY key, DWORD index, LPWSTR name, LPDWORD nameLength, LPDWORD, LPWSTR className,
                      LPDWORD classLength, FILETIME* lastWrite) {
  if (name == nullptr || nameLength == nullptr) return ERROR_INVALID_PARAMETER;
  return RegistryResult([&]() -> DWORD {
    const RegistryKeyUse use(key, KEY_ENUMERATE_SUB_KEYS);
    use.MustExist();
    const std::u16string* subKey = use->keys.SubKey(use.Id(), index);
    if (subKey == nullptr) return ERROR_NO_MORE_ITEMS;
    const DWORD error = CopyText(*subKey, name, nameLength);
    if (error != ERROR_SUCCESS) return error;
    ClearClass(className, classLength);
    Store(lastWrite, FILETIME{0, 0});
    return ERROR_SUCCESS;
  });
}

// --- values ---

LSTATUS RegEnumValueW(HKEY key, DWORD index, LPWSTR name, LPDWORD nameLength, LPDWORD, LPDWORD type, BYTE* data,
                      LPDWORD size) {
  if (name == nullptr || nameLength == nullptr || (data != nullptr && size == nullptr)) return ERROR_INVALID_PARAMETER;
  return RegistryResult([&]() -> DWORD {
    const RegistryKeyUse use(key, KEY_QUERY_VALUE);
    use.MustExist();
    const RegistryValue* value = use->values.At(use.Id(), index);
    if (value == nullptr) return ERROR_NO_MORE_ITEMS;
    const DWORD error = CopyText(value->name, name, nameLength);
    return error == ERROR_SUCCESS ? CopyData(*value, type, data, size) : error;
  });
}

LSTATUS RegSetValueExW(HKEY key, LPCWSTR name, DWORD, DWORD type, const BYTE* data, DWORD size) {
  constexpr std::size_t kLongestName = 16383;
  if (ViewOf(name).size() > kLongestName) return ERROR_INVALID_PARAMETER;
  return RegistryResult([&]() -> DWORD {
    std::string bytes;
    if (!CopyIn(data, size, bytes)) return ERROR_NOACCESS;
    const RegistryKeyUse use(key, KEY_SET_VALUE);
    return use->values.Set(use.Id(), ViewOf(name), type, bytes) ? ERROR_SUCCESS : ERROR_KEY_DELETED;
  });
}

LSTATUS RegQueryValueExW(HKEY key, LPCWSTR name, LPDWORD, LPDWORD type, BYTE* data, LPDWORD size) {
  if (data != nullptr && size == nullptr) return ERROR_INVALID_PARAMETER;
  return RegistryResult([&]() -> DWORD {
    const RegistryKeyUse use(key, KEY_QUERY_VALUE);
    const RegistryValue* value = use->values.Find(use.Id(), ViewOf(name));
    if (value != nullptr) return CopyData(*value, type, data, size);
    use.MustExist();
    if (data == nullptr) Store<DWORD>(size, 0);
    return ERROR_FILE_NOT_FOUND;
  });
}

LSTATUS RegDeleteValueW(HKEY key, LPCWSTR name) {
  return RegistryResult([&]() -> DWORD {
    const RegistryKeyUse use(key, KEY_SET_VALUE);
    if (use->values.Delete(use.Id(), ViewOf(name))) return ERROR_SUCCESS;
    use.MustExist();
    return ERROR_FILE_NOT_FOUND;
  });
}
