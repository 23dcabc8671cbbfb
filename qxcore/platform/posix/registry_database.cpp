#include "qxcore/platform/posix/registry_database.h"

#include <fcntl.h>
#include <sys/stat.h>

#include <atomic>
#include <chrono>
#include <cstdlib>
#include <thread>

#include "qxcore/platform/posix/descriptor.h"
#include "qxcore/platform/posix/user_folders.h"

namespace platform {
namespace {

constexpr int kBusyMilliseconds = 30000;
constexpr int kFormat = 1;  // of the tables, kept as the database's user version
constexpr std::int64_t kRoots = 4;

constexpr const char* kTables =
    "CREATE TABLE keys(id INTEGER PRIMARY KEY AUTOINCREMENT, parent INTEGER NOT NULL, depth INTEGER NOT NULL,"
    " folded BLOB NOT NULL, name BLOB NOT NULL, UNIQUE(parent, folded));"
    "CREATE TABLE vals(id INTEGER PRIMARY KEY, key INTEGER NOT NULL, folded BLOB NOT NULL, name BLOB NOT NULL,"
    " type INTEGER NOT NULL, data BLOB NOT NULL, UNIQUE(key, folded));"
    "CREATE INDEX vals_of_key ON vals(key);"
    "INSERT INTO keys VALUES(1, 0, 0, x'31', x'31'), (2, 0, 0, x'32', x'32'), (3, 0, 0, x'33', x'33'),"
    " (4, 0, 0, x'34', x'34');"
    "PRAGMA user_version = 1;";

const char* Environment(const char* name) {
  const char* value = std::getenv(name);
  return value == nullptr ? "" : value;
}

std::string DatabasePath(const std::string& environment) {
  return environment.empty() ? UserDataFolder() + "/qxcore/registry.db" : environment;
}

bool IsMissing(const std::string& path) {
  struct stat info;
  return stat(path.c_str(), &info) != 0 && (errno == ENOENT || errno == ENOTDIR);
}

// SQLite would make a file that everybody can read. One that is there is left alone: closing it would drop the locks
// that this process has on it.
void MakeFile(const std::string& path) {
  if (!IsMissing(path)) return;
  const Descriptor file(open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
  if (file < 0 && errno != EACCES && errno != EROFS && errno != ENOENT && errno != ENOTDIR && errno != EPERM)
    throw SqliteError{ErrorFromErrno(errno)};
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

// --- statements and transactions ---

RegistryStatement::RegistryStatement(RegistryDatabase& database, const char* sql) : m_database(database), m_sql(sql) {
  database.m_statements.push_back(this);
}

SqliteStatement& RegistryStatement::Prepared() {
  if (m_statement == nullptr) m_statement = std::make_unique<SqliteStatement>(m_database.m_database.get(), m_sql);
  return *m_statement;
}

RegistryDatabase::Transaction::Transaction(RegistryDatabase& database) : m_database(database) {
  SqliteQuery(m_database.m_begin.Prepared()).Step();
  m_database.LookAtHeader();
}

RegistryDatabase::Transaction::~Transaction() {
  // SQLite may have rolled back by itself. Should this fail, the next transaction cannot begin and says so.
  if (!m_isDone && sqlite3_get_autocommit(m_database.m_database.get()) == 0)
    sqlite3_exec(m_database.m_database.get(), "ROLLBACK", nullptr, nullptr, nullptr);
}

void RegistryDatabase::Transaction::Commit() {
  SqliteQuery(m_database.m_commit.Prepared()).Step();
  m_isDone = true;
}

// --- the present state ---

void RegistryDatabase::Refresh(bool mayChangeDatabase) {
  if (m_database == nullptr || (mayChangeDatabase && m_environment != Environment("QXCORE_REGISTRY")) ||
      (m_isReadOnly && m_fileState != FileState())) {
    Open();
  }
  LookAtHeader();
}

// The first of the header's two copies is written last, so a change that was acknowledged stands in it.
void RegistryDatabase::LookAtHeader() {
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

// What shows that somebody else has changed the database or made it one that can be written.
std::string RegistryDatabase::FileState() const {
  std::string state;
  for (const char* suffix : {"", "-wal"}) {
    struct stat info;
    if (stat((m_path + suffix).c_str(), &info) != 0) info = {};
    state += std::to_string(info.st_ino) + ' ' + std::to_string(info.st_size) + ' ' + std::to_string(info.st_mode) +
             ' ' + std::to_string(info.st_mtim.tv_sec) + '.' + std::to_string(info.st_mtim.tv_nsec) + '\n';
  }
  return state;
}

// --- opening ---

void RegistryDatabase::Open() {
  Close();
  ++m_serial;
  ++m_generation;
  m_environment = Environment("QXCORE_REGISTRY");
  m_path = DatabasePath(m_environment);
  m_isReadOnly = false;
  m_fileState = FileState();
  try {
    OpenForWriting();
  } catch (const SqliteError& error) {
    Close();
    if (error.code != ERROR_ACCESS_DENIED) throw;
    OpenForReading();
  } catch (...) {
    Close();
    throw;
  }
}

void RegistryDatabase::OpenForWriting() {
  MakeFoldersOf(m_path);
  MakeFile(m_path);
  OpenFile(m_path.c_str(), SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE);
  MakeWriteAhead();
  Run("PRAGMA synchronous = NORMAL");
  MakeTables();
  m_isReadOnly = sqlite3_db_readonly(m_database.get(), "main") != 0;
  if (!m_isReadOnly) MapHeader();
}

// Where there is no file, and none can be made, the registry is empty.
void RegistryDatabase::OpenForReading() {
  m_isReadOnly = true;
  if (OpenAsItStands()) return;
  OpenFile(":memory:", SQLITE_OPEN_READWRITE);
  Run(kTables);
}

// A file in a folder where nobody may write cannot be shared; it is read as it stands, and opened anew when
// it has changed (see Refresh). False when there is none.
bool RegistryDatabase::OpenAsItStands() {
  const std::string immutable = ImmutableUri(m_path);
  SqliteError last{ERROR_SUCCESS};
  for (const char* name : {m_path.c_str(), immutable.c_str()}) {
    try {
      OpenFile(name, SQLITE_OPEN_READONLY | SQLITE_OPEN_URI);
      if (Ask("SELECT count(*) FROM keys WHERE id <= 4") == kRoots) return true;
      last = {ERROR_BADDB};
    } catch (const SqliteError& error) {
      last = error;
    }
    Close();
  }
  if (!IsMissing(m_path)) throw last;
  return false;
}

void RegistryDatabase::OpenFile(const char* name, int flags) {
  sqlite3* database = nullptr;
  const int result = sqlite3_open_v2(name, &database, flags | SQLITE_OPEN_NOMUTEX, nullptr);
  m_database.reset(database);
  if (result != SQLITE_OK) ThrowSqlite(result, database);
  sqlite3_busy_timeout(database, kBusyMilliseconds);
}

// Changing the mode does not wait for others by itself.
void RegistryDatabase::MakeWriteAhead() {
  for (int waited = 0;; ++waited) {
    try {
      SqliteStatement statement(m_database.get(), "PRAGMA journal_mode = WAL");
      SqliteQuery query(statement);
      if (query.Step() && query.Bytes(0) == "wal") return;
      if (sqlite3_db_readonly(m_database.get(), "main") != 0) throw SqliteError{ERROR_ACCESS_DENIED};
    } catch (const SqliteError& error) {
      if (error.code != ERROR_BUSY) throw;
    }
    if (waited * 10 > kBusyMilliseconds) throw SqliteError{ERROR_BUSY};
    std::this_thread::sleep_for(std::chrono::milliseconds(10));
  }
}

void RegistryDatabase::MakeTables() {
  if (Ask("PRAGMA user_version") == 0) {
    Transaction transaction(*this);
    if (Ask("PRAGMA user_version") == 0) Run(kTables);
    transaction.Commit();
  }
  if (Ask("PRAGMA user_version") != kFormat) throw SqliteError{ERROR_BADDB};
}

// The first page of the shared index, in SQLite's own mapping, which lives as long as the connection.
void RegistryDatabase::MapHeader() {
  constexpr int kPage = 32768;
  sqlite3_file* file = nullptr;
  if (sqlite3_file_control(m_database.get(), "main", SQLITE_FCNTL_FILE_POINTER, &file) != SQLITE_OK) return;
  if (file == nullptr || file->pMethods == nullptr || file->pMethods->iVersion < 2) return;
  volatile void* page = nullptr;
  if (file->pMethods->xShmMap(file, 0, kPage, 0, &page) != SQLITE_OK) return;
  m_header = static_cast<const volatile std::uint32_t*>(page);
  m_seen = {};
}

void RegistryDatabase::Close() {
  m_header = nullptr;
  for (RegistryStatement* statement : m_statements) statement->m_statement.reset();
  m_database.reset();
}

void RegistryDatabase::Run(const char* sql) {
  const int result = sqlite3_exec(m_database.get(), sql, nullptr, nullptr, nullptr);
  if (result != SQLITE_OK) ThrowSqlite(result, m_database.get());
}

std::int64_t RegistryDatabase::Ask(const char* sql) {
  SqliteStatement statement(m_database.get(), sql);
  SqliteQuery query(statement);
  return query.Step() ? query.Number(0) : 0;
}

}  // namespace platform
