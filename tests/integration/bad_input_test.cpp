// Files, names and attributes that a storage should not have, and has all the same.

#include <fcntl.h>
#include <gmock/gmock.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/xattr.h>
#include <unistd.h>

#include <cstring>
#include <filesystem>
#include <fstream>
#include <set>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::SizeIs;
using testing::StartsWith;

constexpr const char* kTags = "user.com.quillon.metadata:_kMDItemUserTags";
constexpr const char* kRank = "user.com.quillon.favorite-rank.number#PS";
constexpr const char* kUsed = "user.com.quillon.lastuseddate#PS";
constexpr uid_t kNobody = 65534;

class BadInput : public VantrellTest {
 protected:
  static std::string attribute(const std::string& path, const char* name) {
    std::string value(70000, '\0');
    const ssize_t size = ::lgetxattr(path.c_str(), name, value.data(), value.size());
    EXPECT_GE(size, 0) << path << " " << name << " " << std::strerror(errno);
    value.resize(size < 0 ? 0 : static_cast<std::size_t>(size));
    return value;
  }
  static void setAttribute(const std::string& path, const char* name, const std::string& value) {
    ASSERT_EQ(::lsetxattr(path.c_str(), name, value.data(), value.size(), 0), 0)
        << std::strerror(errno);
  }

  // As an ordinary user, to whom the file modes mean something.
  Outcome vantrellAsOrdinaryUser(const Words& words) const {
    Invocation invoked = invocation(words);
    if (::geteuid() == 0) {
      // The home was made for its owner alone; so it stays, with another owner.
      run({{"chown", "-R", std::to_string(kNobody), home()}, {}, ""});
      invoked.user = kNobody;
    }
    return run(invoked);
  }
};

