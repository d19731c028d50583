#include "linux/catalog/Schema.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <ctime>
#include <optional>
#include <string_view>

#include "linux/FileDescriptor.h"
#include "linux/PosixError.h"

namespace vantrell::linuxos::catalog {

namespace {

// The tables, one line each:
//   state      what is known of the database as a whole; one row
//   roots      where the tree begins, and which object stood there
//   entries    every catalogued name: the object that stands there, and its stamps when it was
//              looked at. Numbers that the kernel counts without sign are kept bit for bit
//   folders    every folder that was read: its ctime before it was read (0: read it again), and
//              how many catalogued names it holds
//   documents  every document ID ever given, with the object that it stands for (0: none, for
//              good) and its home: a folder and a name, or 0 and a whole path for one out of view
//   kept       the attributes that a document takes along to its next file
//   seen       where objects out of view were seen when their file ID was told
constexpr const char* kTables = R"sql(
CREATE TABLE state(
  one INTEGER PRIMARY KEY CHECK (one = 1),
  nextDocumentID INTEGER NOT NULL,
  reservedDocumentID INTEGER NOT NULL,
  stoppedCleanly INTEGER NOT NULL,
  hasIndexes INTEGER NOT NULL,
  lastLook INTEGER NOT NULL,
  lastLookDuration INTEGER NOT NULL,
  unreadableFolders INTEGER NOT NULL) STRICT;
CREATE TABLE roots(
  path BLOB PRIMARY KEY, fileID INTEGER NOT NULL, generation INTEGER NOT NULL
) STRICT, WITHOUT ROWID;
CREATE TABLE entries(
  parent INTEGER NOT NULL, name BLOB NOT NULL,
  fileID INTEGER NOT NULL, generation INTEGER NOT NULL, kind INTEGER NOT NULL,
  size INTEGER NOT NULL, mtime INTEGER NOT NULL, ctime INTEGER NOT NULL,
  PRIMARY KEY (parent, name)) STRICT, WITHOUT ROWID;
CREATE TABLE folders(
  fileID INTEGER PRIMARY KEY, generation INTEGER NOT NULL,
  ctime INTEGER NOT NULL, entryCount INTEGER NOT NULL) STRICT;
CREATE TABLE documents(
  documentID INTEGER PRIMARY KEY,
  fileID INTEGER NOT NULL, generation INTEGER NOT NULL,
  homeParent INTEGER NOT NULL, homeName BLOB NOT NULL,
  isAlive INTEGER NOT NULL, owesAttributes INTEGER NOT NULL) STRICT;
CREATE UNIQUE INDEX documentsByObject ON documents(fileID, generation) WHERE fileID <> 0;
CREATE INDEX documentsByHome ON documents(homeParent, homeName, fileID) WHERE isAlive = 1;
CREATE INDEX documentsOwing ON documents(documentID) WHERE owesAttributes = 1;
CREATE TABLE kept(
  documentID INTEGER NOT NULL, name BLOB NOT NULL, value BLOB NOT NULL,
  PRIMARY KEY (documentID, name)) STRICT, WITHOUT ROWID;
CREATE TABLE seen(
  fileID INTEGER PRIMARY KEY, generation INTEGER NOT NULL, path BLOB NOT NULL) STRICT;
INSERT INTO state VALUES (1, 0, 0, 1, 0, 0, 0, 0);
)sql";

constexpr const char* kIndexes = R"sql(
CREATE INDEX entriesByFileID ON entries(fileID);
CREATE INDEX entriesFolders ON entries(parent, name) WHERE ((kind & 15) = 1);
UPDATE state SET hasIndexes = 1;
)sql";

// "VNTR": the number in the file's header by which a database is known as this program's.
constexpr std::uint32_t kApplicationID = 0x564E5452;

// The page cache is bounded, so that a look at any tree needs the same memory.
constexpr const char* kConnectionSettings =
    "PRAGMA cache_size = -4096; PRAGMA temp_store = FILE; PRAGMA mmap_size = 0;"
    "PRAGMA synchronous = FULL; PRAGMA foreign_keys = OFF;";

