#include "linux/log/MakeLogSink.h"

#include <sys/stat.h>

#include "linux/log/FileLogSink.h"
#include "linux/log/JournalLogSink.h"
#include "linux/log/StderrLogSink.h"

namespace vantrell::linuxos {

LogSinkKind logSinkKind(const LogSinkChoice& choice) {
  if (choice.toStandardError) return LogSinkKind::StandardError;
  struct stat status;
  const bool hasJournal =
      ::stat(choice.journalSocket.c_str(), &status) == 0 && S_ISSOCK(status.st_mode);
  return hasJournal ? LogSinkKind::Journal : LogSinkKind::File;
}

std::unique_ptr<LogSink> makeLogSink(const LogSinkChoice& choice, Clock& clock) {
  switch (logSinkKind(choice)) {
    case LogSinkKind::StandardError:
      return std::make_unique<StderrLogSink>();
    case LogSinkKind::Journal:
      return std::make_unique<JournalLogSink>();
    case LogSinkKind::File:
      break;
  }
  return std::make_unique<FileLogSink>(choice.stateFolder + "/vantrell.log", clock);
}

}  // namespace vantrell::linuxos
