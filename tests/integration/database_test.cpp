// What becomes of the state folder: damage, strangers, and a second process.

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/file.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

namespace fs = std::filesystem;
using testing::AllOf;
using testing::HasSubstr;

constexpr int kStateUnavailable = 9;

// Where a database file keeps the numbers that say whose it is and how it is laid out.
constexpr long kUserVersionOffset = 60;
constexpr long kApplicationIDOffset = 68;

class StateDatabase : public VantrellTest {
 protected:
  void SetUp() override {
    VantrellTest::SetUp();
    _file = write("a.txt", "x");
    _identifier = identifierOf(_file);
    fs::remove(stateFolder() / "vantrell.db-wal");
  }

  void overwrite(long offset, const std::string& bytes) {
    std::fstream file(database(), std::ios::in | std::ios::out | std::ios::binary);
    file.seekp(offset);
    file << bytes;
    ASSERT_TRUE(file.flush());
  }

  std::vector<std::string> setAside() const {
    std::vector<std::string> names;
    for (const auto& entry : fs::directory_iterator(stateFolder())) {
      const std::string name = entry.path().filename();
      if (name.starts_with("vantrell.db.damaged-")) names.push_back(name);
    }
    return names;
  }

  // A new database was begun: listing works, and the old number names nobody else.
  void expectAFreshStart() {
    EXPECT_EQ(vantrell({"ls"}).status, 0);
    EXPECT_FALSE(setAside().empty());
    const Outcome old = vantrell({"path", _identifier});
    const std::string fresh = identifierOf(_file);
    if (old.status == 0) {
      EXPECT_EQ(old.out, _file + "\n");
    } else {
      EXPECT_NE(fresh, _identifier) << "a number that was refused is told again";
    }
  }

  void expectRefusedAndUntouched(const std::string& reason) {
    const std::string before = contentOf(database());
    const Json refused = error({"ls"});
    EXPECT_EQ(refused["code"], kStateUnavailable);
    EXPECT_THAT(refused["message"], HasSubstr(reason));
    EXPECT_EQ(contentOf(database()), before);
    EXPECT_TRUE(setAside().empty());
  }

  std::string _file;
  std::string _identifier;
};

TEST_F(StateDatabase, OneThatIsCutIsSetAsideAndBegunAnew) {
  fs::resize_file(database(), fs::file_size(database()) / 2);
  expectAFreshStart();
}

TEST_F(StateDatabase, OneThatIsOverwrittenIsSetAsideAndBegunAnew) {
  overwrite(0, std::string(static_cast<std::size_t>(fs::file_size(database())), '\xa5'));
  expectAFreshStart();
}

TEST_F(StateDatabase, OneThatIsGoneIsBegunAnewAndNoNumberIsToldTwice) {
  fs::remove_all(stateFolder());
  const std::string other = identifierOf(write("b.txt", "y"));
  EXPECT_NE(other, _identifier);
  EXPECT_NE(vantrell({"path", _identifier}).out, path("b.txt") + "\n");
}

TEST_F(StateDatabase, AForeignOneIsRefusedAndLeftAlone) {
  overwrite(kApplicationIDOffset, "\x12\x34\x56\x78");
  expectRefusedAndUntouched("vantrell.db");
}

TEST_F(StateDatabase, OneOfANewerVersionIsRefusedAndLeftAlone) {
  overwrite(kUserVersionOffset, std::string("\x7f\x00\x00\x00", 4));
  expectRefusedAndUntouched("newer");
}

TEST_F(StateDatabase, AFolderThatMayNotBeWrittenIsRefused) {
  fs::permissions(stateFolder(), fs::perms::owner_read | fs::perms::owner_exec);
  Invocation invoked = invocation({"--json", "ls"});
  if (::geteuid() == 0) {
    run({{"chown", "-R", "65534", home()}, {}, ""});
    fs::permissions(database(), fs::perms::owner_read);
    invoked.user = 65534;
  }
  fs::permissions(stateFolder() / "lock", fs::perms::owner_read);
  const Outcome refused = run(invoked);
  EXPECT_EQ(refused.status, 1);
  EXPECT_EQ(Json::parse(refused.err)["code"], kStateUnavailable) << refused.err;
}

TEST_F(StateDatabase, AFileThatMayNotBeWrittenIsRefused) {
  fs::permissions(database(), fs::perms::owner_read);
  Invocation invoked = invocation({"--json", "ls"});
  if (::geteuid() == 0) {
    run({{"chown", "-R", "65534", home()}, {}, ""});
    invoked.user = 65534;
  }
  const Outcome refused = run(invoked);
  EXPECT_EQ(refused.status, 1);
  EXPECT_EQ(Json::parse(refused.err)["code"], kStateUnavailable) << refused.err;
  fs::permissions(database(), fs::perms::owner_read | fs::perms::owner_write);
  EXPECT_EQ(run(invoked).status, 0);
}

TEST_F(StateDatabase, ASecondProcessIsToldWhichOneHoldsTheStateFolder) {
  const int lock = ::open((stateFolder() / "lock").c_str(), O_RDWR | O_CLOEXEC);
  ASSERT_EQ(::flock(lock, LOCK_EX), 0);
  ASSERT_EQ(::pwrite(lock, "4711\n", 5, 0), 5);
  const Json refused = error({"ls"});
  EXPECT_EQ(refused["code"], kStateUnavailable);
  EXPECT_THAT(refused["message"],
              AllOf(HasSubstr("Process 4711"), HasSubstr(stateFolder().native())));
  ::close(lock);
  EXPECT_EQ(vantrell({"ls"}).status, 0) << "what a dead process left is no obstacle";
}

TEST_F(StateDatabase, CommandsAtOneTimeTakeTurns) {
  std::vector<std::unique_ptr<RunningProgram>> programs;
  for (int i = 0; i < 8; ++i) {
    programs.push_back(std::make_unique<RunningProgram>(invocation({"id", "a.txt"})));
  }
  for (const auto& program : programs) EXPECT_EQ(program->wait(), 0);
  EXPECT_EQ(identifierOf(_file), _identifier);
}

TEST_F(StateDatabase, TwoStoragesInTurnKeepTheirIdentifiers) {
  const fs::path other = home() / "Other/Documents";
  fs::create_directories(other);
  std::ofstream(other / "b.txt") << "y";
  const auto idIn = [this](const fs::path& root, const std::string& name) {
    return vantrell({"--storage", root, "id", root / name}).out;
  };
  const std::string first = idIn(storage(), "a.txt");
  const std::string second = idIn(other, "b.txt");
  EXPECT_NE(first, second);
  EXPECT_EQ(idIn(storage(), "a.txt"), first);
  EXPECT_EQ(idIn(other, "b.txt"), second);
}

}  // namespace
}  // namespace vantrell::integration