std::uint32_t bigEndian(const unsigned char* bytes) {
  return std::uint32_t{bytes[0]} << 24 | std::uint32_t{bytes[1]} << 16 |
         std::uint32_t{bytes[2]} << 8 | std::uint32_t{bytes[3]};
}

enum class FileState : std::uint8_t { Empty, Ours, NoDatabase };

FndError foreignError(const std::string& path) {
  return stateUnavailable("\"" + path +
                          "\" is the database of another program. Move it away, or choose another "
                          "state folder.");
}

FndError newerError(const std::string& path, std::uint32_t version) {
  return stateUnavailable(
      "\"" + path + "\" was written by a newer version (its tables have version " +
      std::to_string(version) + ", this program knows version " + std::to_string(kSchemaVersion) +
      "). Use that version, or move the file away to start afresh.");
}

FndError unusableError(const std::string& path, const FndError& cause) {
  return stateUnavailable("can't use \"" + path + "\": " + cause.message() +
                          ". Check that the folder and the file are yours, that you may write "
                          "them, and that the disk has room.");
}

/// Reads the file's header without SQLite, which would touch the file: at offset 0 the magic
/// text, at 60 the version of the tables and at 68 the application, both big-endian.
Result<FileState> inspect(const std::string& path) {
  const FileDescriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
  const int osError = errno;
  if (!file && osError == ENOENT) return FileState::Empty;
  if (!file) return std::unexpected(unusableError(path, posixError(osError)));
  std::array<unsigned char, 100> header{};
  const ssize_t count = ::pread(file.get(), header.data(), header.size(), 0);
  const int readErrno = errno;
  if (count < 0) return std::unexpected(unusableError(path, posixError(readErrno)));
  if (count == 0) return FileState::Empty;
  constexpr std::string_view kMagic("SQLite format 3\0", 16);
  const std::string_view start(reinterpret_cast<const char*>(header.data()), kMagic.size());
  if (count < 100 || start != kMagic) return FileState::NoDatabase;
  const std::uint32_t application = bigEndian(&header[68]);
  const std::uint32_t version = bigEndian(&header[60]);
  if (application != kApplicationID) return std::unexpected(foreignError(path));
  if (version > kSchemaVersion) return std::unexpected(newerError(path, version));
  return version == kSchemaVersion ? FileState::Ours : FileState::NoDatabase;
}

/// In the rollback mode, so that what the header says is in the file itself from the first commit
/// on; the write-ahead log comes afterwards.
Result<void> createTables(Database& database) {
  auto transaction = Transaction::begin(database);
  if (!transaction) return std::unexpected(transaction.error());
  const std::string identity = "PRAGMA application_id = " + std::to_string(kApplicationID) +
                               "; PRAGMA user_version = " + std::to_string(kSchemaVersion) + ";";
  if (auto done = database.execute(identity.c_str()); !done) return done;
  if (auto done = database.execute(kTables); !done) return done;
  return transaction->commit();
}

/// Another process may have made the tables since the file was inspected; and a process that died
/// while it made them left a header that its journal has just taken back.
Result<void> prepareTables(Database& database) {
  if (auto done = database.execute(kConnectionSettings); !done) return done;
  const auto tables = database.integer("SELECT count(*) FROM sqlite_schema");
  if (!tables) return std::unexpected(tables.error());
  if (*tables == 0) {
    if (auto done = createTables(database); !done) return done;
  }
  return database.execute("PRAGMA journal_mode = WAL");
}

/// Reads every table's beginning, and all of it after a stop that was not clean.
Result<void> checkSoundness(Database& database) {
  const auto clean = database.integer("SELECT stoppedCleanly FROM state");
  if (!clean) return std::unexpected(clean.error());
  for (const char* sql : {"SELECT count(*) FROM (SELECT 1 FROM entries LIMIT 1)",
                          "SELECT count(*) FROM (SELECT 1 FROM documents LIMIT 1)",
                          "SELECT count(*) FROM (SELECT 1 FROM folders LIMIT 1)",
                          "SELECT count(*) FROM roots", "SELECT nextDocumentID FROM state"}) {
    if (const auto read = database.integer(sql); !read) return std::unexpected(read.error());
  }
  if (*clean == 1) return {};
  Statement check(database, "PRAGMA quick_check(1)");
  const auto row = check.with().step();
  if (!row) return std::unexpected(row.error());
  if (check.bytes(0) != "ok") {
    return std::unexpected(
        FndError::vantrell(VantrellErrorCode::DamagedData, std::string(check.bytes(0))));
  }
  check.reset();
  return {};
}

