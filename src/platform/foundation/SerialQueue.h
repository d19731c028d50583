#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <type_traits>
#include <utility>

namespace vantrell {

/// Runs tasks one at a time, in the order in which they were given.
///
/// A queue costs bytes, not a thread: all queues share one pool. Tasks that were given before the
/// queue's last handle went away still run.
///
/// Threads: all members may be called from any thread.
/// Lifetime: a handle; copies are the same queue.
class SerialQueue {
 public:
  using Task = std::move_only_function<void()>;

  explicit SerialQueue(std::string label);

  const std::string& label() const;

  /// Returns at once; `task` runs later on a thread of the pool.
  void async(Task task) const;
  /// As `async`, not before `delay` has passed.
  void asyncAfter(std::chrono::nanoseconds delay, Task task) const;

  /// Runs `work` after everything given before it and returns what it returns. It runs on the
  /// calling thread. On the current queue this could only wait for itself: it ends the process.
  template <class Work>
  auto sync(Work&& work) const -> std::invoke_result_t<Work> {
    const SyncTurn turn(*this);
    return std::forward<Work>(work)();
  }

  /// True on a thread that is running a task of this queue, directly or around a nested `sync`.
  bool isCurrent() const;
  /// Ends the process with the label unless `isCurrent()`.
  void assertCurrent() const;

  struct State;

 private:
  // Holds the queue's turn for a scope: taken after all earlier tasks, given back at the end.
  class SyncTurn {
   public:
    explicit SyncTurn(const SerialQueue& queue);
    ~SyncTurn();
    SyncTurn(const SyncTurn&) = delete;
    SyncTurn& operator=(const SyncTurn&) = delete;

   private:
    std::shared_ptr<State> _state;
  };

  std::shared_ptr<State> _state;
};

/// Waits until no task of any queue runs or could run, for a program that is about to take away
/// what tasks use. Tasks whose delay has not passed do not count. Called from within a task it
/// would wait for itself.
void waitForQuietQueues();

}  // namespace vantrell
