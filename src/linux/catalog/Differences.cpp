#include "linux/catalog/Differences.h"

namespace vantrell::linuxos::catalog {

namespace {

constexpr const char* kTable = R"sql(
CREATE TEMP TABLE IF NOT EXISTS differences(
  number INTEGER PRIMARY KEY, parent INTEGER NOT NULL, name BLOB NOT NULL,
  oldFileID INTEGER NOT NULL, oldGeneration INTEGER NOT NULL, oldKind INTEGER NOT NULL,
  newFileID INTEGER NOT NULL, newGeneration INTEGER NOT NULL, newKind INTEGER NOT NULL,
  isRecycled INTEGER NOT NULL);
CREATE INDEX IF NOT EXISTS temp.differencesByPlace ON differences(parent, name);
CREATE INDEX IF NOT EXISTS temp.differencesByOld ON differences(oldFileID) WHERE oldFileID <> 0;
CREATE INDEX IF NOT EXISTS temp.differencesByNew ON differences(newFileID) WHERE newFileID <> 0;
DELETE FROM temp.differences;
)sql";

// A name that vanished while its object appeared elsewhere is counted there, as moved.
constexpr const char* kCounts = R"sql(
SELECT
  coalesce(sum(oldFileID = 0 AND NOT wasElsewhere), 0),
  coalesce(sum(newFileID = 0 AND NOT isElsewhere), 0),
  coalesce(sum(oldFileID = 0 AND wasElsewhere), 0),
  coalesce(sum(oldFileID <> 0 AND newFileID <> 0
               AND (oldFileID <> newFileID OR oldGeneration <> newGeneration)), 0)
FROM (SELECT d.*,
  EXISTS (SELECT 1 FROM temp.differences o WHERE o.oldFileID = d.newFileID AND o.oldFileID <> 0
          AND o.oldGeneration = d.newGeneration) AS wasElsewhere,
  EXISTS (SELECT 1 FROM temp.differences o WHERE o.newFileID = d.oldFileID AND o.newFileID <> 0
          AND o.newGeneration = d.oldGeneration) AS isElsewhere
  FROM temp.differences d)
)sql";

}  // namespace

Result<void> Differences::begin() { return _database.execute(kTable); }

Result<void> Differences::record(FileID parent, std::string_view name, const Entry* before,
                                 const Entry* after) {
  static const Entry kNone;
  const Entry& old = before != nullptr ? *before : kNone;
  const Entry& now = after != nullptr ? *after : kNone;
  return _record
      .with(parent, name, old.fileID, old.generation, old.kind.bits, now.fileID, now.generation,
            now.kind.bits)
      .run();
}

Result<void> Differences::removeEntriesOfFolder(FileID folder, bool isRecycled) {
  if (auto recorded = _recordFolder.with(folder, isRecycled).run(); !recorded) return recorded;
  return _removeFolder.with(folder).run();
}

Result<std::optional<MovedFolder>> Differences::nextFolder(Statement& statement,
                                                           std::int64_t number) {
  const auto row = statement.with(number).step();
  if (!row) return std::unexpected(row.error());
  if (!*row) return std::nullopt;
  const MovedFolder folder{statement.integer(0), {statement.fileID(1), statement.bits(2)}};
  statement.reset();
  return folder;
}

Result<std::optional<MovedFolder>> Differences::nextLeftFolder(std::int64_t number) {
  return nextFolder(_nextLeftFolder, number);
}

Result<std::optional<MovedFolder>> Differences::nextAppearedFolder(std::int64_t number) {
  return nextFolder(_nextAppearedFolder, number);
}

Result<DifferenceCounts> Differences::counts() {
  Statement statement(_database, kCounts);
  const auto row = statement.with().step();
  if (!row) return std::unexpected(row.error());
  return DifferenceCounts{statement.bits(0), statement.bits(1), statement.bits(2),
                          statement.bits(3)};
}

}  // namespace vantrell::linuxos::catalog
