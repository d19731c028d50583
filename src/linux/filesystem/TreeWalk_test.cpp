#include "linux/filesystem/TreeWalk.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <map>

#include "tests/contracts/TemporaryFolder.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::AsOrdinaryUser;
using vantrell::testing::TemporaryFolder;

constexpr WalkOptions kEverything{.entersFolders = true, .entersPackages = true};

struct Walked {
  std::vector<std::string> paths;  // below the root, in order
  std::vector<std::pair<std::string, int>> errors;
};

TreeWalk walkOf(const std::string& root, WalkOptions options, TreeWalk::ErrorHandler handler) {
  return {FileDescriptor(::open(root.c_str(), O_RDONLY | O_DIRECTORY)), root, options, nullptr,
          std::move(handler)};
}

// Walks to the end, calling `atEach` with every path.
Walked walk(const std::string& root, WalkOptions options,
            const std::function<void(const std::string&)>& atEach = nullptr) {
  Walked walked;
  TreeWalk tree = walkOf(root, options, [&](const std::string& path, int osError) {
    walked.errors.emplace_back(path.substr(root.size()), osError);
    return true;
  });
  while (const WalkEntry* entry = tree.next()) {
    const std::string path = std::string(tree.folder().path) + '/' + std::string(entry->name);
    walked.paths.push_back(path.substr(root.size() + 1));
    if (atEach) atEach(walked.paths.back());
  }
  return walked;
}

std::map<std::string, int> counted(const std::vector<std::string>& paths) {
  std::map<std::string, int> counts;
  for (const std::string& path : paths) ++counts[path];
  return counts;
}

TEST(TreeWalk, AnEntryComesBeforeWhatLiesBelowIt) {
  const TemporaryFolder folder;
  folder.makeFolder("a");
  folder.makeFolder("a/b");
  folder.writeFile("a/b/c");
  const Walked walked = walk(folder.path(), kEverything);
  EXPECT_EQ(walked.paths, (std::vector<std::string>{"a", "a/b", "a/b/c"}));
  EXPECT_TRUE(walked.errors.empty());
}

TEST(TreeWalk, HiddenEntriesAreLeftOutWithAllBelowThem) {
  const TemporaryFolder folder;
  folder.makeFolder(".hidden");
  folder.writeFile(".hidden/file");
  folder.writeFile("shown");
  WalkOptions options = kEverything;
  options.skipsHidden = true;
  EXPECT_EQ(walk(folder.path(), options).paths, std::vector<std::string>{"shown"});
}

TEST(TreeWalk, WithoutEnteringFoldersOnlyTheFirstLevelIsGiven) {
  const TemporaryFolder folder;
  folder.makeFolder("a");
  folder.writeFile("a/b");
  EXPECT_EQ(walk(folder.path(), {}).paths, std::vector<std::string>{"a"});
}

TEST(TreeWalk, ALinkToAFolderIsNotEntered) {
  const TemporaryFolder folder;
  folder.makeLink("loop", folder.path());
  EXPECT_EQ(walk(folder.path(), kEverything).paths, std::vector<std::string>{"loop"});
}

TEST(TreeWalk, EveryEntryOfALargeFolderIsGivenOnce) {
  const TemporaryFolder folder;
  for (int i = 0; i < 3000; ++i) folder.writeFile("file with a longer name " + std::to_string(i));
  const Walked walked = walk(folder.path(), kEverything);
  EXPECT_EQ(walked.paths.size(), 3000U);
  EXPECT_EQ(counted(walked.paths).size(), 3000U);
}

// Deep enough that outer folders are closed on the way down and found again on the way up, and
// with so many entries beside each subfolder that some of them come after it.
TEST(TreeWalk, FoldersClosedOnTheWayDownGiveTheRestOfTheirEntriesOnTheWayUp) {
  const TemporaryFolder folder;
  std::string inner;
  int made = 0;
  for (int level = 0; level < 60; ++level) {
    for (int i = 0; i < 20; ++i) {
      folder.writeFile(inner + std::string(100, 'f') + std::to_string(i));
      ++made;
    }
    inner += "d";
    folder.makeFolder(inner);
    ++made;
    inner += "/";
  }
  const Walked walked = walk(folder.path(), kEverything);
  EXPECT_TRUE(walked.errors.empty());
  EXPECT_EQ(walked.paths.size(), static_cast<std::size_t>(made));
  EXPECT_EQ(counted(walked.paths).size(), static_cast<std::size_t>(made));
}

