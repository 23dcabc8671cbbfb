#include "qxcore/platform/posix/registry_keys.h"

#include "qxcore/platform/bmp.h"

namespace platform {
namespace {

constexpr int kDeepest = 512;
constexpr std::size_t kLongestName = 255;
constexpr KeyId kLastRoot = 4;
constexpr std::int64_t kWindow = 64;
constexpr std::size_t kMostKnown = 50000;

// The next part of a path that is not empty; false at its end.
bool NextPart(std::u16string_view& path, std::u16string_view& part) {
  while (!path.empty() && path.front() == '\\') path.remove_prefix(1);
  part = path.substr(0, path.find('\\'));
  path.remove_prefix(part.size());
  return !part.empty();
}

}  // namespace

std::string FoldRegistryName(std::u16string_view name) {
  std::string folded;
  folded.reserve(name.size() * 2);
  for (const char16_t c : name) {
    const char16_t upper = ToUpperBmp(c);
    folded += static_cast<char>(upper >> 8);
    folded += static_cast<char>(upper & 0xFF);
  }
  return folded;
}

KeyId RegistryKeys::FindPart(KeyId parent, std::u16string_view name) {
  const std::uint64_t generation = m_database.Generation();
  if (const KeyId* kept = m_found.Find(parent, name, generation)) return *kept;
  const std::string folded = FoldRegistryName(name);
  SqliteQuery query(m_find.Prepared());
  return m_found.Keep(parent, name, generation, query.Bind(parent).Bind(folded).Step() ? query.Number(0) : 0);
}

KeyId RegistryKeys::Find(KeyId parent, std::u16string_view path) {
  std::u16string_view part;
  KeyId key = Exists(parent) ? parent : 0;
  while (key != 0 && NextPart(path, part)) key = FindPart(key, part);
  return key;
}

bool RegistryKeys::Exists(KeyId key) {
  if (m_known.size() >= kMostKnown) m_known.clear();
  std::uint64_t& generation = m_known[key];
  if (generation == m_database.Generation()) return true;
  SqliteQuery query(m_exists.Prepared());
  if (!query.Bind(key).Step()) return false;
  generation = m_database.Generation();
  return true;
}

KeyId RegistryKeys::Create(KeyId parent, std::u16string_view path, bool& isNew) {
  isNew = false;
  if (const KeyId found = Find(parent, path)) return found;
  m_database.RequireWritable();
  RegistryDatabase::Transaction transaction(m_database);
  if (!Exists(parent)) return 0;
  KeyId key = parent;
  std::u16string_view part;
  while (NextPart(path, part)) {
    const KeyId next = isNew ? 0 : FindPart(key, part);
    isNew = next == 0;
    key = isNew ? InsertPart(key, part) : next;
  }
  transaction.Commit();
  return key;
}

KeyId RegistryKeys::InsertPart(KeyId parent, std::u16string_view name) {
  if (name.size() > kLongestName) throw SqliteError{ERROR_INVALID_PARAMETER};
  const std::string folded = FoldRegistryName(name);
  SqliteQuery query(m_insert.Prepared());
  query.Bind(parent).Bind(folded).Bind(name).Step();
  if (query.Number(1) > kDeepest) throw SqliteError{ERROR_INVALID_PARAMETER};
  return query.Number(0);
}

DWORD RegistryKeys::Delete(KeyId parent, std::u16string_view path) {
  m_database.RequireWritable();
  RegistryDatabase::Transaction transaction(m_database);
  if (!Exists(parent)) return ERROR_KEY_DELETED;
  const KeyId key = Find(parent, path);
  if (key == 0) return ERROR_FILE_NOT_FOUND;
  if (key <= kLastRoot || SqliteQuery(m_hasSubKey.Prepared()).Bind(key).Step()) return ERROR_ACCESS_DENIED;
  SqliteQuery(m_deleteValues.Prepared()).Bind(key).Step();
  SqliteQuery(m_delete.Prepared()).Bind(key).Step();
  transaction.Commit();
  return ERROR_SUCCESS;
}

const std::u16string* RegistryKeys::SubKey(KeyId key, DWORD index) {
  return m_window.At(key, index, m_database.Generation(), [&](std::vector<std::u16string>& names) {
    SqliteQuery query(m_subKeys.Prepared());
    query.Bind(key).Bind(kWindow).Bind(std::int64_t{index});
    while (query.Step()) names.push_back(query.Text(0));
  });
}

}  // namespace platform
