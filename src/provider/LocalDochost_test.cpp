#include "provider/LocalDochost.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <future>
#include <memory>
#include <vector>

#include "provider/VantrellModule.h"
#include "tests/support/ProviderTest.h"

namespace vantrell {
namespace {

using testing::ElementsAre;

class StartTest : public ProviderTest {
 protected:
  // Asks for a refresh; the future is there once it has been answered.
  std::future<std::optional<FndError>> refresh() {
    auto answer = std::make_shared<std::promise<std::optional<FndError>>>();
    auto future = answer->get_future();
    extension->_refreshInstalledAppsWithCompletionHandler(
        [answer](std::optional<FndError> error) { answer->set_value(std::move(error)); });
    return future;
  }
};

TEST_F(StartTest, TheWorkingSetIsSignalledAndSaidToBe) {
  EXPECT_THAT(system.manager.signalledContainers(),
              ElementsAre("DochostWorkingSetContainerItemIdentifier"));
  EXPECT_TRUE(hasLine(LogLevel::Info,
                      "[INFO] auto notify changes on DochostWorkingSetContainerItemIdentifier at "
                      "startup"));
}

TEST(StartWithoutHost, AHostThatCannotBeSignalledIsOnlyLogged) {
  TestSystem system;
  system.manager.failWith(FndError::posix(EPIPE));
  const LocalDochost extension;
  EXPECT_TRUE(system.log.has(LogLevel::Error,
                             "[ERROR] can't notify changes on "
                             "DochostWorkingSetContainerItemIdentifier; " +
                                 FndError::posix(EPIPE).description()));
}

TEST_F(StartTest, AnAppRefreshRunsByItselfAfterTheStart) {
  EXPECT_TRUE(system.log.waitForLineEndingWith(" pacer event"));
  extension.reset();  // so that the section is closed
  EXPECT_TRUE(hasSection("pacer event"));
}

TEST_F(StartTest, TenRefreshRequestsAreAllAnsweredOnce) {
  std::vector<std::future<std::optional<FndError>>> answers;
  for (int i = 0; i < 10; ++i) answers.push_back(refresh());
  for (auto& answer : answers) EXPECT_EQ(answer.get(), std::nullopt);
}

TEST_F(StartTest, RefreshesAreAnsweredInTheirOrder) {
  std::vector<int> order;  // touched on the refresh queue, then after the last answer
  std::promise<void> done;
  for (int i = 0; i < 5; ++i) {
    extension->_refreshInstalledAppsWithCompletionHandler([&, i](std::optional<FndError>) {
      order.push_back(i);
      if (i == 4) done.set_value();
    });
  }
  done.get_future().wait();
  EXPECT_THAT(order, ElementsAre(0, 1, 2, 3, 4));
}

TEST_F(StartTest, ARefreshMayBeAskedForFromTheAnswerOfAnother) {
  std::promise<std::optional<FndError>> second;
  extension->_refreshInstalledAppsWithCompletionHandler([&](std::optional<FndError>) {
    extension->_refreshInstalledAppsWithCompletionHandler(
        [&second](std::optional<FndError> error) { second.set_value(std::move(error)); });
  });
  EXPECT_EQ(second.get_future().get(), std::nullopt);
}

TEST_F(StartTest, NothingRunsAnyMoreOnceItIsDestroyed) {
  for (int i = 0; i < 20; ++i) {
    auto other = std::make_unique<LocalDochost>();
    other->_refreshInstalledAppsWithCompletionHandler([](std::optional<FndError>) {});
    other.reset();  // with the sanitizers this would tell of an event that comes too late
  }
  SUCCEED();
}

TEST_F(StartTest, StartAndStopOfProvidingAURLCompleteAtOnceWhateverTheURL) {
  for (const FndURL& url : {system.file("a.txt"), FndURL::fileURLWithPath("/elsewhere/gone"),
                            *FndURL::URLWithString("https://example.org/")}) {
    int completed = 0;
    const auto count = [&completed](std::optional<FndError> error) {
      EXPECT_EQ(error, std::nullopt);
      ++completed;
    };
    extension->providePlaceholderAtURL_completionHandler(url, count);
    extension->startProvidingItemAtURL_completionHandler(url, count);
    extension->itemChangedAtURL(url);
    extension->stopProvidingItemAtURL(url);
    EXPECT_EQ(completed, 2);
  }
}

TEST(VantrellModule, TheEntryRoutineCreatesTheExtension) {
  TestSystem system;
  const std::unique_ptr<DochostExtension> extension(vantrellCreateExtension());
  ASSERT_NE(dynamic_cast<LocalDochost*>(extension.get()), nullptr);
  const auto root = extension->itemForIdentifier_error(DochostRootContainerItemIdentifier);
  ASSERT_TRUE(root);
  EXPECT_EQ((*root)->filename(), "Documents");
}

}  // namespace
}  // namespace vantrell
