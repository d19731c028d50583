#include "platform/foundation/WorkGroup.h"

#include <mutex>
#include <utility>
#include <vector>

#include "platform/foundation/Fatal.h"

namespace vantrell {

struct WorkGroup::State {
  std::mutex mutex;
  std::size_t underWay = 0;                                          // guarded by mutex
  std::vector<std::pair<SerialQueue, SerialQueue::Task>> listeners;  // guarded by mutex
};

WorkGroup::WorkGroup() : _state(std::make_shared<State>()) {}

void WorkGroup::enter() const {
  const std::lock_guard lock(_state->mutex);
  ++_state->underWay;
}

void WorkGroup::leave() const {
  std::vector<std::pair<SerialQueue, SerialQueue::Task>> listeners;
  {
    const std::lock_guard lock(_state->mutex);
    if (_state->underWay == 0) fatalError("a work group was left more often than entered");
    if (--_state->underWay == 0) listeners.swap(_state->listeners);
  }
  for (auto& [queue, task] : listeners) queue.async(std::move(task));
}

void WorkGroup::notify(const SerialQueue& queue, SerialQueue::Task task) const {
  {
    const std::lock_guard lock(_state->mutex);
    if (_state->underWay != 0) {
      _state->listeners.emplace_back(queue, std::move(task));
      return;
    }
  }
  queue.async(std::move(task));
}

}  // namespace vantrell
