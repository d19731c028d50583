#include "linux/system/StateFolder.h"

#include <fcntl.h>
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <functional>

#include "tests/fakes/FakeClock.h"

namespace vantrell::linuxos {
namespace {

namespace fs = std::filesystem;
using testing::AllOf;
using testing::HasSubstr;

// Lets something happen while somebody waits.
class ClockWithGuest : public FakeClock {
 public:
  explicit ClockWithGuest(std::function<void()> guest) : _guest(std::move(guest)) {}
  void rest(std::chrono::microseconds duration) override {
    FakeClock::rest(duration);
    _guest();
  }

 private:
  std::function<void()> _guest;
};

class StateFolderTest : public testing::Test {
 protected:
  void SetUp() override {
    std::string pattern = fs::temp_directory_path() / "vantrell-state-XXXXXX";
    ASSERT_NE(::mkdtemp(pattern.data()), nullptr);
    _home = pattern;
  }
  void TearDown() override { fs::remove_all(_home); }

  fs::path folder() const { return _home / "a/b/vantrell"; }
  Result<StateFolder> take() { return StateFolder::take(folder(), _clock); }

  std::string lockText() const {
    std::ifstream file(folder() / "lock");
    std::string text;
    std::getline(file, text);
    return text;
  }

  fs::path _home;
  FakeClock _clock;
};

TEST_F(StateFolderTest, ItIsMadeForItsOwnerAloneWithTheFoldersAboveIt) {
  const auto state = take();
  ASSERT_TRUE(state);
  EXPECT_EQ(state->path(), folder());
  for (const fs::path& made : {_home / "a", _home / "a/b", folder()}) {
    EXPECT_EQ(fs::status(made).permissions(), fs::perms::owner_all) << made;
  }
}

TEST_F(StateFolderTest, TheLockNamesItsHolder) {
  const auto state = take();
  EXPECT_EQ(lockText(), std::to_string(::getpid()));
}

TEST_F(StateFolderTest, ASecondOneWaitsAndIsThenToldWhoHoldsIt) {
  const auto first = take();
  ASSERT_TRUE(first);
  const auto second = take();
  ASSERT_FALSE(second);
  EXPECT_TRUE(second.error().is(kVantrellErrorDomain, 9));
  EXPECT_THAT(second.error().message(), AllOf(HasSubstr("Process " + std::to_string(::getpid())),
                                              HasSubstr(folder().native())));
  std::chrono::microseconds waited{0};
  for (const auto rest : _clock.rests()) waited += rest;
  EXPECT_EQ(waited, StateFolder::kPatience);
}

TEST_F(StateFolderTest, AHolderThatGoesWhileAnotherWaitsHandsItOver) {
  auto first = std::make_unique<StateFolder>(*take());
  ClockWithGuest clock([&first] { first.reset(); });
  EXPECT_TRUE(StateFolder::take(folder(), clock));
  EXPECT_EQ(clock.rests().size(), 1U);
}

TEST_F(StateFolderTest, TheLockIsFreeWhenItsHolderHasGone) {
  { const auto first = take(); }
  EXPECT_TRUE(take());
  EXPECT_TRUE(_clock.rests().empty());
}

TEST_F(StateFolderTest, WhatADeadProcessLeftInTheLockIsNoObstacle) {
  const pid_t child = ::fork();
  if (child == 0) {
    auto state = take();
    if (!state) ::_exit(1);
    ::kill(::getpid(), SIGKILL);
  }
  int status = 0;
  ASSERT_EQ(::waitpid(child, &status, 0), child);
  ASSERT_TRUE(WIFSIGNALED(status));
  EXPECT_EQ(lockText(), std::to_string(child));
  EXPECT_TRUE(take());
  EXPECT_TRUE(_clock.rests().empty());
}

TEST_F(StateFolderTest, AHolderThatHasNotNamedItselfIsAnotherProcess) {
  fs::create_directories(folder());
  const FileDescriptor lock(::open((folder() / "lock").c_str(), O_RDWR | O_CREAT, 0600));
  ASSERT_EQ(::flock(lock.get(), LOCK_EX), 0);
  for (const char* text : {"", "no number\n"}) {
    std::ofstream(folder() / "lock") << text;
    EXPECT_THAT(take().error().message(), testing::StartsWith("Another process is using"));
  }
}

TEST_F(StateFolderTest, ALockFileThatIsRemovedWhileSomebodyWaitsLocksNobodyOut) {
  fs::create_directories(folder());
  auto first = std::make_unique<StateFolder>(*take());
  ClockWithGuest clock([&] {
    if (first == nullptr) return;
    fs::remove(folder() / "lock");
    first.reset();
  });
  const auto second = StateFolder::take(folder(), clock);
  ASSERT_TRUE(second);
  EXPECT_FALSE(take()) << "two hold the lock";
}

TEST_F(StateFolderTest, AFileInItsPlaceIsAClearError) {
  fs::create_directories(folder().parent_path());
  std::ofstream(folder()) << "x";
  const auto state = take();
  ASSERT_FALSE(state);
  EXPECT_TRUE(state.error().is(kVantrellErrorDomain, 9));
  EXPECT_THAT(state.error().message(),
              AllOf(HasSubstr(folder().native()), HasSubstr("Not a directory")));
}

TEST_F(StateFolderTest, ALinkInPlaceOfTheLockIsNotFollowed) {
  fs::create_directories(folder());
  fs::create_symlink(_home / "target", folder() / "lock");
  EXPECT_FALSE(take());
  EXPECT_FALSE(fs::exists(_home / "target"));
}

TEST_F(StateFolderTest, AFolderThatMayNotBeWrittenIsAClearError) {
  fs::create_directories(folder());
  fs::permissions(_home, fs::perms::all);
  fs::permissions(_home / "a", fs::perms::all);
  fs::permissions(_home / "a/b", fs::perms::all);
  fs::permissions(folder(), fs::perms::owner_read | fs::perms::owner_exec | fs::perms::others_read |
                                fs::perms::others_exec);
  EXPECT_EXIT(
      {
        // The superuser may write everywhere: a child that is somebody else finds out.
        if (::geteuid() == 0 && (::setgid(65534) != 0 || ::setuid(65534) != 0)) ::_exit(2);
        const auto state = take();
        ::_exit(!state && state.error().is(kVantrellErrorDomain, 9) &&
                        state.error().message().find("Permission denied") != std::string::npos
                    ? 0
                    : 1);
      },
      testing::ExitedWithCode(0), "");
}

}  // namespace
}  // namespace vantrell::linuxos
