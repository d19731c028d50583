#include "linux/log/LogText.h"

#include <syslog.h>

#include <string_view>

#include "platform/foundation/FndURL.h"

namespace vantrell::linuxos {
namespace {

std::string_view levelName(LogLevel level) {
  switch (level) {
    case LogLevel::Debug:
      return "debug";
    case LogLevel::Info:
      return "info";
    case LogLevel::Error:
      break;
  }
  return "error";
}

}  // namespace

int syslogPriority(LogLevel level) {
  switch (level) {
    case LogLevel::Debug:
      return LOG_DEBUG;
    case LogLevel::Info:
      return LOG_INFO;
    case LogLevel::Error:
      break;
  }
  return LOG_ERR;
}

std::string logFileLine(const LogLine& line, const FndDate& date) {
  std::string text = date.description();
  text += ' ';
  text += levelName(line.level);
  text += ' ';
  text += displayText(line.subsystem);
  text += ':';
  text += displayText(line.category);
  text += ' ';
  text += displayText(line.text);
  text += '\n';
  return text;
}

}  // namespace vantrell::linuxos
