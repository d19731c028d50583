#pragma once

#include "platform/log/LogSink.h"

namespace vantrell::linuxos {

/// Writes each line's text to standard error.
class StderrLogSink : public LogSink {
 public:
  void write(const LogLine& line) override;
};

}  // namespace vantrell::linuxos
