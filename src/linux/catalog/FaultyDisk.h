#pragma once

namespace vantrell::linuxos {

/// Makes the database's writes to the disk fail: the nth of all calls that change or flush a
/// file, and those after it too when asked. In force while it lives; one at a time.
class FaultyDisk {
 public:
  enum class Fault { Once, FromThenOn };

  /// `nth` counts from 1; `code` is what SQLite is told, SQLITE_FULL or an SQLITE_IOERR.
  FaultyDisk(int nth, Fault fault, int code);
  ~FaultyDisk();

  /// How many calls have failed so far.
  int faultsInjected() const;
};

}  // namespace vantrell::linuxos
