// A prepared statement of SQLite and one use of it.
#pragma once

#include <sqlite3.h>

#include <cerrno>
#include <cstdint>
#include <memory>
#include <new>
#include <string_view>

#include "qxcore/platform/posix/path.h"

namespace platform {

// What SQLite could not do, as the registry's functions report it.
struct SqliteError {
  DWORD code;
};

// Throws the error for a result code of this connection, which can be null.
[[noreturn]] inline void ThrowSqlite(int result, sqlite3* database) {
  switch (result & 0xFF) {
    case SQLITE_NOMEM:
      throw std::bad_alloc();
    case SQLITE_CANTOPEN: {
      const int error = database != nullptr ? sqlite3_system_errno(database) : 0;
      if (error == EMFILE || error == ENFILE || error == ENOMEM || error == EIO)
        throw SqliteError{ErrorFromErrno(error)};
      throw SqliteError{ERROR_ACCESS_DENIED};
    }
    case SQLITE_READONLY:
    case SQLITE_PERM:
    case SQLITE_AUTH:
      throw SqliteError{ERROR_ACCESS_DENIED};
    case SQLITE_FULL:
      throw SqliteError{ERROR_DISK_FULL};
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
      throw SqliteError{ERROR_BUSY};
    case SQLITE_CORRUPT:
    case SQLITE_NOTADB:
      throw SqliteError{ERROR_BADDB};
    case SQLITE_TOOBIG:
      throw SqliteError{ERROR_INVALID_PARAMETER};
    default:
      throw SqliteError{ERROR_REGISTRY_IO_FAILED};
  }
}

struct SqliteClose {
  void operator()(sqlite3* database) const { sqlite3_close_v2(database); }
};
using SqliteHandle = std::unique_ptr<sqlite3, SqliteClose>;

class SqliteStatement {
 public:
  SqliteStatement(sqlite3* database, const char* sql) {
    const int result = sqlite3_prepare_v3(database, sql, -1, SQLITE_PREPARE_PERSISTENT, &m_statement, nullptr);
    if (result != SQLITE_OK) ThrowSqlite(result, database);
  }
  SqliteStatement(const SqliteStatement&) = delete;
  SqliteStatement& operator=(const SqliteStatement&) = delete;
  ~SqliteStatement() { sqlite3_finalize(m_statement); }

  sqlite3_stmt* Get() const { return m_statement; }

 private:
  sqlite3_stmt* m_statement = nullptr;
};

// One execution. The bytes that are bound must live until its end.
class SqliteQuery {
 public:
  explicit SqliteQuery(SqliteStatement& statement) : m_statement(statement.Get()) {}
  SqliteQuery(const SqliteQuery&) = delete;
  SqliteQuery& operator=(const SqliteQuery&) = delete;
  ~SqliteQuery() {
    sqlite3_reset(m_statement);
    sqlite3_clear_bindings(m_statement);
  }

  SqliteQuery& Bind(std::int64_t number) { return Check(sqlite3_bind_int64(m_statement, ++m_bound, number)); }
  SqliteQuery& Bind(std::string_view bytes) {
    // A null pointer would be bound as NULL.
    return Check(
        sqlite3_bind_blob64(m_statement, ++m_bound, bytes.empty() ? "" : bytes.data(), bytes.size(), SQLITE_STATIC));
  }
  SqliteQuery& Bind(std::u16string_view text) {
    return Bind(std::string_view(reinterpret_cast<const char*>(text.data()), text.size() * sizeof(char16_t)));
  }

  // True: a row is there; false: done.
  bool Step() {
    const int result = sqlite3_step(m_statement);
    if (result != SQLITE_ROW && result != SQLITE_DONE) ThrowSqlite(result, sqlite3_db_handle(m_statement));
    return result == SQLITE_ROW;
  }
  std::int64_t Number(int column) const { return sqlite3_column_int64(m_statement, column); }
  std::string_view Bytes(int column) const {
    const void* bytes = sqlite3_column_blob(m_statement, column);
    const auto size = static_cast<std::size_t>(sqlite3_column_bytes(m_statement, column));
    if (bytes == nullptr) return {};
    return {static_cast<const char*>(bytes), size};
  }
  std::u16string Text(int column) const {
    const std::string_view bytes = Bytes(column);
    std::u16string text(bytes.size() / sizeof(char16_t), 0);
    bytes.copy(reinterpret_cast<char*>(text.data()), text.size() * sizeof(char16_t));
    return text;
  }

 private:
  SqliteQuery& Check(int result) {
    if (result != SQLITE_OK) ThrowSqlite(result, sqlite3_db_handle(m_statement));
    return *this;
  }

  sqlite3_stmt* m_statement;
  int m_bound = 0;
};

}  // namespace platform
