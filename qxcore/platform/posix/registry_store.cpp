#include "qxcore/platform/posix/registry_store.h"

#include <sys/stat.h>

#include <atomic>
#include <cerrno>
#include <cstdlib>
#include <thread>

#include "qxcore/platform/bmp.h"
#include "qxcore/platform/posix/user_folders.h"

namespace platform {
namespace {

constexpr int kBusyMilliseconds = 30000;
constexpr int kFormat = 1;  // of the tables, kept as the database's user version
constexpr int kDeepest = 512;
constexpr KeyId kLastRoot = 4;
constexpr DWORD kWindow = 64;
constexpr std::size_t kMostCached = 50000;

constexpr const char* kTables =
    "CREATE TABLE keys(id INTEGER PRIMARY KEY AUTOINCREMENT, parent INTEGER NOT NULL, depth INTEGER NOT NULL,"
    " folded BLOB NOT NULL, name BLOB NOT NULL, UNIQUE(parent, folded));"
    "CREATE TABLE vals(id INTEGER PRIMARY KEY, key INTEGER NOT NULL, folded BLOB NOT NULL, name BLOB NOT NULL,"
    " type INTEGER NOT NULL, data BLOB NOT NULL, UNIQUE(key, folded));"
    "CREATE INDEX vals_of_key ON vals(key);"
    "INSERT INTO keys VALUES(1, 0, 0, x'31', x'31'), (2, 0, 0, x'32', x'32'), (3, 0, 0, x'33', x'33'),"
    " (4, 0, 0, x'34', x'34');";

// Names are told apart by their upper-case letters. The bytes are in the order of the code units, so that
// comparing them byte by byte gives their order.
std::string Fold(std::u16string_view name) {
  std::string folded;
  folded.reserve(name.size() * 2);
  for (const char16_t c : name) {
    const char16_t upper = ToUpperBmp(c);
    folded += static_cast<char>(upper >> 8);
    folded += static_cast<char>(upper & 0xFF);
  }
  return folded;
}

// The next part of a path that is not empty; false at its end.
bool NextPart(std::u16string_view& path, std::u16string_view& part) {
  while (!path.empty() && path.front() == '\\') path.remove_prefix(1);
  part = path.substr(0, path.find('\\'));
  path.remove_prefix(part.size());
  return !part.empty();
}

const char* Environment(const char* name) {
  const char* value = std::getenv(name);
  return value == nullptr ? "" : value;
}

std::string DatabasePath(const std::string& environment) {
  return environment.empty() ? UserDataFolder() + "/qxcore/registry.db" : environment;
}

void MakeFoldersOf(const std::string& path) {
  for (std::size_t slash = path.find('/', 1); slash != std::string::npos; slash = path.find('/', slash + 1))
    mkdir(path.substr(0, slash).c_str(), 0700);
}

// As a file of SQLite's that is taken not to change.
std::string ImmutableUri(const std::string& path) {
  std::string uri = path[0] == '/' ? "file://" : "file:";
  for (const char c : path) {
    if (c == '%' || c == '?' || c == '#') {
      char escaped[4];
      std::snprintf(escaped, sizeof escaped, "%%%02X", static_cast<unsigned char>(c));
      uri += escaped;
    } else {
      uri += c;
    }
  }
  return uri + "?immutable=1";
}

}  // namespace

enum RegistryStore::Sql : int {
  kBegin,
  kCommit,
  kRollback,
  kFindKey,
  kHasKey,
  kInsertKey,
  kHasSubKey,
  kDeleteKey,
  kDeleteValues,
  kSubKeyInfo,
  kValueInfo,
  kSubKeys,
  kFindValue,
  kValues,
  kSetValue,
  kDeleteValue,
};

SqliteStatement& RegistryStore::Prepared(Sql sql) {
  static constexpr const char* kTexts[] = {
      "BEGIN IMMEDIATE",
      "COMMIT",
      "ROLLBACK",
      "SELECT id FROM keys WHERE parent = ? AND folded = ?",
      "SELECT 1 FROM keys WHERE id = ?",
      "INSERT INTO keys(parent, depth, folded, name) SELECT ?1, depth + 1, ?2, ?3 FROM keys WHERE id = ?1 RETURNING id,"
      " depth",
      "SELECT 1 FROM keys WHERE parent = ? LIMIT 1",
      "DELETE FROM keys WHERE id = ?",
      "DELETE FROM vals WHERE key = ?",
      "SELECT count(*), ifnull(max(length(name)), 0) FROM keys WHERE parent = ?",
      "SELECT count(*), ifnull(max(length(name)), 0), ifnull(max(length(data)), 0) FROM vals WHERE key = ?",
      "SELECT name FROM keys WHERE parent = ? ORDER BY folded LIMIT ? OFFSET ?",
      "SELECT name, type, data FROM vals WHERE key = ? AND folded = ?",
      "SELECT name, type, data FROM vals INDEXED BY vals_of_key WHERE key = ? ORDER BY id LIMIT ? OFFSET ?",
      "INSERT INTO vals(key, folded, name, type, data) SELECT ?1, ?2, ?3, ?4, ?5"
      " WHERE EXISTS (SELECT 1 FROM keys WHERE id = ?1)"
      " ON CONFLICT(key, folded) DO UPDATE SET type = excluded.type, data = excluded.data",
      "DELETE FROM vals WHERE key = ? AND folded = ?"};
  static_assert(std::size(kTexts) == kSqlCount);
  auto& statement = m_statements[static_cast<std::size_t>(sql)];
  if (statement == nullptr) statement = std::make_unique<SqliteStatement>(m_database.get(), kTexts[sql]);
  return *statement;
}

// Holds the right to write from the beginning, so that what is read in it stays true.
class RegistryStore::Transaction {
 public:
  explicit Transaction(RegistryStore& store) : m_store(store) {
    SqliteQuery(m_store.Prepared(kBegin)).Step();
    m_store.LookAtHeader();
  }
  Transaction(const Transaction&) = delete;
  Transaction& operator=(const Transaction&) = delete;
  ~Transaction() {
    if (m_isDone) return;
    // SQLite may have rolled back by itself.
    try {
      if (sqlite3_get_autocommit(m_store.m_database.get()) == 0) SqliteQuery(m_store.Prepared(kRollback)).Step();
    } catch (...) {
    }
  }
  void Commit() {
    SqliteQuery(m_store.Prepared(kCommit)).Step();
    m_isDone = true;
  }