TEST_F(BadInput, SpecialFilesAreListedAndNeverWaitedFor) {
  ASSERT_EQ(::mkfifo(path("fifo").c_str(), 0600), 0);
  const int socket = ::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0);
  sockaddr_un address{};
  address.sun_family = AF_UNIX;
  ASSERT_LT(path("sock").size(), sizeof address.sun_path);
  std::strcpy(address.sun_path, path("sock").c_str());
  ASSERT_EQ(::bind(socket, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
  ::close(socket);
  fs::create_symlink("nowhere", path("broken"));
  fs::create_symlink("round", path("round"));
  EXPECT_THAT(objects({"ls"}), SizeIs(4));
  for (const char* name : {"fifo", "sock", "broken", "round"}) {
    const std::string identifier = identifierOf(path(name));
    EXPECT_THAT(identifier, StartsWith("fid=")) << name;
    EXPECT_EQ(pathOf(identifier), path(name));
    EXPECT_EQ(object({"item", name})["filename"], name);
  }
}

TEST_F(BadInput, WhatCannotCarryAttributesSaysSo) {
  ASSERT_EQ(::mkfifo(path("fifo").c_str(), 0600), 0);
  fs::create_symlink("nowhere", path("link"));
  for (const char* name : {"fifo", "link"}) {
    for (const Words& words : {Words{"tag", name, "x"}, Words{"rank", name, "1"}}) {
      const Json refused = error(words);
      EXPECT_EQ(refused["domain"], "FndPOSIXErrorDomain");
      EXPECT_EQ(refused["name"], "EPERM") << name;
    }
    EXPECT_THAT(error({"used", name, "now"})["message"], HasSubstr("could not be stored"));
  }
}

TEST_F(BadInput, ANameOfTwoHundredAndFiftyFiveBytesWorks) {
  const std::string name(255, 'n');
  const std::string file = write(name, "x");
  EXPECT_EQ(pathOf(identifierOf(file)), file);
  EXPECT_EQ(objects({"ls"}).front()["filename"], name);
}

TEST_F(BadInput, ANameThatIsTooLongIsAnError) {
  EXPECT_EQ(error({"id", std::string(256, 'n')})["name"], "ENAMETOOLONG");
}

TEST_F(BadInput, NamesThatAreNotUTF8AreKeptAsTheyAre) {
  const std::string file = write("caf\xe9.txt", "x");
  const Json record = objects({"ls"}).front();
  EXPECT_EQ(record["filename"], "caf\xEF\xBF\xBD.txt");
  EXPECT_EQ(record["filenameBase64"], "Y2Fm6S50eHQ=");
  EXPECT_THAT(record["fileURL"], HasSubstr("caf%E9.txt"));
  const std::string identifier = vantrell({"id", "caf\xe9.txt"}).out;
  EXPECT_EQ(identifier, record["itemIdentifier"].get<std::string>() + "\n");
  EXPECT_EQ(vantrell({"path", record["itemIdentifier"]}).out, file + "\n");
  EXPECT_TRUE(object({"path", record["itemIdentifier"]}).contains("pathBase64"));
  EXPECT_THAT(vantrell({"ls"}).out, HasSubstr("caf\\xE9.txt\n"));
}

TEST_F(BadInput, NamesWithEveryOtherByteWork) {
  for (const std::string name : {"new\nline", "tab\t", "quote\"'", " ", "*", "$(x)", "\\", "~",
                                 "%s%n", "a=b", "#x", "\x7f", "\xef\xbb\xbf"}) {
    const std::string file = write(name, "x");
    EXPECT_EQ(pathOf(identifierOf(file)), file);
  }
}

TEST_F(BadInput, AThousandLevelsWork) {
  // Deeper than any path that the kernel takes at once: made step by step.
  const std::string name(60, 'd');
  std::string deepest = storage();
  int folder = ::open(deepest.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC);
  for (int level = 0; level < 1000; ++level) {
    ASSERT_EQ(::mkdirat(folder, name.c_str(), 0700), 0);
    const int next = ::openat(folder, name.c_str(), O_PATH | O_DIRECTORY | O_CLOEXEC);
    ASSERT_GE(next, 0);
    ::close(folder);
    folder = next;
    deepest += "/" + name;
  }
  const int file = ::openat(folder, "a.txt", O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
  ASSERT_GE(file, 0);
  ::close(file);
  ::close(folder);
  const Json report = object({"doctor"});
  EXPECT_EQ(report["database"]["entries"], 1001);
  const std::string identifier = identifierOf(deepest + "/a.txt");
  EXPECT_THAT(identifier, StartsWith("did="));
  EXPECT_EQ(pathOf(identifier), deepest + "/a.txt");
  EXPECT_EQ(object({"tag", identifier, "deep"})["tags"], Json::array({"deep"}));
  const Json parent = object({"item", deepest});
  EXPECT_THAT(objects({"ls", parent["itemIdentifier"]}), SizeIs(1));
}

TEST_F(BadInput, AttributesOfAnotherClassReadAsNone) {
  const std::string file = write("a.txt", "x");
  object({"rank", file, "7"});
  object({"used", file, "2026-01-01T00:00:00Z"});
  object({"tag", file, "Work"});
  const std::string number = attribute(file, kRank);
  const std::string date = attribute(file, kUsed);
  setAttribute(file, kUsed, number);
  setAttribute(file, kTags, number);
  setAttribute(file, kRank, date);
  const Json record = object({"item", file});
  EXPECT_FALSE(record.contains("lastUsedDate"));
  EXPECT_FALSE(record.contains("tags"));
  EXPECT_FALSE(record.contains("favoriteRank"));
  EXPECT_EQ(attribute(file, kUsed), number) << "reading mends nothing";
}

TEST_F(BadInput, EmptyAndDamagedAttributesReadAsNone) {
  const std::string file = write("a.txt", "x");
  object({"tag", file, "Work"});
  const std::string whole = attribute(file, kTags);
  std::set<std::string> damaged = {"", "x", "bplist00", std::string(4000, '\xff')};
  for (std::size_t length = 0; length < whole.size(); length += 7) {
    damaged.insert(whole.substr(0, length));
  }
  for (const std::string& value : damaged) {
    setAttribute(file, kTags, value);
    EXPECT_FALSE(object({"item", file}).contains("tags")) << value.size();
  }
  EXPECT_THAT(object({"tag", file, "Back"})["tags"], ElementsAre("Back"));
}

TEST_F(BadInput, TheLargestAttributeFitsAndOneMoreIsRefusedWithTheOldValueKept) {
  const std::string file = write("a.txt", "x");
  const auto tagged = [&](std::size_t length) {
    return vantrell({"--json", "tag", file, std::string(length, 'x')});
  };
  // How much fits is the file system's affair: the bound is looked for.
  if (tagged(100000).status == 0) GTEST_SKIP() << "this file system takes attributes of any size";
  std::size_t fits = 1;
  std::size_t tooLarge = 100000;
  while (tooLarge - fits > 1) {
    const std::size_t middle = (fits + tooLarge) / 2;
    (tagged(middle).status == 0 ? fits : tooLarge) = middle;
  }
  EXPECT_EQ(tagged(fits).status, 0);
  const Outcome refused = tagged(tooLarge);
  EXPECT_EQ(refused.status, 1);
  EXPECT_EQ(refused.out, "");
  const Json reason = Json::parse(refused.err);
  EXPECT_EQ(reason["domain"], "FndPOSIXErrorDomain");
  EXPECT_THAT(std::set<std::string>({"ENOSPC", "E2BIG", "ERANGE"}),
              testing::Contains(reason["name"].get<std::string>()));
  EXPECT_EQ(object({"item", file})["tags"], Json::array({std::string(fits, 'x')}));
}

TEST_F(BadInput, ATagThatIsNotUTF8IsRefused) {
  const std::string file = write("a.txt", "x");
  const Json refused = error({"tag", file, "caf\xe9"});
  EXPECT_EQ(refused["domain"], "com.quillon.vantrell");
  EXPECT_FALSE(object({"item", file}).contains("tags"));
}

TEST_F(BadInput, AReadOnlyFileSaysSoAndKeepsItsTags) {
  const std::string file = write("a.txt", "x");
  object({"tag", file, "Work"});
  fs::permissions(file, fs::perms::owner_read);
  const Outcome refused = vantrellAsOrdinaryUser({"--json", "tag", file, "Play"});
  EXPECT_EQ(refused.status, 1);
  EXPECT_EQ(Json::parse(refused.err)["name"], "EACCES");
  EXPECT_EQ(vantrellAsOrdinaryUser({"--json", "rank", file, "1"}).status, 1);
  EXPECT_EQ(vantrellAsOrdinaryUser({"--json", "used", file, "now"}).status, 1);
  const Json record = Json::parse(vantrellAsOrdinaryUser({"--json", "item", file}).out);
  EXPECT_EQ(record["capabilities"], 1);
  EXPECT_EQ(record["tags"], Json::array({"Work"}));
}

TEST_F(BadInput, AFolderThatMayNotBeReadIsShownAndToldAbout) {
  write("closed/a.txt", "x");
  write("open/b.txt", "x");
  const std::string before = identifierOf(path("closed/a.txt"));
  fs::permissions(path("closed"), fs::perms::none);
  const Outcome listed = vantrellAsOrdinaryUser({"--json", "ls"});
  EXPECT_EQ(listed.status, 0) << listed.err;
  EXPECT_THAT(linesIn(listed.out), SizeIs(2));
  const Outcome refused = vantrellAsOrdinaryUser({"--json", "ls", "closed"});
  EXPECT_EQ(refused.status, 1);
  EXPECT_EQ(Json::parse(refused.err)["name"], "EACCES");
  const Json report = Json::parse(vantrellAsOrdinaryUser({"--json", "doctor"}).out);
  EXPECT_EQ(report["look"]["unreadableFolderCount"], 1);
  EXPECT_EQ(report["look"]["unreadableFolders"], Json::array({path("closed")}));
  fs::permissions(path("closed"), fs::perms::owner_all);
  EXPECT_EQ(linesIn(vantrellAsOrdinaryUser({"id", "closed/a.txt"}).out).front(), before)
      << "what was below is remembered";
}

TEST_F(BadInput, AStorageRootThatIsMissingOrNoFolderIsAClearError) {
  fs::remove(storage());
  Invocation invoked = invocation({"--json", "ls"});
  invoked.folder = home();
  Json refused = Json::parse(run(invoked).err);
  EXPECT_EQ(refused["code"], 260);
  EXPECT_THAT(refused["message"], HasSubstr("--storage DIR"));
  std::ofstream(storage()) << "x";
  refused = Json::parse(run(invoked).err);
  EXPECT_EQ(refused["name"], "ENOTDIR");
  EXPECT_FALSE(fs::exists(stateFolder()));
}

TEST_F(BadInput, AStorageRootThatMayNotBeReadIsAClearError) {
  fs::create_directory(home() / "closed");
  fs::permissions(home() / "closed", fs::perms::none);
  const Outcome refused = vantrellAsOrdinaryUser({"--json", "--storage", home() / "closed", "ls"});
  EXPECT_EQ(refused.status, 1);
  EXPECT_EQ(Json::parse(refused.err)["name"], "EACCES");
}

TEST_F(BadInput, AVolumeWithoutAttributesListsAndSaysWhatCannotBeStored) {
  // The kernel's own settings lie on such a volume, and everybody may read them.
  const std::string folder = "/proc/sys/kernel/random";
  const Outcome listed = vantrell({"--storage", folder, "ls"});
  EXPECT_EQ(listed.status, 0) << listed.err;
  EXPECT_THAT(listed.out, HasSubstr("uuid\n"));
  const Json report = Json::parse(vantrell({"--storage", folder, "--json", "doctor"}).out);
  EXPECT_EQ(report["fileSystemType"], "proc");
  EXPECT_EQ(report["extendedAttributes"], false);
  EXPECT_THAT(report["extendedAttributesProblem"], HasSubstr("tags, ranks and dates"));
  const Outcome refused = vantrell({"--storage", folder, "tag", folder + "/boot_id", "x"});
  EXPECT_EQ(refused.status, 1);
}

}  // namespace
}  // namespace vantrell::integration
