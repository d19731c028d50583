#include "platform/foundation/SerialQueue.h"

#include <algorithm>
#include <condition_variable>
#include <deque>
#include <mutex>
#include <optional>
#include <queue>
#include <thread>
#include <vector>

#include "platform/foundation/Fatal.h"

namespace vantrell {

// One entry of a queue: a task for the pool, or a caller that waits for its turn.
struct SerialQueue::State : std::enable_shared_from_this<State> {
  struct Waiter {
    std::condition_variable turnCame;
    bool hasTurn = false;
  };
  struct Entry {
    Task task;
    Waiter* waiter = nullptr;
  };

  explicit State(std::string text) : label(std::move(text)) {}

  const std::string label;
  std::mutex mutex;
  std::deque<Entry> entries;  // guarded by mutex
  bool busy = false;          // guarded by mutex: somebody holds the turn, or the pool will
};

namespace {

using State = SerialQueue::State;
using SteadyTime = std::chrono::steady_clock::time_point;

// The queues whose tasks this thread is inside of, outermost first.
thread_local std::vector<const State*> currentQueues;

void runOne(const std::shared_ptr<State>& state);

// The threads that all queues share. It grows while every thread is busy and work is waiting: a
// task may block on another queue's task, and a fixed pool could then wait for itself.
class Pool {
 public:
  static Pool& shared() {
    static Pool* const pool = new Pool;  // never destroyed: its threads outlive main()
    return *pool;
  }

  void submit(std::shared_ptr<State> state) {
    const std::lock_guard lock(_mutex);
    _ready.push_back(std::move(state));
    if (_idle >= _ready.size()) {
      _wake.notify_one();
    } else if (_threads < kMostThreads) {
      ++_threads;
      std::thread([this] { work(); }).detach();
    }
  }

  void submitAt(SteadyTime time, std::shared_ptr<State> state, SerialQueue::Task task) {
    const std::lock_guard lock(_timerMutex);
    _timers.push_back({time, _timerSequence++, std::move(state), std::move(task)});
    std::push_heap(_timers.begin(), _timers.end());
    if (!_timerRuns) {
      _timerRuns = true;
      std::thread([this] { runTimers(); }).detach();
    }
    _timerWake.notify_one();
  }

  void waitUntilQuiet() {
    std::unique_lock lock(_mutex);
    _quiet.wait(lock, [this] { return _ready.empty() && _idle == _threads; });
  }

 private:
  static constexpr std::size_t kMostThreads = 64;
  static constexpr std::chrono::seconds kIdleTime{10};

  struct Timer {
    SteadyTime time;
    std::uint64_t sequence;
    std::shared_ptr<State> state;
    SerialQueue::Task task;
    // A heap keeps its greatest in front: the greatest timer is the one that is due first.
    bool operator<(const Timer& other) const {
      return time != other.time ? time > other.time : sequence > other.sequence;
    }
  };

  void work() {
    std::unique_lock lock(_mutex);
    for (;;) {
      ++_idle;
      if (_ready.empty() && _idle == _threads) _quiet.notify_all();
      const bool found = _wake.wait_for(lock, kIdleTime, [this] { return !_ready.empty(); });
      --_idle;
      if (!found) break;
      const std::shared_ptr<State> state = std::move(_ready.front());
      _ready.pop_front();
      lock.unlock();
      runOne(state);
      lock.lock();
    }
    --_threads;
  }

  void runTimers();

  std::mutex _mutex;
  std::condition_variable _wake;
  std::condition_variable _quiet;
  std::deque<std::shared_ptr<State>> _ready;  // guarded by _mutex
  std::size_t _idle = 0;                      // guarded by _mutex
  std::size_t _threads = 0;                   // guarded by _mutex

  std::mutex _timerMutex;
  std::condition_variable _timerWake;
  std::vector<Timer> _timers;        // guarded by _timerMutex, a heap
  std::uint64_t _timerSequence = 0;  // guarded by _timerMutex
  bool _timerRuns = false;           // guarded by _timerMutex
};

// Hands the turn to whoever is next. Call with the turn held.
void passTurn(const std::shared_ptr<State>& state) {
  const std::lock_guard lock(state->mutex);
  if (state->entries.empty()) {
    state->busy = false;
    return;
  }
  if (State::Waiter* waiter = state->entries.front().waiter) {
    state->entries.pop_front();
    waiter->hasTurn = true;
    waiter->turnCame.notify_one();  // under the lock: the waiter lives on its caller's stack
    return;
  }
  Pool::shared().submit(state);
}

void enqueue(const std::shared_ptr<State>& state, SerialQueue::Task task) {
  const std::lock_guard lock(state->mutex);
  state->entries.push_back({std::move(task), nullptr});
  if (state->busy) return;
  state->busy = true;
  Pool::shared().submit(state);
}

// Runs the entry in front on this thread. The pool holds the queue's turn, and the entry is a
// task: passTurn() gives turns to waiters itself.
void runOne(const std::shared_ptr<State>& state) {
  SerialQueue::Task task;
  {
    const std::lock_guard lock(state->mutex);
    task = std::move(state->entries.front().task);
    state->entries.pop_front();
  }
  currentQueues.push_back(state.get());
  task();
  task = nullptr;  // what it captured goes while the queue is still the current one
  currentQueues.pop_back();
  passTurn(state);
}

void Pool::runTimers() {
  std::unique_lock lock(_timerMutex);
  for (;;) {
    if (_timers.empty()) {
      _timerWake.wait(lock);
      continue;
    }
    const SteadyTime due = _timers.front().time;
    if (std::chrono::steady_clock::now() < due) {
      _timerWake.wait_until(lock, due);
      continue;
    }
    std::pop_heap(_timers.begin(), _timers.end());
    Timer timer = std::move(_timers.back());
    _timers.pop_back();
    lock.unlock();
    enqueue(timer.state, std::move(timer.task));
    lock.lock();
  }
}

}  // namespace

SerialQueue::SerialQueue(std::string label) : _state(std::make_shared<State>(std::move(label))) {}

const std::string& SerialQueue::label() const { return _state->label; }

void SerialQueue::async(Task task) const { enqueue(_state, std::move(task)); }

void SerialQueue::asyncAfter(std::chrono::nanoseconds delay, Task task) const {
  Pool::shared().submitAt(std::chrono::steady_clock::now() + delay, _state, std::move(task));
}

bool SerialQueue::isCurrent() const {
  return std::find(currentQueues.begin(), currentQueues.end(), _state.get()) != currentQueues.end();
}

void SerialQueue::assertCurrent() const {
  if (!isCurrent()) fatalError("must run on the queue \"" + label() + "\"");
}

SerialQueue::SyncTurn::SyncTurn(const SerialQueue& queue) : _state(queue._state) {
  if (queue.isCurrent()) {
    fatalError("a synchronous call on the current queue \"" + queue.label() +
               "\" would wait for itself");
  }
  std::unique_lock lock(_state->mutex);
  if (!_state->busy) {
    _state->busy = true;
  } else {
    State::Waiter waiter;
    _state->entries.push_back({nullptr, &waiter});
    waiter.turnCame.wait(lock, [&waiter] { return waiter.hasTurn; });
  }
  lock.unlock();
  currentQueues.push_back(_state.get());
}

SerialQueue::SyncTurn::~SyncTurn() {
  currentQueues.pop_back();
  passTurn(_state);
}

void waitForQuietQueues() { Pool::shared().waitUntilQuiet(); }

}  // namespace vantrell
