#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>

#include "platform/foundation/SerialQueue.h"

namespace vantrell {

/// Turns bursts of signals into events that are at least an interval apart. A signal that comes
/// while an event is due is answered by that event; none is ever lost.
///
/// Threads: all members may be called from any thread; the event block runs on the queue.
/// Lifetime: no event begins after the pacer is gone; one that is running ends by itself.
class DhPacer {
 public:
  DhPacer(std::string name, SerialQueue queue, std::chrono::milliseconds minimumInterval);
  ~DhPacer();
  DhPacer(const DhPacer&) = delete;
  DhPacer& operator=(const DhPacer&) = delete;

  /// Set it before the first `resume`.
  void setEventBlock(std::function<void()> block);
  /// A pacer begins suspended: signals wait until it is resumed.
  void resume();
  void signal();

 private:
  struct State;
  std::shared_ptr<State> _state;
};

}  // namespace vantrell
