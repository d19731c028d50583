#pragma once

#include <atomic>
#include <cstdint>
#include <string_view>

namespace vantrell {

enum class LogLevel : std::uint8_t { Debug, Info, Error };

/// One finished line and who says it.
struct LogLine {
  LogLevel level;
  std::string_view subsystem;  ///< "com.quillon.Dochost"
  std::string_view category;   ///< "vantrell"
  std::string_view text;       ///< without newline at its end
};

/// Where log lines go. A line below `recordedLevel()` is not even put together by its writer.
///
/// Threads: `write` is called from any thread, at the same time.
class LogSink {
 public:
  virtual ~LogSink() = default;

  /// Never fails and never throws: a log that cannot be written is no reason to stop working.
  virtual void write(const LogLine& line) = 0;

  /// The least level that is kept.
  LogLevel recordedLevel() const { return _recordedLevel.load(std::memory_order_relaxed); }
  void setRecordedLevel(LogLevel level) { _recordedLevel.store(level, std::memory_order_relaxed); }
  bool records(LogLevel level) const { return level >= recordedLevel(); }

 private:
  std::atomic<LogLevel> _recordedLevel{LogLevel::Info};
};

}  // namespace vantrell
