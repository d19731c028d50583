#pragma once

#include <string>

#include "platform/foundation/FndDate.h"
#include "platform/log/LogSink.h"

namespace vantrell::linuxos {

/// The priority that the system's log knows a level by (syslog.h).
int syslogPriority(LogLevel level);

/// One line of a log file, newline included: date, level, category and text. What could break a
/// line or a terminal is escaped, because names of files come through here.
std::string logFileLine(const LogLine& line, const FndDate& date);

}  // namespace vantrell::linuxos
