// The keys of the registry.
#pragma once

#include <unordered_map>

#include "qxcore/platform/posix/registry_cache.h"
#include "qxcore/platform/posix/registry_database.h"

namespace platform {

class RegistryKeys {
 public:
  explicit RegistryKeys(RegistryDatabase& database) : m_database(database) {}

  static KeyId RootId(DWORD number) { return static_cast<KeyId>(number) + 1; }

  // 0 when there is none. Empty parts of a path are passed over.
  KeyId Find(KeyId parent, std::u16string_view path);
  bool Exists(KeyId key);
  // Makes what is missing of the path; 0 when the parent itself is gone.
  KeyId Create(KeyId parent, std::u16string_view path, bool& isNew);
  // With its values; ERROR_ACCESS_DENIED when it has sub-keys or is a root.
  DWORD Delete(KeyId parent, std::u16string_view path);

  // In the order of the upper-case names. Null behind the last one; good until the next call of a member.
  const std::u16string* SubKey(KeyId key, DWORD index);

 private:
  KeyId FindPart(KeyId parent, std::u16string_view name);
  KeyId InsertPart(KeyId parent, std::u16string_view name);
  static std::size_t SizeOf(const KeyId&) { return 0; }

  RegistryDatabase& m_database;
  RegistryStatement m_find{m_database, "SELECT id FROM keys WHERE parent = ? AND folded = ?"};
  RegistryStatement m_exists{m_database, "SELECT 1 FROM keys WHERE id = ?"};
  RegistryStatement m_insert{m_database,
                             "INSERT INTO keys(parent, depth, folded, name)"
                             " SELECT ?1, depth + 1, ?2, ?3 FROM keys WHERE id = ?1 RETURNING id, depth"};
  RegistryStatement m_hasSubKey{m_database, "SELECT 1 FROM keys WHERE parent = ? LIMIT 1"};
  RegistryStatement m_deleteValues{m_database, "DELETE FROM vals WHERE key = ?"};
  RegistryStatement m_delete{m_database, "DELETE FROM keys WHERE id = ?"};
  RegistryStatement m_subKeys{m_database, "SELECT name FROM keys WHERE parent = ? ORDER BY folded LIMIT ? OFFSET ?"};

  RegistryCache<KeyId, SizeOf> m_found;
  std::unordered_map<KeyId, std::uint64_t> m_known;  // keys that are there: generation
  RegistryWindow<std::u16string> m_window;
};

}  // namespace platform
