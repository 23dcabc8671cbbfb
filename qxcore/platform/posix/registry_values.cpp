#include "qxcore/platform/posix/registry_values.h"

namespace platform {
namespace {

constexpr std::int64_t kWindow = 64;
constexpr std::size_t kWindowBytes = 256 * 1024;  // or one value

RegistryValue ReadValue(const SqliteQuery& query) {
  return {query.Text(0), static_cast<DWORD>(query.Number(1)), std::string(query.Bytes(2))};
}

}  // namespace

const RegistryValue* RegistryValues::Find(KeyId key, std::u16string_view name) {
  const std::uint64_t generation = m_database.Generation();
  const std::optional<RegistryValue>* kept = m_found.Find(key, name, generation);
  if (kept == nullptr) {
    const std::string folded = FoldRegistryName(name);
    SqliteQuery query(m_find.Prepared());
    std::optional<RegistryValue> value;
    if (query.Bind(key).Bind(folded).Step()) value = ReadValue(query);
    kept = &m_found.Keep(key, name, generation, std::move(value));
  }
  return kept->has_value() ? &**kept : nullptr;
}

const RegistryValue* RegistryValues::At(KeyId key, DWORD index) {
  return m_window.At(key, index, m_database.Generation(), [&](std::vector<RegistryValue>& values) {
    SqliteQuery query(m_all.Prepared());
    query.Bind(key).Bind(kWindow).Bind(std::int64_t{index});
    for (std::size_t bytes = 0; bytes < kWindowBytes && query.Step(); bytes += values.back().data.size())
      values.push_back(ReadValue(query));
  });
}

bool RegistryValues::Set(KeyId key, std::u16string_view name, DWORD type, std::string_view data) {
  m_database.RequireWritable();
  const std::string folded = FoldRegistryName(name);
  SqliteQuery(m_set.Prepared()).Bind(key).Bind(folded).Bind(name).Bind(std::int64_t{type}).Bind(data).Step();
  return m_database.HasChanged();
}

bool RegistryValues::Delete(KeyId key, std::u16string_view name) {
  m_database.RequireWritable();
  const std::string folded = FoldRegistryName(name);
  SqliteQuery(m_delete.Prepared()).Bind(key).Bind(folded).Step();
  return m_database.HasChanged();
}

}  // namespace platform
