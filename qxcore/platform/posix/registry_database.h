// The registry's database: a file of SQLite's, shared by all processes of the user.
//
// The file is named by QXCORE_REGISTRY, else $XDG_DATA_HOME/qxcore/registry.db (~/.local/share where that is unset).
// A new one is readable for its user alone. It is kept in write-ahead mode: a change that was acknowledged survives
// the death of any process; after a loss of power the last changes may be missing, never half done.
//
// Answers can be kept as long as nobody has written: SQLite counts transactions in the header of its shared index
// (a published format), which is looked at before each answer. Invariants:
//   1. what was read is good while its generation is the present one;
//   2. the generation changes before an answer whenever the header has changed since the last look;
//   3. what is kept under a generation was read after that look.
#pragma once

#include <array>
#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "qxcore/platform/posix/sqlite_statement.h"

namespace platform {

class RegistryDatabase;

// A statement of the registry's, prepared at its first use, and anew for another database.
class RegistryStatement {
 public:
  // `sql` must live as long as the statement, and the statement as long as the database.
  RegistryStatement(RegistryDatabase& database, const char* sql);
  RegistryStatement(const RegistryStatement&) = delete;
  RegistryStatement& operator=(const RegistryStatement&) = delete;

  SqliteStatement& Prepared();

 private:
  friend class RegistryDatabase;
  RegistryDatabase& m_database;
  const char* m_sql;
  std::unique_ptr<SqliteStatement> m_statement;
};

// Members throw SqliteError and std::bad_alloc. Who uses it sees to it that one thread at a time does.
class RegistryDatabase {
 public:
  RegistryDatabase() = default;
  RegistryDatabase(const RegistryDatabase&) = delete;
  RegistryDatabase& operator=(const RegistryDatabase&) = delete;

  // Before each use: opens the database when it is not open yet, and when it may be changed and the environment
  // names another one. What stands in the way of opening it now is tried again at the next use.
  void Refresh(bool mayChangeDatabase);
  void Close();

  // Nobody may write; there may be no file at all.
  bool IsReadOnly() const { return m_isReadOnly; }
  void RequireWritable() const {
    if (m_isReadOnly) throw SqliteError{ERROR_ACCESS_DENIED};
  }
  // Changes with the database: handles to keys of another one are worth nothing.
  unsigned Serial() const { return m_serial; }
  // Changes when somebody has written.
  std::uint64_t Generation() const { return m_generation; }
  // Rows that the last statement changed.
  bool HasChanged() const { return sqlite3_changes(m_database.get()) > 0; }

  // Holds the right to write from the beginning, so that what is read in it stays true. Undone unless committed.
  class Transaction {
   public:
    explicit Transaction(RegistryDatabase& database);
    Transaction(const Transaction&) = delete;
    Transaction& operator=(const Transaction&) = delete;
    ~Transaction();
    void Commit();

   private:
    RegistryDatabase& m_database;
    bool m_isDone = false;
  };

 private:
  friend class RegistryStatement;

  void Open();
  void OpenForWriting();
  void OpenForReading();
  bool OpenAsItStands();
  void OpenFile(const char* name, int flags);
  void MakeWriteAhead();
  void MakeTables();
  void MapHeader();
  void LookAtHeader();
  void Run(const char* sql);
  std::int64_t Ask(const char* sql);
  std::string FileState() const;

  std::string m_path;
  std::string m_environment;
  std::string m_fileState;  // when opened for reading only
  SqliteHandle m_database;
  std::vector<RegistryStatement*> m_statements;
  RegistryStatement m_begin{*this, "BEGIN IMMEDIATE"}, m_commit{*this, "COMMIT"};
  const volatile std::uint32_t* m_header = nullptr;  // of the shared index; null: ask the database each time
  std::array<std::uint32_t, 12> m_seen{};
  std::uint64_t m_generation = 1;
  unsigned m_serial = 0;
  bool m_isReadOnly = false;
};

}  // namespace platform
