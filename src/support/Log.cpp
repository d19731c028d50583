#include "support/Log.h"

#include "platform/foundation/FndURL.h"

namespace vantrell {

void Log::writeText(LogLevel level, std::string_view text) const {
  // Names may hold line feeds and bytes that are no UTF-8; a forged line must not come of it.
  const std::string shown = displayText(text);
  platform::services().log->write({level, _subsystem, _category, shown});
}

const Log& logObject() {
  static constexpr Log kLog("com.quillon.Dochost", "vantrell");
  return kLog;
}

const Log& dh_default_log() {
  static constexpr Log kLog("com.quillon.Dochost", "default");
  return kLog;
}

}  // namespace vantrell
