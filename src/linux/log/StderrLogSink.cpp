#include "linux/log/StderrLogSink.h"

#include <unistd.h>

#include <string>

#include "linux/log/WriteWhole.h"
#include "platform/foundation/FndURL.h"

namespace vantrell::linuxos {

void StderrLogSink::write(const LogLine& line) {
  // One call for the whole line: those of several threads do not mix.
  writeWhole(STDERR_FILENO, displayText(line.text) + '\n');
}

}  // namespace vantrell::linuxos
