#include "platform/foundation/WorkGroup.h"

#include <gtest/gtest.h>

#include <atomic>
#include <future>
#include <thread>
#include <vector>

namespace vantrell {
namespace {

TEST(WorkGroupConcurrency, NotifiesAtOnceWhenNothingIsUnderWay) {
  const SerialQueue queue("test");
  std::promise<bool> current;
  WorkGroup().notify(queue, [&] { current.set_value(queue.isCurrent()); });
  EXPECT_TRUE(current.get_future().get());
}

TEST(WorkGroupConcurrency, NotifiesOnceAfterTheLastLeave) {
  const SerialQueue queue("test");
  const WorkGroup group;
  int notified = 0;
  group.enter();
  group.enter();
  group.notify(queue, [&notified] { ++notified; });
  group.leave();
  EXPECT_EQ(queue.sync([&notified] { return notified; }), 0);
  group.leave();
  EXPECT_EQ(queue.sync([&notified] { return notified; }), 1);
  group.enter();
  group.leave();
  EXPECT_EQ(queue.sync([&notified] { return notified; }), 1);
}

TEST(WorkGroupConcurrency, WorkOnManyThreadsIsAllDoneWhenItNotifies) {
  const SerialQueue queue("test");
  const WorkGroup group;
  std::atomic<int> done = 0;
  std::vector<std::jthread> threads;
  for (int i = 0; i < 8; ++i) group.enter();
  for (int i = 0; i < 8; ++i) {
    threads.emplace_back([copy = group, &done] {
      ++done;
      copy.leave();
    });
  }
  std::promise<int> seen;
  group.notify(queue, [&] { seen.set_value(done); });
  EXPECT_EQ(seen.get_future().get(), 8);
}

TEST(WorkGroupDeathTest, LeavingMoreOftenThanEnteringEndsTheProcess) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_DEATH(WorkGroup().leave(), "a work group was left more often than entered");
}

}  // namespace
}  // namespace vantrell
