#include "platform/foundation/SerialQueue.h"

#include <gtest/gtest.h>

#include <atomic>
#include <future>
#include <mutex>
#include <set>
#include <thread>
#include <vector>

namespace vantrell {
namespace {

using namespace std::chrono_literals;

TEST(SerialQueueConcurrency, TasksRunInTheOrderInWhichTheyWereGiven) {
  const SerialQueue queue("test");
  std::vector<int> ran;
  for (int i = 0; i < 1000; ++i) queue.async([&ran, i] { ran.push_back(i); });
  queue.sync([] {});
  ASSERT_EQ(ran.size(), 1000U);
  for (int i = 0; i < 1000; ++i) ASSERT_EQ(ran[static_cast<std::size_t>(i)], i);
}

TEST(SerialQueueConcurrency, ATaskRunsOnAnotherThread) {
  const SerialQueue queue("test");
  std::promise<std::thread::id> ran;
  queue.async([&ran] { ran.set_value(std::this_thread::get_id()); });
  EXPECT_NE(ran.get_future().get(), std::this_thread::get_id());
}

TEST(SerialQueueConcurrency, SyncRunsOnTheCallersThreadAndGivesTheResult) {
  const SerialQueue queue("test");
  EXPECT_EQ(queue.sync([] { return std::this_thread::get_id(); }), std::this_thread::get_id());
  queue.async([] {});
  EXPECT_EQ(queue.sync([] { return std::this_thread::get_id(); }), std::this_thread::get_id());
}

TEST(SerialQueueConcurrency, SyncWaitsForWhatWasGivenBefore) {
  const SerialQueue queue("test");
  std::promise<void> release;
  bool ran = false;
  queue.async([&] {
    release.get_future().wait();
    ran = true;
  });
  std::jthread releaser([&release] { release.set_value(); });
  EXPECT_TRUE(queue.sync([&ran] { return ran; }));
}

TEST(SerialQueueConcurrency, TasksGivenDuringASyncRunAfterIt) {
  const SerialQueue queue("test");
  std::vector<int> order;
  queue.sync([&] {
    queue.async([&order] { order.push_back(2); });
    order.push_back(1);
  });
  queue.sync([&order] { order.push_back(3); });
  EXPECT_EQ(order, (std::vector{1, 2, 3}));
}

TEST(SerialQueueConcurrency, ASyncFromATaskOfAnotherQueueIsCurrentOnBoth) {
  const SerialQueue outer("outer");
  const SerialQueue inner("inner");
  std::promise<bool> both;
  outer.async([&] {
    const bool within = inner.sync([&] { return outer.isCurrent() && inner.isCurrent(); });
    both.set_value(within && outer.isCurrent() && !inner.isCurrent());
  });
  EXPECT_TRUE(both.get_future().get());
  EXPECT_FALSE(outer.isCurrent());
}

TEST(SerialQueueConcurrency, CopiesAreTheSameQueue) {
  const SerialQueue queue("test");
  const SerialQueue copy = queue;
  EXPECT_EQ(copy.label(), "test");
  EXPECT_TRUE(queue.sync([&copy] { return copy.isCurrent(); }));
  EXPECT_FALSE(queue.sync([] { return SerialQueue("test").isCurrent(); }));
}

TEST(SerialQueueConcurrency, TasksGivenBeforeTheLastHandleGoesAwayStillRun) {
  std::atomic<int> ran = 0;
  std::promise<void> last;
  {
    const SerialQueue queue("test");
    for (int i = 0; i < 100; ++i) queue.async([&ran] { ++ran; });
    queue.asyncAfter(1ms, [&last] { last.set_value(); });
  }
  last.get_future().wait();
  EXPECT_EQ(ran, 100);
}

TEST(SerialQueueConcurrency, WhatATaskHoldsGoesWhileItsQueueIsCurrent) {
  const SerialQueue queue("test");
  struct Probe {
    const SerialQueue& queue;
    std::promise<bool>& wasCurrent;
    ~Probe() { wasCurrent.set_value(queue.isCurrent()); }
  };
  std::promise<bool> wasCurrent;
  queue.async([probe = std::make_unique<Probe>(queue, wasCurrent)] {});
  EXPECT_TRUE(wasCurrent.get_future().get());
}

TEST(SerialQueueConcurrency, ADelayedTaskComesNotBeforeItsTimeAndInOrder) {
  const SerialQueue queue("test");
  const auto start = std::chrono::steady_clock::now();
  std::vector<int> order;
  std::promise<void> last;
  queue.asyncAfter(40ms, [&] {
    order.push_back(3);
    last.set_value();
  });
  queue.asyncAfter(20ms, [&order] { order.push_back(1); });
  queue.asyncAfter(20ms + 1ns, [&order] { order.push_back(2); });
  last.get_future().wait();
  EXPECT_GE(std::chrono::steady_clock::now() - start, 40ms);
  EXPECT_EQ(order, (std::vector{1, 2, 3}));
}

TEST(SerialQueueConcurrency, TenThousandQueuesShareFewThreads) {
  std::mutex mutex;
  std::set<std::thread::id> threads;
  std::promise<void> last;
  std::size_t left = 10000;
  for (int i = 0; i < 10000; ++i) {
    SerialQueue("one of many").async([&] {
      const std::lock_guard lock(mutex);
      threads.insert(std::this_thread::get_id());
      if (--left == 0) last.set_value();
    });
  }
  last.get_future().wait();
  EXPECT_LE(threads.size(), 64U);
}

TEST(SerialQueueConcurrency, BlockedTasksDoNotKeepOtherQueuesFromRunning) {
  constexpr int kBlocked = 32;
  std::promise<void> release;
  const std::shared_future<void> released(release.get_future());
  std::vector<SerialQueue> queues;
  for (int i = 0; i < kBlocked; ++i) {
    queues.emplace_back("blocked");
    queues.back().async([released] { released.wait(); });
  }
  std::promise<void> ran;
  SerialQueue("free").async([&ran] { ran.set_value(); });
  ran.get_future().wait();
  release.set_value();
  for (const SerialQueue& queue : queues) queue.sync([] {});
}

TEST(SerialQueueConcurrency, NoTwoTasksOfAQueueEverRunTogether) {
  constexpr int kThreads = 4;
  constexpr int kRounds = 1000;
  const SerialQueue queues[] = {SerialQueue("a"), SerialQueue("b"), SerialQueue("c")};
  int counts[] = {0, 0, 0};  // each touched on its queue alone
  {
    std::vector<std::jthread> threads;
    for (int t = 0; t < kThreads; ++t) {
      threads.emplace_back([&queues, &counts] {
        for (int i = 0; i < kRounds; ++i) {
          queues[0].async([&counts] { ++counts[0]; });
          queues[1].sync([&counts] { ++counts[1]; });
          queues[0].async([&queues, &counts] { queues[2].sync([&counts] { ++counts[2]; }); });
        }
      });
    }
  }
  for (int i = 0; i < 3; ++i) {
    EXPECT_EQ(queues[i].sync([&counts, i] { return counts[i]; }), kThreads * kRounds);
  }
}

TEST(SerialQueueConcurrency, QuietMeansThatEveryTaskHasRun) {
  std::atomic<int> ran = 0;
  for (int i = 0; i < 200; ++i) {
    const SerialQueue first("first");
    first.async([&ran] { SerialQueue("second").async([&ran] { ++ran; }); });
  }
  waitForQuietQueues();
  EXPECT_EQ(ran, 200);
}

class SerialQueueDeathTest : public testing::Test {
 protected:
  SerialQueueDeathTest() { GTEST_FLAG_SET(death_test_style, "threadsafe"); }
};

TEST_F(SerialQueueDeathTest, ASyncOnTheCurrentQueueEndsTheProcess) {
  const SerialQueue queue("some.label");
  EXPECT_DEATH(queue.sync([&queue] { queue.sync([] {}); }),
               "a synchronous call on the current queue \"some.label\" would wait for itself");
}

TEST_F(SerialQueueDeathTest, ASyncOnAQueueFurtherOutEndsTheProcess) {
  const SerialQueue outer("outer.label");
  const SerialQueue inner("inner.label");
  EXPECT_DEATH(outer.sync([&] { inner.sync([&] { outer.sync([] {}); }); }),
               "a synchronous call on the current queue \"outer.label\" would wait for itself");
}

TEST_F(SerialQueueDeathTest, AssertingAQueueElsewhereEndsTheProcess) {
  const SerialQueue queue("some.label");
  queue.sync([&queue] { queue.assertCurrent(); });
  EXPECT_DEATH(queue.assertCurrent(), "must run on the queue \"some.label\"");
}

}  // namespace
}  // namespace vantrell
