#pragma once

#include <chrono>
#include <string>

#include "linux/FileDescriptor.h"
#include "platform/Clock.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos {

/// The folder that holds this system's own state, locked for one process at a time.
///
/// The lock is the kernel's, on the file "lock": it ends with the process that holds it, however
/// that ends, and what the file still says then is no obstacle. The file names the holder.
///
/// Threads: use each from one thread at a time.
/// Lifetime: the lock is held until the object is destroyed.
class StateFolder {
 public:
  /// How long `take` waits for another process: longer than one look at a large storage takes,
  /// so that commands of a script queue up, and short enough for somebody who waits.
  static constexpr std::chrono::seconds kPatience{10};

  /// Creates the folder (for its owner alone) and those above it that are missing, and takes the
  /// lock. `clock` is used during the call only. Errors: StateUnavailable, which names the
  /// process that holds the lock, or says what is wrong with the folder.
  static Result<StateFolder> take(std::string path, Clock& clock);

  StateFolder(StateFolder&&) = default;
  StateFolder& operator=(StateFolder&&) = delete;
  ~StateFolder();

  const std::string& path() const { return _path; }

 private:
  StateFolder(std::string path, FileDescriptor lock)
      : _path(std::move(path)), _lock(std::move(lock)) {}

  std::string _path;
  FileDescriptor _lock;
};

}  // namespace vantrell::linuxos
