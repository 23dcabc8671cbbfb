// The registry's database: keys and values in SQLite, shared by all processes of the user.
//
// The file is named by QXCORE_REGISTRY, else $XDG_DATA_HOME/qxcore/registry.db (~/.local/share where
// that is unset). It is kept in write-ahead mode: a change that was acknowledged survives the death of any
// process; after a loss of power the last changes may be missing, never half done.
//
// Reading is served from memory as long as nobody has written: SQLite counts transactions in the header
// of its shared index (a published format), which is looked at before each answer. Invariants:
//   1. an entry of a cache is good while its generation is the present one;
//   2. the generation changes before an answer whenever the header has changed since the last look;
//   3. what is put into a cache was read after that look.
#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

#include "qxcore/platform/posix/sqlite_statement.h"
#include "qxcore/platform/win32.h"

namespace platform {

using KeyId = std::int64_t;  // never used again for another key

struct RegistryValue {
  std::u16string name;
  DWORD type = REG_NONE;
  std::string data;
};

struct RegistryKeyInfo {
  DWORD subKeys, longestSubKey, values, longestValueName, longestValue;
};

class RegistryStore {
 public:
  // The store of the process, locked. Opens the database when it is not open yet, and when it may be changed
  // and the environment names another one. All members throw SqliteError and std::bad_alloc.
  class Use {
   public:
    explicit Use(bool mayChangeDatabase) : m_lock(Instance().m_mutex) { Instance().Refresh(mayChangeDatabase); }
    RegistryStore* operator->() const { return &Instance(); }

   private:
    std::lock_guard<std::mutex> m_lock;
  };

  // Nobody may write; there may be no file at all.
  bool IsReadOnly() const { return m_isReadOnly; }
  // Changes with the database: handles to keys of another one are worth nothing.
  unsigned Serial() const { return m_serial; }
  static KeyId RootId(DWORD number) { return static_cast<KeyId>(number) + 1; }

  // 0 when there is none. Empty parts of a path are passed over.
  KeyId FindKey(KeyId parent, std::u16string_view path);
  bool HasKey(KeyId key);
  // Makes what is missing of the path; 0 when the parent itself is gone.
  KeyId CreateKey(KeyId parent, std::u16string_view path, bool& isNew);
  // With its values; ERROR_ACCESS_DENIED when it has sub-keys or is a root.
  DWORD DeleteKey(KeyId parent, std::u16string_view path);
  RegistryKeyInfo Describe(KeyId key);
  // Null behind the last one; good until the next call of a member.
  const std::u16string* SubKey(KeyId key, DWORD index);

  // Null when there is none; good until the next call of a member.
  const RegistryValue* FindValue(KeyId key, std::u16string_view name);
  const RegistryValue* ValueAt(KeyId key, DWORD index);
  // False when the key is gone.
  bool SetValue(KeyId key, std::u16string_view name, DWORD type, std::string_view data);
  bool DeleteValue(KeyId key, std::u16string_view name);

 private:
  enum Sql : int;
  static constexpr int kSqlCount = 16;

  template <class Content>
  struct Cached {
    std::uint64_t generation = 0;
    Content content{};
  };
  // A name below a key, exactly as it was asked for.
  struct Place {
    KeyId key;
    std::u16string name;
  };
  struct PlaceView {
    KeyId key;
    std::u16string_view name;
  };
  struct PlaceHash {
    using is_transparent = void;
    std::size_t operator()(const PlaceView& place) const {
      return std::hash<std::u16string_view>()(place.name) * 31 + static_cast<std::size_t>(place.key);
    }
    std::size_t operator()(const Place& place) const { return (*this)(PlaceView{place.key, place.name}); }
  };
  struct PlaceEqual {
    using is_transparent = void;
    template <class A, class B>
    bool operator()(const A& a, const B& b) const {
      return a.key == b.key && a.name == b.name;
    }
  };
  template <class Content>
  using Cache = std::unordered_map<Place, Cached<Content>, PlaceHash, PlaceEqual>;
  // Neighbours in an enumeration, which is asked for one by one.
  template <class Content>
  struct Window {
    std::uint64_t generation = 0;
    KeyId key = 0;
    DWORD first = 0;
    std::vector<Content> items;
    bool Holds(KeyId wanted, DWORD index, std::uint64_t now) const {
      return generation == now && key == wanted && index >= first && index - first < items.size();
    }
  };
  struct OptionalValue {
    bool exists = false;
    RegistryValue value;
  };
  class Transaction;

  static RegistryStore& Instance();
  void Refresh(bool mayChangeDatabase);
  void LookAtHeader();
  void Open();
  void OpenFile(const char* name, int flags);
  void OpenForReading();
  void SetUp();
  void MapHeader();
  void Close();
  std::int64_t Ask(const char* sql);
  std::string FileState() const;
  SqliteStatement& Prepared(Sql sql);
  template <class Content>
  Cached<Content>& Entry(Cache<Content>& cache, KeyId key, std::u16string_view name);
  KeyId FindPart(KeyId parent, std::u16string_view name);

  std::mutex m_mutex;
  std::string m_path;
  std::string m_environment;
  std::string m_fileState;  // when opened for reading only
  SqliteHandle m_database;
  std::array<std::unique_ptr<SqliteStatement>, kSqlCount> m_statements;
  const volatile std::uint32_t* m_header = nullptr;  // of the shared index; null: ask the database each time
  std::array<std::uint32_t, 12> m_seen{};
  std::uint64_t m_generation = 1;
  unsigned m_serial = 0;
  bool m_isReadOnly = false;

  Cache<KeyId> m_keys;
  Cache<OptionalValue> m_values;
  std::unordered_map<KeyId, std::uint64_t> m_known;  // keys that are there: generation
  Window<std::u16string> m_subKeys;
  Window<RegistryValue> m_keyValues;
};

}  // namespace platform
