#include "qxcore/platform/posix/registry_key.h"

namespace platform {
namespace {

struct OpenKey {
  KeyId id;
  DWORD access;
  unsigned serial;
};

// All handles of the process; guarded by the store's lock.
std::unordered_map<std::uintptr_t, OpenKey>& Handles() {
  static auto* const handles = new std::unordered_map<std::uintptr_t, OpenKey>;
  return *handles;
}

std::uintptr_t g_lastHandle = 0;

// The number of a root, from 0; -1 for other handles.
int RootNumber(HKEY handle) {
  const auto value = reinterpret_cast<std::uintptr_t>(handle);
  const auto first = reinterpret_cast<std::uintptr_t>(HKEY_CLASSES_ROOT);
  return value >= first && value - first < 4 ? static_cast<int>(value - first) : -1;
}

DWORD SpecificRights(DWORD access) {
  constexpr DWORD kMaximum = 0x02000000, kGenericAll = 0x10000000;
  if ((access & (kMaximum | kGenericAll)) != 0) access |= KEY_ALL_ACCESS;
  if ((access & GENERIC_READ) != 0) access |= KEY_READ;
  if ((access & GENERIC_WRITE) != 0) access |= KEY_WRITE;
  return access;
}

}  // namespace

RegistryKeyUse::RegistryKeyUse(HKEY handle, DWORD access) : m_store(RootNumber(handle) >= 0) {
  const int root = RootNumber(handle);
  if (root >= 0) {
    m_id = RegistryKeys::RootId(static_cast<DWORD>(root));
    return;
  }
  const auto found = Handles().find(reinterpret_cast<std::uintptr_t>(handle));
  if (found == Handles().end() || found->second.serial != m_store->database.Serial())
    throw SqliteError{ERROR_INVALID_HANDLE};
  if ((found->second.access & access) != access) throw SqliteError{ERROR_ACCESS_DENIED};
  m_id = found->second.id;
}

HKEY RegistryKeyUse::AddHandle(KeyId key, DWORD access) const {
  const DWORD rights = SpecificRights(access);
  if (m_store->database.IsReadOnly() && (rights & ~DWORD{KEY_READ}) != 0) throw SqliteError{ERROR_ACCESS_DENIED};
  g_lastHandle += 4;
  Handles()[g_lastHandle] = {key, rights, m_store->database.Serial()};
  return reinterpret_cast<HKEY>(g_lastHandle);
}

void RegistryKeyUse::MustExist() const {
  if (!m_store->keys.Exists(m_id)) throw SqliteError{ERROR_KEY_DELETED};
}

LSTATUS CloseRegistryHandle(HKEY handle) {
  if (RootNumber(handle) >= 0) return ERROR_SUCCESS;
  const RegistryStore::Use store(false);
  return Handles().erase(reinterpret_cast<std::uintptr_t>(handle)) == 0 ? static_cast<LSTATUS>(ERROR_INVALID_HANDLE)
                                                                        : static_cast<LSTATUS>(ERROR_SUCCESS);
}

}  // namespace platform
