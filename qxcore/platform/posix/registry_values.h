// The values of the registry's keys.
#pragma once

#include <optional>

#include "qxcore/platform/posix/registry_cache.h"
#include "qxcore/platform/posix/registry_database.h"

namespace platform {

struct RegistryValue {
  std::u16string name;
  DWORD type = REG_NONE;
  std::string data;
};

class RegistryValues {
 public:
  explicit RegistryValues(RegistryDatabase& database) : m_database(database) {}

  // Null when there is none; good until the next call of a member.
  const RegistryValue* Find(KeyId key, std::u16string_view name);
  // In the order in which they were made. Null behind the last one; good until the next call of a member.
  const RegistryValue* At(KeyId key, DWORD index);
  // False when the key is gone.
  bool Set(KeyId key, std::u16string_view name, DWORD type, std::string_view data);
  // False when there is none.
  bool Delete(KeyId key, std::u16string_view name);

 private:
  static std::size_t SizeOf(const std::optional<RegistryValue>& value) {
    return value.has_value() ? value->name.size() * sizeof(WCHAR) + value->data.size() : 0;
  }

  RegistryDatabase& m_database;
  RegistryStatement m_find{m_database, "SELECT name, type, data FROM vals WHERE key = ? AND folded = ?"};
  RegistryStatement m_all{m_database,
                          "SELECT name, type, data FROM vals INDEXED BY vals_of_key WHERE key = ?"
                          " ORDER BY id LIMIT ? OFFSET ?"};
  RegistryStatement m_set{m_database,
                          "INSERT INTO vals(key, folded, name, type, data) SELECT ?1, ?2, ?3, ?4, ?5"
                          " WHERE EXISTS (SELECT 1 FROM keys WHERE id = ?1)"
                          " ON CONFLICT(key, folded) DO UPDATE SET type = excluded.type, data = excluded.data"};
  RegistryStatement m_delete{m_database, "DELETE FROM vals WHERE key = ? AND folded = ?"};

  RegistryCache<std::optional<RegistryValue>, SizeOf> m_found;
  RegistryWindow<RegistryValue> m_window;
};

}  // namespace platform
