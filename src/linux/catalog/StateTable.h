#pragma once

#include <chrono>
#include <cstdint>

#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// What is remembered of the last look at everything.
struct LastLook {
  std::int64_t timeNanoseconds = 0;  ///< since 1970; 0 when there was none
  std::chrono::microseconds duration{0};
  std::uint64_t unreadableFolders = 0;
};

/// The one row that says what is known of the database as a whole.
///
/// Errors of all members: POSIX, the database's, translated.
/// Threads: as its database. Lifetime: borrows the database.
class StateTable {
 public:
  explicit StateTable(Database& database) : _database(database) {}

  Result<LastLook> lastLook();
  Result<void> noteLook(std::int64_t timeNanoseconds, std::chrono::microseconds duration,
                        std::uint64_t unreadableFolders);
  /// Says that the next start need not check the whole database.
  Result<void> noteCleanStop();

 private:
  Database& _database;
};

}  // namespace vantrell::linuxos::catalog
