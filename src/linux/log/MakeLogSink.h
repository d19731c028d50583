#pragma once

#include <memory>
#include <string>

#include "platform/Clock.h"
#include "platform/log/LogSink.h"

namespace vantrell::linuxos {

/// Where the log may go.
struct LogSinkChoice {
  bool toStandardError = false;  ///< before all others
  std::string stateFolder;       ///< holds "vantrell.log" where there is no journal
  std::string journalSocket = "/run/systemd/journal/socket";
};

/// The kinds of sink, as `doctor` names them.
enum class LogSinkKind : std::uint8_t { StandardError, Journal, File };

LogSinkKind logSinkKind(const LogSinkChoice& choice);

/// Standard error when asked for, else the system's journal when its socket is there, else a file
/// in the state folder. `clock` must outlive the sink.
std::unique_ptr<LogSink> makeLogSink(const LogSinkChoice& choice, Clock& clock);

}  // namespace vantrell::linuxos
