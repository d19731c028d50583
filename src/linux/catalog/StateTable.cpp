#include "linux/catalog/StateTable.h"

namespace vantrell::linuxos::catalog {

Result<LastLook> StateTable::lastLook() {
  Statement statement(_database, "SELECT lastLook, lastLookDuration, unreadableFolders FROM state");
  const auto row = statement.with().step();
  if (!row) return std::unexpected(row.error());
  return LastLook{statement.integer(0), std::chrono::microseconds(statement.integer(1)),
                  statement.bits(2)};
}

Result<void> StateTable::noteLook(std::int64_t timeNanoseconds, std::chrono::microseconds duration,
                                  std::uint64_t unreadableFolders) {
  Statement statement(_database,
                      "UPDATE state SET lastLook = ?1, lastLookDuration = ?2, "
                      "unreadableFolders = ?3");
  return statement.with(timeNanoseconds, std::int64_t{duration.count()}, unreadableFolders).run();
}

Result<void> StateTable::noteCleanStop() {
  return _database.execute("UPDATE state SET stoppedCleanly = 1");
}

}  // namespace vantrell::linuxos::catalog
