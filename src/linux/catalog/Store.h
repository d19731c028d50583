#pragma once

#include <memory>
#include <string>

#include "linux/catalog/Database.h"
#include "linux/catalog/Differences.h"
#include "linux/catalog/DocumentFates.h"
#include "linux/catalog/DocumentNumbers.h"
#include "linux/catalog/DocumentTable.h"
#include "linux/catalog/EntryTable.h"
#include "linux/catalog/Schema.h"
#include "linux/catalog/SeenTable.h"
#include "linux/catalog/StateTable.h"

namespace vantrell::linuxos::catalog {

/// An open database with everything that reads and writes it.
///
/// Threads: as its database.
struct Store {
  Store(std::unique_ptr<Database> opened, const std::string& numbersFile,
        const std::string& storageRoot, const LogLine& log)
      : database(std::move(opened)), numbers(*database, numbersFile, storageRoot, log) {}

  /// A number that changes when another connection has written.
  Result<std::int64_t> dataVersion() {
    const auto row = _dataVersion.with().step();
    if (!row) return std::unexpected(row.error());
    const std::int64_t version = _dataVersion.integer(0);
    _dataVersion.reset();
    return version;
  }

  std::unique_ptr<Database> database;
  StateTable state{*database};
  EntryTable entries{*database};
  SeenTable seen{*database};
  DocumentTable documents{*database};
  Differences differences{*database};
  DocumentFates fates{*database, documents};
  DocumentNumbers numbers;

 private:
  Statement _dataVersion{*database, "PRAGMA data_version"};
};

}  // namespace vantrell::linuxos::catalog
