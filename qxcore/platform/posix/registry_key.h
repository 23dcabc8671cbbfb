// Open keys of the registry: what a handle stands for.
#pragma once

#include "qxcore/platform/posix/registry_store.h"

namespace platform {

// A handle in use; the store is locked for as long.
class RegistryKeyUse {
 public:
  // Throws SqliteError: ERROR_INVALID_HANDLE, or ERROR_ACCESS_DENIED when the key was opened without all of
  // `access`.
  RegistryKeyUse(HKEY handle, DWORD access);

  KeyId Id() const { return m_id; }
  RegistryStore* operator->() const { return m_store.operator->(); }

  // A new handle to a key, with the rights that are asked for.
  HKEY AddHandle(KeyId key, DWORD access) const;
  // Throws ERROR_KEY_DELETED when the key is gone.
  void MustExist() const;

 private:
  RegistryStore::Use m_store;
  KeyId m_id = 0;
};

// ERROR_INVALID_HANDLE for none; the roots stay open.
LSTATUS CloseRegistryHandle(HKEY handle);

// Runs the body of a registry function; returns its result or the error that it threw.
template <class Body>
LSTATUS RegistryResult(Body body) {
  try {
    return static_cast<LSTATUS>(body());
  } catch (const SqliteError& error) {
    return static_cast<LSTATUS>(error.code);
  } catch (const std::bad_alloc&) {
    return ERROR_NOT_ENOUGH_MEMORY;
  }
}

}  // namespace platform
