#pragma once

#include <string>
#include <string_view>
#include <type_traits>

#include "platform/Services.h"
#include "platform/log/LogSink.h"

namespace vantrell {

/// Appends one piece of a line: text, a number, something with a `description()`, or a callable
/// that gives one of these and is only asked when the line is written.
template <class Piece>
void appendLogPiece(std::string& text, const Piece& piece) {
  if constexpr (std::is_convertible_v<const Piece&, std::string_view>) {
    text += std::string_view(piece);
  } else if constexpr (std::is_invocable_v<const Piece&>) {
    appendLogPiece(text, piece());
  } else if constexpr (std::is_integral_v<Piece>) {
    text += std::to_string(piece);
  } else {
    text += piece.description();
  }
}

/// Who speaks in the log, and the way to the installed sink.
///
/// A line is put together from its pieces only when the sink keeps lines of its level. Whatever
/// bytes a file name has, one call writes one line: what is not printable comes out escaped.
///
/// Threads: all members may be called from any thread.
/// Lifetime: borrows its names, which are constants.
class Log {
 public:
  constexpr Log(std::string_view subsystem, std::string_view category)
      : _subsystem(subsystem), _category(category) {}

  static bool records(LogLevel level) { return platform::services().log->records(level); }

  /// Writes the pieces as they are, without a prefix that names the level.
  template <class... Pieces>
  void write(LogLevel level, const Pieces&... pieces) const {
    if (!records(level)) return;
    std::string text;
    (appendLogPiece(text, pieces), ...);
    writeText(level, text);
  }

 private:
  void writeText(LogLevel level, std::string_view text) const;

  std::string_view _subsystem;
  std::string_view _category;
};

/// The log of this program: subsystem "com.quillon.Dochost", category "vantrell".
const Log& logObject();

/// The host framework's own default log.
const Log& dh_default_log();

template <class... Pieces>
void logDebug(const Pieces&... pieces) {
  logObject().write(LogLevel::Debug, "[DEBUG] ", pieces...);
}

template <class... Pieces>
void logInfo(const Pieces&... pieces) {
  logObject().write(LogLevel::Info, "[INFO] ", pieces...);
}

template <class... Pieces>
void logError(const Pieces&... pieces) {
  logObject().write(LogLevel::Error, "[ERROR] ", pieces...);
}

/// A plain line at debug level when `expected` says that this happens in normal use, else at
/// error level.
template <class... Pieces>
void logFailure(bool expected, const Pieces&... pieces) {
  if (expected) {
    logDebug(pieces...);
  } else {
    logError(pieces...);
  }
}

}  // namespace vantrell
