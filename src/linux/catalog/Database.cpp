#include "linux/catalog/Database.h"

#include <cerrno>
#include <utility>

#include "linux/PosixError.h"

namespace vantrell::linuxos::catalog {

namespace {

constexpr int kBusyMilliseconds = 10'000;

int errnoForCode(int code) {
  switch (code & 0xFF) {
    case SQLITE_PERM:
    case SQLITE_AUTH:
      return EACCES;
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
      return EBUSY;
    case SQLITE_NOMEM:
      return ENOMEM;
    case SQLITE_READONLY:
      return EROFS;
    case SQLITE_FULL:
      return ENOSPC;
    case SQLITE_CANTOPEN:
      return ENOENT;
    case SQLITE_TOOBIG:
      return EFBIG;
    case SQLITE_MISUSE:
    case SQLITE_RANGE:
    case SQLITE_ERROR:
      return EINVAL;
    default:
      return EIO;
  }
}

}  // namespace

Result<std::unique_ptr<Database>> Database::open(const std::string& path) {
  sqlite3* handle = nullptr;
  const int flags = SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE | SQLITE_OPEN_NOMUTEX;
  const int code = sqlite3_open_v2(path.c_str(), &handle, flags, nullptr);
  if (handle == nullptr) return std::unexpected(posixError(ENOMEM));
  std::unique_ptr<Database> database(new Database(handle));
  if (code != SQLITE_OK) return std::unexpected(database->error(code));
  sqlite3_extended_result_codes(handle, 1);
  sqlite3_busy_timeout(handle, kBusyMilliseconds);
  return database;
}

Database::~Database() { sqlite3_close(_handle); }

FndError Database::error(int code) {
  const int plain = code & 0xFF;
  if (plain == SQLITE_CORRUPT || plain == SQLITE_NOTADB) _sawDamage = true;
  // SQLite keeps the errno of the system call that failed; it says more than the code does.
  const int systemError = sqlite3_system_errno(_handle);
  const bool fromSystem = plain == SQLITE_IOERR || plain == SQLITE_CANTOPEN;
  const int osError = fromSystem && systemError != 0 ? systemError : errnoForCode(code);
  return FndError::posix(osError, {{"message", std::any(std::string(sqlite3_errmsg(_handle)))}});
}

Result<void> Database::execute(const char* sql) {
  const int code = sqlite3_exec(_handle, sql, nullptr, nullptr, nullptr);
  if (code != SQLITE_OK) return std::unexpected(error(code));
  return {};
}

Result<std::int64_t> Database::integer(const char* sql) {
  Statement statement(*this, sql);
  const auto row = statement.with().step();
  if (!row) return std::unexpected(row.error());
  return *row ? statement.integer(0) : 0;
}

bool Database::isReadOnly() const { return sqlite3_db_readonly(_handle, "main") == 1; }

void Statement::rewind() {
  if (_statement == nullptr) {
    _pendingError = sqlite3_prepare_v3(_database.handle(), _sql, -1, SQLITE_PREPARE_PERSISTENT,
                                       &_statement, nullptr);
  } else {
    sqlite3_reset(_statement);
    _pendingError = SQLITE_OK;
  }
}

void Statement::bind(int index, std::string_view bytes) {
  // A null pointer would bind NULL instead of an empty value.
  const char* data = bytes.data() == nullptr ? "" : bytes.data();
  note(sqlite3_bind_blob64(_statement, index, data, bytes.size(), SQLITE_STATIC));
}

void Statement::bind(int index, const FndData& bytes) {
  bind(index, std::string_view(reinterpret_cast<const char*>(bytes.data()), bytes.size()));
}

void Statement::bind(int index, Text text) {
  note(sqlite3_bind_text64(_statement, index, text.value.data(), text.value.size(), SQLITE_STATIC,
                           SQLITE_UTF8));
}

Result<bool> Statement::step() {
  const int code = _pendingError != SQLITE_OK ? _pendingError : sqlite3_step(_statement);
  if (code == SQLITE_ROW) return true;
  // The message belongs to the connection's last call, so it is taken before the reset.
  if (code == SQLITE_DONE) {
    sqlite3_reset(_statement);
    return false;
  }
  FndError error = _database.error(code);
  reset();
  return std::unexpected(std::move(error));
}

Result<void> Statement::run() {
  for (;;) {
    const auto row = step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return {};
  }
}

std::string_view Statement::bytes(int column) const {
  const auto* data = static_cast<const char*>(sqlite3_column_blob(_statement, column));
  return {data, static_cast<std::size_t>(sqlite3_column_bytes(_statement, column))};
}

Result<Transaction> Transaction::begin(Database& database) {
  const auto begun = database.execute("BEGIN IMMEDIATE");
  if (!begun) return std::unexpected(begun.error());
  return Transaction(database);
}

Transaction::Transaction(Transaction&& other) noexcept
    : _database(std::exchange(other._database, nullptr)) {}

Transaction::~Transaction() {
  // A failed statement may have rolled everything back already; then there is nothing to end.
  if (_database != nullptr && sqlite3_get_autocommit(_database->handle()) == 0) {
    static_cast<void>(_database->execute("ROLLBACK"));
  }
}

Result<void> Transaction::commit() {
  const auto committed = _database->execute("COMMIT");
  if (committed) _database = nullptr;
  return committed;
}

}  // namespace vantrell::linuxos::catalog