 private:
  RegistryStore& m_store;
  bool m_isDone = false;
};

// --- opening ---

// Never destroyed: programs may use the registry in their own last moments. What is open when the process
// ends is closed before, which tidies the files up.
RegistryStore& RegistryStore::Instance() {
  static RegistryStore* const store = [] {
    auto* made = new RegistryStore;
    std::atexit([] {
      const std::lock_guard<std::mutex> lock(Instance().m_mutex);
      Instance().Close();
    });
    return made;
  }();
  return *store;
}

void RegistryStore::Refresh(bool mayChangeDatabase) {
  if (m_database == nullptr || (mayChangeDatabase && m_environment != Environment("QXCORE_REGISTRY")) ||
      (m_isReadOnly && m_fileState != FileState())) {
    Open();
  }
  LookAtHeader();
}

// The first of the header's two copies is written last, so a change that was acknowledged stands in it.
void RegistryStore::LookAtHeader() {
  if (m_header == nullptr) {
    ++m_generation;
    return;
  }
  std::array<std::uint32_t, 12> now;
  for (std::size_t i = 0; i < now.size(); ++i) now[i] = m_header[i];
  std::atomic_thread_fence(std::memory_order_acquire);
  if (now == m_seen) return;
  m_seen = now;
  ++m_generation;
}

void RegistryStore::Open() {
  Close();
  ++m_serial;
  ++m_generation;
  m_environment = Environment("QXCORE_REGISTRY");
  m_path = DatabasePath(m_environment);
  m_isReadOnly = false;
  m_fileState = FileState();
  MakeFoldersOf(m_path);
  try {
    OpenFile(m_path.c_str(), SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE);
    SetUp();
    m_isReadOnly = sqlite3_db_readonly(m_database.get(), "main") != 0;
    if (!m_isReadOnly) MapHeader();
  } catch (const SqliteError& error) {
    Close();
    if (error.code != ERROR_ACCESS_DENIED) throw;
    OpenForReading();
  } catch (...) {
    Close();
    throw;
  }
}

void RegistryStore::OpenFile(const char* name, int flags) {
  sqlite3* database = nullptr;
  const int result = sqlite3_open_v2(name, &database, flags | SQLITE_OPEN_NOMUTEX, nullptr);
  m_database.reset(database);
  if (result != SQLITE_OK) ThrowSqlite(result);
  sqlite3_busy_timeout(database, kBusyMilliseconds);
}

// A file in a folder where nobody may write cannot be shared; it is read as it stands, and opened anew when
// it has changed (see Refresh). Where there is no file either, the registry is empty.
void RegistryStore::OpenForReading() {
  m_isReadOnly = true;
  const std::string immutable = ImmutableUri(m_path);
  for (const char* name : {m_path.c_str(), immutable.c_str()}) {
    try {
      OpenFile(name, SQLITE_OPEN_READONLY | SQLITE_OPEN_URI);
      if (Ask("SELECT count(*) FROM keys WHERE id <= 4") == kLastRoot) return;
    } catch (const SqliteError&) {
    }
    Close();
  }
  OpenFile(":memory:", SQLITE_OPEN_READWRITE);
  const int result = sqlite3_exec(m_database.get(), kTables, nullptr, nullptr, nullptr);
  if (result != SQLITE_OK) ThrowSqlite(result);
}

void RegistryStore::SetUp() {
  // Changing to write-ahead mode does not wait for others by itself.
  for (int waited = 0;; ++waited) {
    try {
      SqliteStatement statement(m_database.get(), "PRAGMA journal_mode = WAL");
      SqliteQuery query(statement);
      if (query.Step() && query.Bytes(0) == "wal") break;
      if (sqlite3_db_readonly(m_database.get(), "main") != 0) throw SqliteError{ERROR_ACCESS_DENIED};
    } catch (const SqliteError& error) {
      if (error.code != ERROR_BUSY || waited * 10 > kBusyMilliseconds) throw;
    }
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
  }
  sqlite3_exec(m_database.get(), "PRAGMA synchronous = NORMAL", nullptr, nullptr, nullptr);
  if (Ask("PRAGMA user_version") == 0) {
    Transaction transaction(*this);
    if (Ask("PRAGMA user_version") == 0) {
      const int result = sqlite3_exec(m_database.get(), (std::string(kTables) + "PRAGMA user_version = 1;").c_str(),
                                      nullptr, nullptr, nullptr);
      if (result != SQLITE_OK) ThrowSqlite(result);
      transaction.Commit();
    }
  }
  if (Ask("PRAGMA user_version") != kFormat) throw SqliteError{ERROR_BADDB};
}

std::int64_t RegistryStore::Ask(const char* sql) {
  SqliteStatement statement(m_database.get(), sql);
  SqliteQuery query(statement);
  return query.Step() ? query.Number(0) : 0;
}

// The first page of the shared index, in SQLite's own mapping, which lives as long as the connection.
void RegistryStore::MapHeader() {
  constexpr int kPage = 32768;
  sqlite3_file* file = nullptr;
  if (sqlite3_file_control(m_database.get(), "main", SQLITE_FCNTL_FILE_POINTER, &file) != SQLITE_OK) return;
  if (file == nullptr || file->pMethods == nullptr || file->pMethods->iVersion < 2) return;
  volatile void* page = nullptr;
  if (file->pMethods->xShmMap(file, 0, kPage, 0, &page) != SQLITE_OK) return;
  m_header = static_cast<const volatile std::uint32_t*>(page);
  m_seen = {};
}

void RegistryStore::Close() {
  m_header = nullptr;
  for (auto& statement : m_statements) statement.reset();
  m_database.reset();
  m_keys.clear();
  m_values.clear();
  m_known.clear();
}

// What shows that somebody else has changed the database or made it one that can be written.
std::string RegistryStore::FileState() const {
  std::string state;
  for (const char* suffix : {"", "-wal"}) {
    struct stat info;
    if (stat((m_path + suffix).c_str(), &info) != 0) info = {};
    state += std::to_string(info.st_ino) + ' ' + std::to_string(info.st_size) + ' ' + std::to_string(info.st_mode) +
             ' ' + std::to_string(info.st_mtim.tv_sec) + '.' + std::to_string(info.st_mtim.tv_nsec) + '\n';
  }
  return state;
}

// --- keys ---

template <class Content>
RegistryStore::Cached<Content>& RegistryStore::Entry(Cache<Content>& cache, KeyId key, std::u16string_view name) {
  const auto found = cache.find(PlaceView{key, name});
  if (found != cache.end()) return found->second;
  if (cache.size() >= kMostCached) cache.clear();
  return cache[Place{key, std::u16string(name)}];
}

KeyId RegistryStore::FindPart(KeyId parent, std::u16string_view name) {
  auto& entry = Entry(m_keys, parent, name);
  if (entry.generation == m_generation) return entry.content;
  const std::string folded = Fold(name);
  SqliteQuery query(Prepared(kFindKey));
  entry.content = query.Bind(parent).Bind(folded).Step() ? query.Number(0) : 0;
  entry.generation = m_generation;
  return entry.content;
}

KeyId RegistryStore::FindKey(KeyId parent, std::u16string_view path) {
  std::u16string_view part;
  KeyId key = HasKey(parent) ? parent : 0;
  while (key != 0 && NextPart(path, part)) key = FindPart(key, part);
  return key;
}

bool RegistryStore::HasKey(KeyId key) {
  if (m_known.size() >= kMostCached) m_known.clear();
  std::uint64_t& generation = m_known[key];
  if (generation == m_generation) return true;
  SqliteQuery query(Prepared(kHasKey));
  if (!query.Bind(key).Step()) return false;
  generation = m_generation;
  return true;
}

KeyId RegistryStore::CreateKey(KeyId parent, std::u16string_view path, bool& isNew) {
  isNew = false;
  const KeyId found = FindKey(parent, path);
  if (found != 0 || m_isReadOnly) {
    if (found == 0) throw SqliteError{ERROR_ACCESS_DENIED};
    return found;
  }
  Transaction transaction(*this);
  if (!HasKey(parent)) return 0;
  KeyId key = parent;
  std::u16string_view part;
  while (NextPart(path, part)) {
    const KeyId next = isNew ? 0 : FindPart(key, part);
    if (next != 0) {
      key = next;
      continue;
    }
    if (part.size() > 255) throw SqliteError{ERROR_INVALID_PARAMETER};
    const std::string folded = Fold(part);
    SqliteQuery query(Prepared(kInsertKey));
    query.Bind(key).Bind(folded).Bind(part).Step();
    if (query.Number(1) > kDeepest) throw SqliteError{ERROR_INVALID_PARAMETER};
    key = query.Number(0);
    isNew = true;
  }
  transaction.Commit();
  return key;
}

DWORD RegistryStore::DeleteKey(KeyId parent, std::u16string_view path) {
  if (m_isReadOnly) return ERROR_ACCESS_DENIED;
  Transaction transaction(*this);
  if (!HasKey(parent)) return ERROR_KEY_DELETED;
  const KeyId key = FindKey(parent, path);
  if (key == 0) return ERROR_FILE_NOT_FOUND;
  if (key <= kLastRoot || SqliteQuery(Prepared(kHasSubKey)).Bind(key).Step()) return ERROR_ACCESS_DENIED;
  SqliteQuery(Prepared(kDeleteValues)).Bind(key).Step();
  SqliteQuery(Prepared(kDeleteKey)).Bind(key).Step();
  transaction.Commit();
  return ERROR_SUCCESS;
}

RegistryKeyInfo RegistryStore::Describe(KeyId key) {
  SqliteQuery subKeys(Prepared(kSubKeyInfo)), values(Prepared(kValueInfo));
  subKeys.Bind(key).Step();
  values.Bind(key).Step();
  return {static_cast<DWORD>(subKeys.Number(0)), static_cast<DWORD>(subKeys.Number(1) / 2),
          static_cast<DWORD>(values.Number(0)), static_cast<DWORD>(values.Number(1) / 2),
          static_cast<DWORD>(values.Number(2))};
}

const std::u16string* RegistryStore::SubKey(KeyId key, DWORD index) {
  if (!m_subKeys.Holds(key, index, m_generation)) {
    m_subKeys = {m_generation, key, index, {}};
    SqliteQuery query(Prepared(kSubKeys));
    query.Bind(key).Bind(std::int64_t{kWindow}).Bind(std::int64_t{index});
    while (query.Step()) m_subKeys.items.push_back(query.Text(0));
  }
  return m_subKeys.items.empty() ? nullptr : &m_subKeys.items[index - m_subKeys.first];
}

// --- values ---

namespace {

RegistryValue ReadValue(const SqliteQuery& query) {
  return {query.Text(0), static_cast<DWORD>(query.Number(1)), std::string(query.Bytes(2))};
}

}  // namespace

const RegistryValue* RegistryStore::FindValue(KeyId key, std::u16string_view name) {
  auto& entry = Entry(m_values, key, name);
  if (entry.generation != m_generation) {
    const std::string folded = Fold(name);
    SqliteQuery query(Prepared(kFindValue));
    entry.content.exists = query.Bind(key).Bind(folded).Step();
    entry.content.value = entry.content.exists ? ReadValue(query) : RegistryValue();
    entry.generation = m_generation;
  }
  return entry.content.exists ? &entry.content.value : nullptr;
}

const RegistryValue* RegistryStore::ValueAt(KeyId key, DWORD index) {
  if (!m_keyValues.Holds(key, index, m_generation)) {
    m_keyValues = {m_generation, key, index, {}};
    SqliteQuery query(Prepared(kValues));
    query.Bind(key).Bind(std::int64_t{kWindow}).Bind(std::int64_t{index});
    while (query.Step()) m_keyValues.items.push_back(ReadValue(query));
  }
  return m_keyValues.items.empty() ? nullptr : &m_keyValues.items[index - m_keyValues.first];
}

bool RegistryStore::SetValue(KeyId key, std::u16string_view name, DWORD type, std::string_view data) {
  if (m_isReadOnly) throw SqliteError{ERROR_ACCESS_DENIED};
  const std::string folded = Fold(name);
  SqliteQuery(Prepared(kSetValue)).Bind(key).Bind(folded).Bind(name).Bind(std::int64_t{type}).Bind(data).Step();
  return sqlite3_changes(m_database.get()) > 0;
}

bool RegistryStore::DeleteValue(KeyId key, std::u16string_view name) {
  if (m_isReadOnly) throw SqliteError{ERROR_ACCESS_DENIED};
  const std::string folded = Fold(name);
  SqliteQuery(Prepared(kDeleteValue)).Bind(key).Bind(folded).Step();
  return sqlite3_changes(m_database.get()) > 0;
}

}  // namespace platform
