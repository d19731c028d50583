#include "platform/dochost/DhPacer.h"

#include <algorithm>
#include <optional>
#include <utility>

#include "platform/foundation/Mutex.h"

namespace vantrell {

struct DhPacer::State : std::enable_shared_from_this<State> {
  using Time = std::chrono::steady_clock::time_point;

  State(std::string text, SerialQueue target, std::chrono::milliseconds least)
      : name(std::move(text)), queue(std::move(target)), interval(least) {}

  void scheduleIfDue() VANTRELL_REQUIRES(mutex) {
    if (!resumed || !signalled || scheduled) return;
    scheduled = true;
    const Time now = std::chrono::steady_clock::now();
    const Time due = lastEvent ? std::max(now, *lastEvent + interval) : now;
    queue.asyncAfter(due - now, [weak = weak_from_this()] {
      if (const auto self = weak.lock()) self->fire();
    });
  }

  void fire() {
    {
      const MutexLock lock(mutex);
      scheduled = false;
      signalled = false;  // before the block: a signal during it asks for another event
      lastEvent = std::chrono::steady_clock::now();
    }
    if (block) block();
  }

  const std::string name;
  const SerialQueue queue;
  const std::chrono::milliseconds interval;
  std::function<void()> block;
  Mutex mutex;
  bool resumed VANTRELL_GUARDED_BY(mutex) = false;
  bool signalled VANTRELL_GUARDED_BY(mutex) = false;
  bool scheduled VANTRELL_GUARDED_BY(mutex) = false;
  std::optional<Time> lastEvent VANTRELL_GUARDED_BY(mutex);
};

DhPacer::DhPacer(std::string name, SerialQueue queue, std::chrono::milliseconds minimumInterval)
    : _state(std::make_shared<State>(std::move(name), std::move(queue), minimumInterval)) {}

DhPacer::~DhPacer() = default;

void DhPacer::setEventBlock(std::function<void()> block) { _state->block = std::move(block); }

void DhPacer::resume() {
  const MutexLock lock(_state->mutex);
  _state->resumed = true;
  _state->scheduleIfDue();
}

void DhPacer::signal() {
  const MutexLock lock(_state->mutex);
  _state->signalled = true;
  _state->scheduleIfDue();
}

}  // namespace vantrell
