#pragma once

#include <condition_variable>
#include <mutex>
#include <string>
#include <vector>

#include "platform/log/LogSink.h"

namespace vantrell {

/// A line as it was written.
struct FakeLogLine {
  LogLevel level;
  std::string subsystem;
  std::string category;
  std::string text;
  bool operator==(const FakeLogLine&) const = default;
};

/// Keeps every line. It records from debug level on, until told otherwise.
///
/// Threads: any.
class FakeLogSink : public LogSink {
 public:
  FakeLogSink() { setRecordedLevel(LogLevel::Debug); }

  void write(const LogLine& line) override;

  std::vector<FakeLogLine> lines() const;
  std::vector<std::string> texts() const;
  std::vector<std::string> textsAt(LogLevel level) const;
  bool has(LogLevel level, std::string_view text) const;
  void clear();

  /// Waits until a line ends with `end`; false when none has come in half a minute.
  bool waitForLineEndingWith(std::string_view end);

 private:
  mutable std::mutex _mutex;
  std::condition_variable _grown;
  std::vector<FakeLogLine> _lines;  // guarded by _mutex
};

}  // namespace vantrell