bool isDamage(const Database& database, const FndError& error) {
  // An SQL error means that a table or a column is missing: not what this program has made.
  return database.sawDamage() || error.isPosix(EINVAL) ||
         error.is(kVantrellErrorDomain, static_cast<int>(VantrellErrorCode::DamagedData));
}

/// None when the file is damaged.
Result<std::optional<OpenedDatabase>> tryOpen(const std::string& path, bool isNew) {
  // SQLite would let everybody read the file; what it makes beside it has the same mode.
  if (isNew) {
    const FileDescriptor made(
        ::open(path.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, 0600));
    const int osError = errno;
    if (!made) return std::unexpected(unusableError(path, posixError(osError)));
  }
  auto database = Database::open(path);
  if (!database) return std::unexpected(unusableError(path, database.error()));
  // Before the first statement: that would make a log and an index with the file's own mode,
  // which then cannot be written even when the file can be again.
  if ((*database)->isReadOnly()) {
    return std::unexpected(unusableError(path, posixError(EACCES)));
  }
  auto ready = prepareTables(**database);
  if (ready) ready = checkSoundness(**database);
  if (!ready && isDamage(**database, ready.error())) return std::nullopt;
  if (!ready) return std::unexpected(unusableError(path, ready.error()));
  const auto version = (*database)->integer("PRAGMA user_version");
  if (version && *version > kSchemaVersion) {
    return std::unexpected(newerError(path, static_cast<std::uint32_t>(*version)));
  }
  if (auto marked = (*database)->execute("UPDATE state SET stoppedCleanly = 0"); !marked) {
    return std::unexpected(unusableError(path, marked.error()));
  }
  return OpenedDatabase{std::move(*database), isNew};
}

}  // namespace

FndError stateUnavailable(const std::string& message) {
  return FndError::vantrell(VantrellErrorCode::StateUnavailable, message);
}

Result<void> setAsideDamaged(const std::string& path, const LogLine& log) {
  const std::string aside = path + ".damaged-" + std::to_string(::time(nullptr));
  std::string free = aside;
  struct stat status {};
  for (int number = 2; ::lstat(free.c_str(), &status) == 0; ++number) {
    free = aside + "-" + std::to_string(number);
  }
  // The log and its index first: without the database they mean nothing, but a new database
  // beside an old log would be damaged by it.
  for (const char* suffix : {"-wal", "-shm", "-journal", ""}) {
    const int failed = ::rename((path + suffix).c_str(), (free + suffix).c_str());
    const int osError = errno;
    if (failed != 0 && osError != ENOENT) {
      return std::unexpected(unusableError(path, posixError(osError)));
    }
  }
  log(LogLevel::Error, "the database \"" + path + "\" is damaged; it is kept as \"" + free +
                           "\", and a new one is built");
  return {};
}

Result<void> createIndexes(Database& database) {
  const auto made = database.integer("SELECT hasIndexes FROM state");
  if (!made) return std::unexpected(made.error());
  return *made == 1 ? Result<void>() : database.execute(kIndexes);
}

Result<OpenedDatabase> openDatabase(const std::string& path, const LogLine& log) {
  const auto state = inspect(path);
  if (!state) return std::unexpected(state.error());
  if (*state != FileState::NoDatabase) {
    auto opened = tryOpen(path, *state == FileState::Empty);
    if (!opened) return std::unexpected(opened.error());
    if (*opened) return std::move(**opened);
  }
  if (auto aside = setAsideDamaged(path, log); !aside) return std::unexpected(aside.error());
  auto opened = tryOpen(path, true);
  if (!opened) return std::unexpected(opened.error());
  if (!*opened) return std::unexpected(unusableError(path, posixError(EIO)));
  return std::move(**opened);
}

}  // namespace vantrell::linuxos::catalog