TEST(TreeWalk, AThousandLevelsNeedFewDescriptors) {
  const TemporaryFolder folder;
  FileDescriptor inner(::open(folder.path().c_str(), O_PATH | O_DIRECTORY));
  const std::string name(250, 'd');
  for (int i = 0; i < 1000; ++i) {
    ASSERT_EQ(::mkdirat(inner.get(), name.c_str(), 0755), 0);
    inner = FileDescriptor(::openat(inner.get(), name.c_str(), O_PATH | O_DIRECTORY));
    const FileDescriptor file(::openat(inner.get(), "file", O_CREAT | O_WRONLY, 0644));
    ASSERT_TRUE(file);
  }
  rlimit before{};
  ASSERT_EQ(::getrlimit(RLIMIT_NOFILE, &before), 0);
  const rlimit few{64, before.rlim_max};
  ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &few), 0);
  const Walked walked = walk(folder.path(), kEverything);
  ASSERT_EQ(::setrlimit(RLIMIT_NOFILE, &before), 0);
  EXPECT_TRUE(walked.errors.empty());
  EXPECT_EQ(walked.paths.size(), 2000U);
}

TEST(TreeWalk, AnUnreadableFolderIsReportedAndTheOthersAreWalked) {
  const AsOrdinaryUser ordinary;
  const TemporaryFolder folder;
  folder.makeFolder("closed");
  folder.makeFolder("open");
  folder.writeFile("open/file");
  ASSERT_EQ(::chmod(folder.path("closed").c_str(), 0000), 0);
  const Walked walked = walk(folder.path(), kEverything);
  EXPECT_EQ(walked.paths.size(), 3U);
  ASSERT_EQ(walked.errors.size(), 1U);
  EXPECT_EQ(walked.errors[0], std::pair(std::string("/closed"), EACCES));
}

TEST(TreeWalk, EntriesThatMayNotBeLookedAtAreReportedOneByOne) {
  const AsOrdinaryUser ordinary;
  const TemporaryFolder folder;
  folder.makeFolder("listable");
  folder.writeFile("listable/a");
  folder.writeFile("listable/b");
  ASSERT_EQ(::chmod(folder.path("listable").c_str(), 0444), 0);
  const Walked walked = walk(folder.path(), kEverything);
  EXPECT_EQ(walked.paths, std::vector<std::string>{"listable"});
  ASSERT_EQ(walked.errors.size(), 2U);
  EXPECT_EQ(walked.errors[0].second, EACCES);
}

TEST(TreeWalk, AFolderThatVanishesBeforeItIsEnteredIsReportedAsGone) {
  const TemporaryFolder folder;
  folder.makeFolder("going");
  const Walked walked = walk(folder.path(), kEverything, [&](const std::string& path) {
    if (path != "going") return;
    ASSERT_EQ(::rmdir(folder.path("going").c_str()), 0);
  });
  ASSERT_EQ(walked.errors.size(), 1U);
  EXPECT_EQ(walked.errors[0], std::pair(std::string("/going"), ENOENT));
}

TEST(TreeWalk, AFolderReplacedByALinkBeforeItIsEnteredIsNotFollowed) {
  const TemporaryFolder folder;
  const TemporaryFolder elsewhere;
  elsewhere.writeFile("secret");
  folder.makeFolder("swapped");
  const Walked walked = walk(folder.path(), kEverything, [&](const std::string& path) {
    if (path != "swapped") return;
    ASSERT_EQ(::rmdir(folder.path("swapped").c_str()), 0);
    folder.makeLink("swapped", elsewhere.path());
  });
  EXPECT_EQ(walked.paths, std::vector<std::string>{"swapped"});
  EXPECT_EQ(walked.errors.size(), 1U);
}

TEST(TreeWalk, AnOuterFolderThatWasMovedIsFoundAgainFromBelow) {
  const TemporaryFolder folder;
  folder.makeFolder("moving");
  std::string inner = "moving";
  for (int level = 0; level < 40; ++level) inner += "/d";
  std::string built = "moving";
  for (int level = 0; level < 40; ++level) folder.makeFolder(built += "/d");
  for (int i = 0; i < 10; ++i) folder.writeFile("moving/file" + std::to_string(i));
  const Walked walked = walk(folder.path(), kEverything, [&](const std::string& path) {
    if (path != inner) return;
    const TemporaryFolder& f = folder;
    ASSERT_EQ(std::rename(f.path("moving").c_str(), f.path("moved").c_str()), 0);
  });
  EXPECT_TRUE(walked.errors.empty());
  EXPECT_EQ(counted(walked.paths).size(), 1U + 40U + 10U);
}

TEST(TreeWalk, TheErrorHandlerCanEndTheWalk) {
  const AsOrdinaryUser ordinary;
  const TemporaryFolder folder;
  folder.makeFolder("listable");
  folder.writeFile("listable/a");
  folder.writeFile("listable/b");
  ASSERT_EQ(::chmod(folder.path("listable").c_str(), 0444), 0);
  int errors = 0;
  TreeWalk tree = walkOf(folder.path(), kEverything, [&errors](const std::string&, int) {
    ++errors;
    return false;
  });
  ASSERT_NE(tree.next(), nullptr);
  EXPECT_EQ(tree.next(), nullptr);
  EXPECT_EQ(tree.next(), nullptr);
  EXPECT_EQ(errors, 1);
}

}  // namespace
}  // namespace vantrell::linuxos
