#include "CatalogRows.h"

#include <sqlite3.h>

#include <algorithm>
#include <functional>
#include <iterator>
#include <memory>

namespace vantrell::properties {
namespace {

using Connection = std::unique_ptr<sqlite3, int (*)(sqlite3*)>;

Connection openForReading(const std::string& stateFolder) {
  const std::string address = "file:" + stateFolder + "/vantrell.db?mode=ro";
  sqlite3* handle = nullptr;
  sqlite3_open_v2(address.c_str(), &handle, SQLITE_OPEN_READONLY | SQLITE_OPEN_URI, nullptr);
  return {handle, &sqlite3_close};
}

/// Runs a query; a line for what goes wrong, none for success.
std::string forEachRow(sqlite3* handle, const char* query,
                       const std::function<void(sqlite3_stmt*)>& visit) {
  sqlite3_stmt* statement = nullptr;
  int result = sqlite3_prepare_v2(handle, query, -1, &statement, nullptr);
  while (result == SQLITE_OK || result == SQLITE_ROW) {
    result = sqlite3_step(statement);
    if (result == SQLITE_ROW) visit(statement);
  }
  const std::string trouble = result == SQLITE_DONE ? "" : sqlite3_errmsg(handle);
  sqlite3_finalize(statement);
  return trouble;
}

std::string text(sqlite3_stmt* statement, int column) {
  const void* bytes = sqlite3_column_blob(statement, column);
  const auto size = static_cast<std::size_t>(sqlite3_column_bytes(statement, column));
  return bytes == nullptr ? std::string() : std::string(static_cast<const char*>(bytes), size);
}

/// An entry as one line, so that differences can be shown as they are compared. The kind is the
/// `FileKind`, with 16 for a package and 32 for what lies inside one.
std::string line(std::uint64_t folder, const std::string& name, std::uint64_t fileID,
                 std::uint32_t kind, std::uint64_t size, std::int64_t modified,
                 std::int64_t changed) {
  return "folder " + std::to_string(folder) + " \"" + shown(name) + "\" file " +
         std::to_string(fileID) + " kind " + std::to_string(kind) + " size " +
         std::to_string(size) + " mtime " + std::to_string(modified) + " ctime " +
         std::to_string(changed);
}

std::string lineOf(const Place& place, std::uint64_t folder) {
  const bool isInside = place.standing == Standing::InsidePackage;
  const auto kind = static_cast<std::uint32_t>(place.seen.kind) |
                    (place.seen.isPackage && !isInside ? 16U : 0U) | (isInside ? 32U : 0U);
  return line(folder, place.home.name, place.seen.fileID.value, kind, place.seen.size,
              place.seen.modifiedNanoseconds, place.seen.changedNanoseconds);
}

std::vector<std::string> expectedLines(const ObservedTree& tree) {
  std::vector<std::string> lines;
  for (const Place& place : tree.places()) {
    if (place.standing != Standing::Shown && place.standing != Standing::InsidePackage) continue;
    const std::string folder = place.path().substr(0, place.path().rfind('/'));
    lines.push_back(lineOf(place, seeObject(folder).fileID.value));
  }
  std::ranges::sort(lines);
  return lines;
}

}  // namespace

std::vector<std::string> differencesFromRows(const std::string& stateFolder,
                                             const ObservedTree& tree) {
  const Connection connection = openForReading(stateFolder);
  std::vector<std::string> rows;
  const auto visit = [&rows](sqlite3_stmt* row) {
    const auto number = [row](int column) {
      return static_cast<std::uint64_t>(sqlite3_column_int64(row, column));
    };
    const auto kind = static_cast<std::uint32_t>(number(3));
    // The parts of a package count as parts, whatever their own names would make of them.
    const std::uint32_t known = (kind & 32U) != 0 ? kind & 47U : kind & 63U;
    rows.push_back(line(number(0), text(row, 1), number(2), known, number(4),
                        sqlite3_column_int64(row, 5), sqlite3_column_int64(row, 6)));
  };
  const std::string trouble =
      forEachRow(connection.get(),
                 "SELECT parent, name, fileID, kind, size, mtime, ctime FROM entries", visit);
  if (!trouble.empty()) return {"the database cannot be read: " + trouble};
  std::ranges::sort(rows);
  const std::vector<std::string> expected = expectedLines(tree);
  std::vector<std::string> missing, excess;
  std::ranges::set_difference(expected, rows, std::back_inserter(missing));
  std::ranges::set_difference(rows, expected, std::back_inserter(excess));
  std::vector<std::string> differences;
  for (const std::string& entry : missing) differences.push_back("not catalogued: " + entry);
  for (const std::string& entry : excess) differences.push_back("not on the disk: " + entry);
  return differences;
}

std::vector<std::string> damageOfDatabase(const std::string& stateFolder) {
  const Connection connection = openForReading(stateFolder);
  std::vector<std::string> damage;
  const std::string trouble =
      forEachRow(connection.get(), "PRAGMA integrity_check", [&damage](sqlite3_stmt* row) {
        if (text(row, 0) != "ok") damage.push_back(text(row, 0));
      });
  if (!trouble.empty()) damage.push_back(trouble);
  return damage;
}

}  // namespace vantrell::properties
