#pragma once

#include <condition_variable>
#include <mutex>

// Clang checks what a lock guards when the lock's type carries these; g++ does not know them.
#if defined(__clang__)
#define VANTRELL_THREAD_ANNOTATION(x) __attribute__((x))
#else
#define VANTRELL_THREAD_ANNOTATION(x)
#endif

#define VANTRELL_GUARDED_BY(x) VANTRELL_THREAD_ANNOTATION(guarded_by(x))
#define VANTRELL_REQUIRES(...) VANTRELL_THREAD_ANNOTATION(requires_capability(__VA_ARGS__))
#define VANTRELL_EXCLUDES(...) VANTRELL_THREAD_ANNOTATION(locks_excluded(__VA_ARGS__))

namespace vantrell {

/// A mutual exclusion lock that clang's thread-safety analysis understands.
class VANTRELL_THREAD_ANNOTATION(capability("mutex")) Mutex {
 public:
  void lock() VANTRELL_THREAD_ANNOTATION(acquire_capability()) { _mutex.lock(); }
  void unlock() VANTRELL_THREAD_ANNOTATION(release_capability()) { _mutex.unlock(); }

 private:
  std::mutex _mutex;
};

/// Holds a `Mutex` for a scope.
class VANTRELL_THREAD_ANNOTATION(scoped_lockable) MutexLock {
 public:
  explicit MutexLock(Mutex& mutex) VANTRELL_THREAD_ANNOTATION(acquire_capability(mutex))
      : _mutex(mutex) {
    _mutex.lock();
  }
  ~MutexLock() VANTRELL_THREAD_ANNOTATION(release_capability()) { _mutex.unlock(); }
  MutexLock(const MutexLock&) = delete;
  MutexLock& operator=(const MutexLock&) = delete;

 private:
  Mutex& _mutex;
};

/// Waits for a condition under a `Mutex` that the caller holds.
class Condition {
 public:
  void wait(Mutex& mutex) VANTRELL_REQUIRES(mutex) { _condition.wait(mutex); }
  template <class Clock, class Duration>
  void waitUntil(Mutex& mutex, const std::chrono::time_point<Clock, Duration>& time)
      VANTRELL_REQUIRES(mutex) {
    _condition.wait_until(mutex, time);
  }
  void notifyOne() { _condition.notify_one(); }
  void notifyAll() { _condition.notify_all(); }

 private:
  std::condition_variable_any _condition;
};

}  // namespace vantrell
