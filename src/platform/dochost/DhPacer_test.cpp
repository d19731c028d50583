#include "platform/dochost/DhPacer.h"

#include <gtest/gtest.h>

#include <atomic>
#include <condition_variable>
#include <future>
#include <mutex>
#include <thread>
#include <vector>

namespace vantrell {
namespace {

using namespace std::chrono_literals;
using Time = std::chrono::steady_clock::time_point;

constexpr std::chrono::milliseconds kInterval = 20ms;

// The moments at which a pacer's events began.
class Events {
 public:
  void add() {
    const std::lock_guard lock(_mutex);
    _times.push_back(std::chrono::steady_clock::now());
    _more.notify_all();
  }

  std::vector<Time> waitFor(std::size_t count) {
    std::unique_lock lock(_mutex);
    _more.wait(lock, [this, count] { return _times.size() >= count; });
    return _times;
  }

 private:
  std::mutex _mutex;
  std::condition_variable _more;
  std::vector<Time> _times;
};

// At its end nothing runs on the queue any more: an event may outlive its pacer, and would then
// touch what the test has taken away.
class QuietAtEnd {
 public:
  explicit QuietAtEnd(const SerialQueue& queue) : _queue(queue) {}
  ~QuietAtEnd() {
    _queue.sync([] {});
  }
  QuietAtEnd(const QuietAtEnd&) = delete;
  QuietAtEnd& operator=(const QuietAtEnd&) = delete;

 private:
  const SerialQueue& _queue;
};

// Returns once everything that was due on the queue in the next intervals has run.
void letIntervalsPass(const SerialQueue& queue) {
  std::promise<void> passed;
  queue.asyncAfter(4 * kInterval, [&passed] { passed.set_value(); });
  passed.get_future().wait();
}

TEST(DhPacerConcurrency, ABurstGivesOneEventAnInterval) {
  const SerialQueue queue("test");
  Events events;
  const QuietAtEnd quiet(queue);
  DhPacer pacer("pacer", queue, kInterval);
  pacer.setEventBlock([&events] { events.add(); });
  pacer.resume();
  const Time start = std::chrono::steady_clock::now();
  pacer.signal();
  events.waitFor(1);
  queue.sync([&pacer] {  // no event can begin in between
    for (int i = 0; i < 1000; ++i) pacer.signal();
  });
  const auto times = events.waitFor(2);
  EXPECT_GE(times[1] - start, kInterval);
  letIntervalsPass(queue);
  EXPECT_EQ(events.waitFor(2).size(), 2U);
}

TEST(DhPacerConcurrency, EventsRunOnTheQueueAndAreAnIntervalApart) {
  const SerialQueue queue("test");
  Events events;
  std::atomic<bool> elsewhere = false;
  std::atomic<bool> goOn = true;
  const QuietAtEnd quiet(queue);
  DhPacer pacer("pacer", queue, kInterval);
  pacer.setEventBlock([&] {
    if (!queue.isCurrent()) elsewhere = true;
    if (goOn) pacer.signal();  // a signal during an event asks for another one
    events.add();
  });
  pacer.resume();
  const Time start = std::chrono::steady_clock::now();
  pacer.signal();
  const auto times = events.waitFor(4);
  for (int i = 0; i < 4; ++i) {
    EXPECT_GE(times[static_cast<std::size_t>(i)] - start, i * kInterval);
  }
  EXPECT_FALSE(elsewhere);
  queue.sync([&goOn] { goOn = false; });
}

TEST(DhPacerConcurrency, SignalsWaitUntilThePacerIsResumed) {
  const SerialQueue queue("test");
  Events events;
  std::atomic<bool> resumed = false;
  std::atomic<bool> early = false;
  const QuietAtEnd quiet(queue);
  DhPacer pacer("pacer", queue, kInterval);
  pacer.setEventBlock([&] {
    if (!resumed) early = true;
    events.add();
  });
  pacer.signal();
  letIntervalsPass(queue);
  resumed = true;
  pacer.resume();
  EXPECT_EQ(events.waitFor(1).size(), 1U);
  EXPECT_FALSE(early);
}

TEST(DhPacerConcurrency, NoSignalIsLost) {
  const SerialQueue queue("test");
  std::mutex mutex;
  std::condition_variable seenMore;
  int seen = 0;
  std::atomic<int> latest = 0;
  const QuietAtEnd quiet(queue);
  DhPacer pacer("pacer", queue, 1ms);
  pacer.setEventBlock([&] {
    const std::lock_guard lock(mutex);
    seen = latest;
    seenMore.notify_all();
  });
  pacer.resume();
  for (int round = 1; round <= 100; ++round) {
    latest = round;
    pacer.signal();
    if (round % 10 != 0) continue;
    std::unique_lock lock(mutex);
    seenMore.wait(lock, [&seen, round] { return seen == round; });
  }
  const std::lock_guard lock(mutex);
  EXPECT_EQ(seen, 100);
}

TEST(DhPacerConcurrency, NoEventBeginsAfterThePacerIsGone) {
  const SerialQueue queue("test");
  std::atomic<int> count = 0;
  {
    DhPacer pacer("pacer", queue, kInterval);
    pacer.setEventBlock([&count] { ++count; });
    pacer.resume();
    queue.sync([&pacer] { pacer.signal(); });
    queue.sync([] {});
    pacer.signal();  // due only after the interval
  }
  const int before = queue.sync([&count] { return count.load(); });
  letIntervalsPass(queue);
  EXPECT_EQ(count, before);
}

TEST(DhPacerConcurrency, TheEventBlockGoesWithThePacer) {
  const SerialQueue queue("test");
  auto held = std::make_shared<int>(0);
  const std::weak_ptr<int> watched = held;
  {
    DhPacer pacer("pacer", queue, 1h);
    pacer.setEventBlock([held = std::move(held)] { ++*held; });
    pacer.resume();
    pacer.signal();
    queue.sync([] {});
    pacer.signal();  // an event that is due in an hour
  }
  waitForQuietQueues();
  EXPECT_TRUE(watched.expired());
}

}  // namespace
}  // namespace vantrell
