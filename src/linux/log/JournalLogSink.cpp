#include "linux/log/JournalLogSink.h"

#include <sys/uio.h>
// The location of the caller says nothing here: all lines come through this file.
#define SD_JOURNAL_SUPPRESS_LOCATION
#include <systemd/sd-journal.h>

#include "linux/log/LogText.h"

namespace vantrell::linuxos {

std::vector<std::string> journalFields(const LogLine& line) {
  return {"MESSAGE=" + std::string(line.text),
          "PRIORITY=" + std::to_string(syslogPriority(line.level)), "SYSLOG_IDENTIFIER=vantrell",
          "VANTRELL_SUBSYSTEM=" + std::string(line.subsystem),
          "VANTRELL_CATEGORY=" + std::string(line.category)};
}

void JournalLogSink::write(const LogLine& line) {
  std::vector<std::string> fields = journalFields(line);
  std::vector<iovec> parts;
  for (std::string& field : fields) parts.push_back({field.data(), field.size()});
  ::sd_journal_sendv(parts.data(), static_cast<int>(parts.size()));
}

}  // namespace vantrell::linuxos
