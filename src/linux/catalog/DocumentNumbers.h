#pragma once

#include <cstdint>
#include <string>

#include "linux/catalog/Database.h"
#include "linux/catalog/Schema.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// Gives out document IDs, each once, even when the database is lost or comes back from a backup.
///
/// Blocks of numbers are reserved outside the database before any number of them is told: in a
/// file beside it, flushed to the disk, and in an attribute of the storage root where that can be
/// written. Whoever finds a reservation that the database does not know of begins above it; and
/// nobody begins below the number of seconds since 2024, which is above what was given out unless
/// that was more than one a second.
///
/// Threads: as its database. Lifetime: borrows the database.
class DocumentNumbers {
 public:
  /// `file` is the path of the reservation file.
  DocumentNumbers(Database& database, std::string file, std::string storageRoot, LogLine log);

  /// The next number; call it within the transaction that stores it. Errors: EOVERFLOW when all
  /// 32-bit numbers are used up; POSIX.
  Result<DocumentID> next();

  /// Gives back what is reserved and was not used; call it within a transaction, as the last
  /// thing. Errors: POSIX; some numbers are then never used.
  Result<void> release();

 private:
  struct Stored {
    std::uint64_t next = 0;
    std::uint64_t reserved = 0;  // the first one that is not
  };

  Result<Stored> read();
  std::uint64_t firstFree(const Stored& stored) const;
  Result<void> reserve(std::uint64_t end);
  Result<void> writeFile(std::uint64_t end) const;
  void writeAttribute(std::uint64_t end) const;
  std::uint64_t readFile() const;
  std::uint64_t readAttribute() const;

  std::string _file;
  std::string _storageRoot;
  LogLine _log;
  bool _isUsed = false;  // this process has taken a number
  Statement _read;
  Statement _write;
};

}  // namespace vantrell::linuxos::catalog
