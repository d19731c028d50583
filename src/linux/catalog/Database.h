#pragma once

#include <sqlite3.h>

#include <bit>
#include <cstdint>
#include <memory>
#include <string>
#include <string_view>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// One connection to an SQLite database file.
///
/// Threads: use it, with its statements, from one thread at a time.
/// Lifetime: closed when destroyed; its statements must have gone by then.
class Database {
 public:
  /// Opens the file, or makes an empty one. Errors: POSIX, translated.
  static Result<std::unique_ptr<Database>> open(const std::string& path);
  ~Database();
  Database(const Database&) = delete;
  Database& operator=(const Database&) = delete;

  /// Runs statements that answer nothing. Errors: POSIX, translated.
  Result<void> execute(const char* sql);
  /// The first column of the first row, as an integer. Errors: POSIX, translated.
  Result<std::int64_t> integer(const char* sql);

  /// True once anything has answered that the file is damaged, or no database at all.
  bool sawDamage() const { return _sawDamage; }
  bool isReadOnly() const;

  /// The POSIX error for an SQLite result code that was not a success; ENOSPC, EBUSY, EROFS and
  /// the like keep their meaning, damage is EIO.
  FndError error(int code);

  sqlite3* handle() { return _handle; }

 private:
  explicit Database(sqlite3* handle) : _handle(handle) {}

  sqlite3* _handle;
  bool _sawDamage = false;
};

/// Bytes bound as TEXT; everything else that is bound as bytes is a BLOB.
struct Text {
  std::string_view value;
};

/// A prepared statement, made when it is first used. What goes wrong while it is prepared or
/// bound is told by the next `step`.
///
///     statement.with(folder, name);
///     while (auto row = statement.step()) { if (!*row) break; ... }
///
/// Threads: as its database. Lifetime: borrows the database and the text.
class Statement {
 public:
  Statement(Database& database, const char* sql) : _database(database), _sql(sql) {}
  ~Statement() { sqlite3_finalize(_statement); }
  Statement(const Statement&) = delete;
  Statement& operator=(const Statement&) = delete;

  /// Starts over with these values for ?1, ?2, ... Bytes must stay until the last `step`.
  template <class... Values>
  Statement& with(const Values&... values) {
    rewind();
    int index = 0;
    (bind(++index, values), ...);
    return *this;
  }

  /// True with a row, false at the end (the statement is then reset). Errors: POSIX, translated.
  Result<bool> step();
  /// Steps to the end.
  Result<void> run();
  /// Ends a read before its last row, so that no lock stays.
  void reset() {
    if (_statement != nullptr) sqlite3_reset(_statement);
  }

  std::int64_t integer(int column) const { return sqlite3_column_int64(_statement, column); }
  std::uint64_t bits(int column) const { return std::bit_cast<std::uint64_t>(integer(column)); }
  FileID fileID(int column) const { return FileID{bits(column)}; }
  DocumentID documentID(int column) const {
    return DocumentID{static_cast<std::uint32_t>(integer(column))};
  }
  /// The column's bytes, until the next `step`.
  std::string_view bytes(int column) const;

 private:
  void rewind();
  void note(int code) {
    if (_pendingError == SQLITE_OK) _pendingError = code;
  }
  void bind(int index, std::int64_t value) { note(sqlite3_bind_int64(_statement, index, value)); }
  void bind(int index, std::uint64_t value) { bind(index, std::bit_cast<std::int64_t>(value)); }
  void bind(int index, std::uint32_t value) { bind(index, std::int64_t{value}); }
  void bind(int index, int value) { bind(index, std::int64_t{value}); }
  void bind(int index, bool value) { bind(index, std::int64_t{value}); }
  void bind(int index, FileID value) { bind(index, value.value); }
  void bind(int index, DocumentID value) { bind(index, value.value); }
  void bind(int index, std::string_view bytes);
  void bind(int index, const std::string& bytes) { bind(index, std::string_view(bytes)); }
  void bind(int index, const FndData& bytes);
  void bind(int index, Text text);

  Database& _database;
  const char* _sql;
  sqlite3_stmt* _statement = nullptr;
  int _pendingError = SQLITE_OK;
};

/// A write transaction; rolled back when it is destroyed before `commit` has succeeded.
///
/// Threads: as its database. Lifetime: borrows the database.
class Transaction {
 public:
  /// Takes the write lock at once, so that what is read inside cannot be changed by others.
  static Result<Transaction> begin(Database& database);
  Transaction(Transaction&& other) noexcept;
  Transaction& operator=(Transaction&&) = delete;
  ~Transaction();

  /// After a success everything inside is on the disk. Errors: POSIX, translated.
  Result<void> commit();

 private:
  explicit Transaction(Database& database) : _database(&database) {}
  Database* _database;
};

}  // namespace vantrell::linuxos::catalog
