#pragma once

#include <cstdint>
#include <optional>

#include "platform/foundation/SerialQueue.h"
#include "support/Log.h"

namespace vantrell {

/// Hands out the numbers of traced sections: 0, 1, 2, … in the order of opening.
///
/// Threads: all members may be called from any thread.
/// Lifetime: one serves the process (`platform::processWide`).
class SectionCounter {
 public:
  SectionCounter() : SectionCounter(0) {}
  explicit SectionCounter(std::int64_t first) : _next(first) {}

  /// Takes the next number. Ends the process when there is no number left to go on to.
  std::int64_t take();

 private:
  SerialQueue _queue{"vantrell.log-section"};
  std::int64_t _next;  // touched on _queue
};

/// Brackets the answer to one request with an opening and a closing line in the log, both with
/// the section's number, however the request ends.
///
/// While debug lines are not recorded a section takes no number and costs one load.
///
/// Threads: a local object of the thread that works on the request.
class TracedSection {
 public:
  /// `pieces` make the text of the opening line, as `Log::write` puts them together.
  template <class... Pieces>
  explicit TracedSection(const Pieces&... pieces) {
    if (!Log::records(LogLevel::Debug)) return;
    _number = platform::processWide<SectionCounter>().take();
    logDebug("┏", *_number, " ", pieces...);
  }
  ~TracedSection();
  TracedSection(const TracedSection&) = delete;
  TracedSection& operator=(const TracedSection&) = delete;

 private:
  std::optional<std::int64_t> _number;  // none: nothing was opened, nothing is to be closed
};

}  // namespace vantrell
