#pragma once

#include <cstdint>
#include <string>

#include "linux/FileDescriptor.h"
#include "platform/Clock.h"
#include "platform/foundation/Mutex.h"
#include "platform/log/LogSink.h"

namespace vantrell::linuxos {

/// Appends lines to a file that only the user may read. When it has grown to its bound it becomes
/// "<path>.1", in place of the one before, and a new one is begun: at most twice the bound is
/// kept. Several processes may write to one file. A line that cannot be written is dropped, and
/// the next one tries again.
///
/// Threads: all members may be called from any thread.
/// Lifetime: borrows the clock, which must outlive it.
class FileLogSink : public LogSink {
 public:
  /// `largestSize` is in bytes.
  FileLogSink(std::string path, Clock& clock, std::uint64_t largestSize = kLargestSize);

  void write(const LogLine& line) override;

  static constexpr std::uint64_t kLargestSize = 4 * 1024 * 1024;  // bytes

 private:
  bool openForAppending() VANTRELL_REQUIRES(_mutex);
  void rotateIfFull(std::uint64_t lineSize) VANTRELL_REQUIRES(_mutex);
  bool isStillAtItsPath() const VANTRELL_REQUIRES(_mutex);

  const std::string _path;
  Clock& _clock;
  const std::uint64_t _largestSize;
  Mutex _mutex;
  FileDescriptor _file VANTRELL_GUARDED_BY(_mutex);
};

}  // namespace vantrell::linuxos
