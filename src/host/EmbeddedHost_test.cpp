#include "host/EmbeddedHost.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <future>
#include <thread>

#include "platform/foundation/SerialQueue.h"

namespace vantrell::host {
namespace {

namespace fs = std::filesystem;
using testing::HasSubstr;

class EmbeddedHostTest : public testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = fs::temp_directory_path() / "vantrell-host-XXXXXX";
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    _home = fs::canonical(pattern);
    fs::create_directory(_home / "Documents");
  }
  void TearDown() override { fs::remove_all(_home); }

  HostPlaces places() {
    const auto environment = [this](const char* name) -> std::optional<std::string> {
      return std::string_view(name) == "HOME" ? std::optional(_home.native()) : std::nullopt;
    };
    const auto found =
        EmbeddedHost::places(std::nullopt, linuxos::XdgFolders(environment, "/nowhere"));
    if (!found) throw std::runtime_error(found.error().description());
    return *found;
  }

  std::unique_ptr<EmbeddedHost> start() {
    auto host = EmbeddedHost::start(places(), false);
    EXPECT_TRUE(host) << host.error().description();
    return host ? *std::move(host) : nullptr;
  }

  fs::path _home;
};

TEST_F(EmbeddedHostTest, EverythingLiesWhereTheXdgFoldersSay) {
  EXPECT_EQ(places().storageRoot, _home / "Documents");
  EXPECT_EQ(places().stateFolder, _home / ".local/state/vantrell");
  EXPECT_EQ(places().dataFolders.front(), _home / ".local/share");
}

TEST_F(EmbeddedHostTest, TheExtensionAnswersForTheStorage) {
  std::ofstream(_home / "Documents/a.txt") << "hello";
  const auto host = start();
  ASSERT_NE(host, nullptr);
  const auto url = FndURL::fileURLWithPath((_home / "Documents/a.txt").native());
  const auto identifier = host->extension()._persistentIdentifierForItemAt(url);
  ASSERT_TRUE(identifier);
  EXPECT_EQ(host->extension()._urlForItemWithPersistentIdentifier(*identifier), url);
}

TEST_F(EmbeddedHostTest, TheStorageHasBeenLookedAtWhenItStarts) {
  std::ofstream(_home / "Documents/a.txt") << "hello";
  EXPECT_EQ(start()->lookAtStart().created, 1U);
  EXPECT_EQ(start()->lookAtStart().created, 0U);
}

TEST_F(EmbeddedHostTest, AnotherHostCanStartWhenOneHasGone) {
  for (int i = 0; i < 5; ++i) EXPECT_NE(start(), nullptr);
}

TEST_F(EmbeddedHostTest, TheStateFolderIsForItsOwnerAlone) {
  const auto host = start();
  EXPECT_EQ(fs::status(places().stateFolder).permissions(), fs::perms::owner_all);
}

TEST_F(EmbeddedHostTest, ItGoesOnlyWhenNothingRunsAnyMore) {
  SerialQueue queue("test.slow");
  std::promise<void> began;
  std::promise<void> hostHasGone;
  std::promise<bool> goneTooEarly;
  auto host = start();
  queue.async([&] {
    began.set_value();
    // Long enough for a host that does not wait to be gone, and the services with it.
    const auto gone = hostHasGone.get_future().wait_for(std::chrono::milliseconds(200));
    goneTooEarly.set_value(gone == std::future_status::ready);
  });
  began.get_future().wait();
  std::thread end([&] {
    host.reset();
    hostHasGone.set_value();
  });
  EXPECT_FALSE(goneTooEarly.get_future().get());
  end.join();
}

TEST_F(EmbeddedHostTest, AModuleThatCannotBeLoadedIsAnErrorBeforeAnythingIsTouched) {
  HostPlaces broken = places();
  broken.module = "/nowhere/module.so";
  const auto host = EmbeddedHost::start(broken, false);
  ASSERT_FALSE(host);
  EXPECT_THAT(host.error().message(), HasSubstr("/nowhere/module.so"));
  EXPECT_FALSE(fs::exists(broken.stateFolder));
}

TEST_F(EmbeddedHostTest, AStateFolderThatIsAFileIsAClearError) {
  fs::create_directories(_home / ".local/state");
  std::ofstream(_home / ".local/state/vantrell") << "x";
  const auto host = EmbeddedHost::start(places(), false);
  ASSERT_FALSE(host);
  EXPECT_TRUE(host.error().is(kVantrellErrorDomain, 9));
  EXPECT_THAT(host.error().message(), HasSubstr(".local/state/vantrell"));
}

}  // namespace
}  // namespace vantrell::host
