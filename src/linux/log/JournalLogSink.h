#pragma once

#include <string>
#include <vector>

#include "platform/log/LogSink.h"

namespace vantrell::linuxos {

/// The fields of a journal entry, "NAME=value" each. Values may hold any byte.
std::vector<std::string> journalFields(const LogLine& line);

/// Writes to the system's journal daemon. Use it only where the daemon's socket is: without one
/// the library reports success and the line is lost.
class JournalLogSink : public LogSink {
 public:
  void write(const LogLine& line) override;
};

}  // namespace vantrell::linuxos
