#include "support/TracedSection.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <latch>
#include <limits>
#include <set>
#include <thread>
#include <vector>

#include "platform/foundation/FndError.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class TracedSectionTest : public testing::Test {
 protected:
  TestSystem system;
};

Result<void> failingRequest() {
  const TracedSection section("doomed \"", "did=1", "\"");
  logDebug("inside");
  return std::unexpected(FndError::posix(5));
}

TEST_F(TracedSectionTest, ASectionBracketsTheLinesOfItsRequest) {
  {
    const TracedSection section("fetching URL for \"", "did=5", "\"");
    logDebug("inside");
  }
  EXPECT_EQ(system.log.texts(), (std::vector<std::string>{"[DEBUG] ┏0 fetching URL for \"did=5\"",
                                                          "[DEBUG] inside", "[DEBUG] ┗0"}));
  EXPECT_EQ(system.log.textsAt(LogLevel::Debug).size(), 3U);
}

TEST_F(TracedSectionTest, NumbersAreHandedOutInOpeningOrderFrom0) {
  {
    const TracedSection outer("outer");
    const TracedSection inner("inner");
  }
  const TracedSection next("next");
  EXPECT_EQ(system.log.texts(),
            (std::vector<std::string>{"[DEBUG] ┏0 outer", "[DEBUG] ┏1 inner", "[DEBUG] ┗1",
                                      "[DEBUG] ┗0", "[DEBUG] ┏2 next"}));
}

TEST_F(TracedSectionTest, ARequestThatFailsStillWritesItsClosingLine) {
  EXPECT_FALSE(failingRequest());
  EXPECT_EQ(system.log.texts(), (std::vector<std::string>{"[DEBUG] ┏0 doomed \"did=1\"",
                                                          "[DEBUG] inside", "[DEBUG] ┗0"}));
}

// Runs `count` sections on threads of their own, all open at the same time.
void openAtOnce(int count) {
  std::latch allAreOpen(count);
  std::vector<std::jthread> threads;
  for (int i = 0; i < count; ++i) {
    threads.emplace_back([&allAreOpen, i] {
      const TracedSection section("thread ", i);
      allAreOpen.arrive_and_wait();
    });
  }
}

TEST_F(
    TracedSectionTest,
    TwoRequestsTracedAtOnceGetDifferentSectionNumbersAndEachClosingLineCarriesItsOwnOpeningLinesNumber) {
  constexpr int kThreads = 16;
  openAtOnce(kThreads);
  std::multiset<std::string> opened;
  std::multiset<std::string> closed;
  for (const std::string& text : system.log.texts()) {
    const std::string opening = "[DEBUG] ┏";
    const std::string closing = "[DEBUG] ┗";
    if (text.starts_with(opening)) {
      const std::size_t space = text.find(' ', opening.size());
      opened.insert(text.substr(opening.size(), space - opening.size()));
    } else if (text.starts_with(closing)) {
      closed.insert(text.substr(closing.size()));
    }
  }
  EXPECT_EQ(std::set(opened.begin(), opened.end()).size(), std::size_t{kThreads});
  EXPECT_EQ(opened, closed);
}

TEST_F(TracedSectionTest, ASectionThatNobodyRecordsTakesNoNumber) {
  system.log.setRecordedLevel(LogLevel::Info);
  bool asked = false;
  {
    const TracedSection section([&asked] {
      asked = true;
      return "text";
    });
    system.log.setRecordedLevel(LogLevel::Debug);  // no closing line without an opening one
  }
  EXPECT_FALSE(asked);
  EXPECT_TRUE(system.log.lines().empty());
  const TracedSection section("first");
  EXPECT_EQ(system.log.texts(), std::vector<std::string>{"[DEBUG] ┏0 first"});
}

TEST(SectionCounterDeathTest, ReachingTheLargestNumberIsFatal) {
  SectionCounter counter(std::numeric_limits<std::int64_t>::max() - 1);
  EXPECT_EQ(counter.take(), std::numeric_limits<std::int64_t>::max() - 1);
  EXPECT_DEATH(counter.take(), "the numbers of log sections are used up");
}

TEST(SectionCounter, SixteenThreadsNeverGetTheSameNumber) {
  SectionCounter counter;
  std::vector<std::vector<std::int64_t>> taken(16);
  {
    std::vector<std::jthread> threads;
    for (auto& mine : taken) {
      threads.emplace_back([&counter, &mine] {
        for (int n = 0; n < 100; ++n) mine.push_back(counter.take());
      });
    }
  }
  std::set<std::int64_t> all;
  for (const auto& mine : taken) {
    EXPECT_TRUE(std::ranges::is_sorted(mine));
    all.insert(mine.begin(), mine.end());
  }
  EXPECT_EQ(all.size(), 1600U);
  EXPECT_EQ(*all.begin(), 0);
  EXPECT_EQ(*all.rbegin(), 1599);
}

}  // namespace
}  // namespace vantrell
