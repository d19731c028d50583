#pragma once

#include <memory>

#include "platform/foundation/SerialQueue.h"

namespace vantrell {

/// Counts pieces of work that are under way and tells when none is left.
///
/// Threads: all members may be called from any thread.
/// Lifetime: a handle; copies are the same group.
class WorkGroup {
 public:
  WorkGroup();

  void enter() const;
  /// Each `leave` answers one `enter`; one too many ends the process.
  void leave() const;
  /// Runs `task` on `queue` once, as soon as nothing is under way: at once when nothing is now.
  void notify(const SerialQueue& queue, SerialQueue::Task task) const;

 private:
  struct State;
  std::shared_ptr<State> _state;
};

}  // namespace vantrell
