#include "enumeration/FSDirectoryEnumerator.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>

#include "items/LocalItem.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class DirectoryEnumeratorTest : public testing::Test {
 protected:
  FSDirectoryEnumerator scanner(std::vector<std::string> roots) {
    FSDirectoryEnumerator made;
    for (const std::string& root : roots) made.urls.push_back(system.urlInStorage(root));
    made.limit = 1000;
    made.errorHandler = standardDirectoryErrorHandler;
    return made;
  }
  void fill(const std::string& folder, int count) {
    for (int i = 0; i < count; ++i) system.file(folder + "/" + folder + std::to_string(i));
  }
  // What the scanner hands out, by name; `counted` is what it returns.
  std::vector<std::string> listed(const FSDirectoryEnumerator& made, bool answer = true) {
    std::vector<std::string> names;
    const auto result = made.enumerate([&](const FndURL& url) -> Result<bool> {
      names.emplace_back(url.lastPathComponent());
      return answer;
    });
    EXPECT_TRUE(result.has_value());
    counted = result.value_or(UINT64_MAX);
    return names;
  }

  TestSystem system;
  std::uint64_t counted = 0;
};

TEST_F(DirectoryEnumeratorTest, WithLimit0TheHandlerIsNeverCalledAndTheResultIs0) {
  fill("a", 3);
  auto made = scanner({"a"});
  made.limit = 0;
  made.offset = 7;
  EXPECT_THAT(listed(made), IsEmpty());
  EXPECT_EQ(counted, 0U);
  EXPECT_EQ(system.tree.faults.calls(FakeCall::EnumerateDirectory), 0U);
}

TEST_F(DirectoryEnumeratorTest, WithoutRootsTheResultIs0) {
  auto made = scanner({});
  made.offset = 7;
  EXPECT_THAT(listed(made), IsEmpty());
  EXPECT_EQ(counted, 0U);
}

TEST_F(
    DirectoryEnumeratorTest,
    TwoRootsWith150And100EntriesOffset0AndLimit200TheHandlerGetsAll150OfTheFirstAndTheFirst50OfTheSecondTheResultIs200) {
  fill("a", 150);
  fill("b", 100);
  auto made = scanner({"a", "b"});
  made.limit = 200;
  const auto names = listed(made);
  ASSERT_EQ(names.size(), 200U);
  for (int i = 0; i < 150; ++i)
    EXPECT_EQ(names[static_cast<std::size_t>(i)], "a" + std::to_string(i));
  for (int i = 0; i < 50; ++i) {
    EXPECT_EQ(names[static_cast<std::size_t>(150 + i)], "b" + std::to_string(i));
  }
  EXPECT_EQ(counted, 200U);
}

TEST_F(
    DirectoryEnumeratorTest,
    TheSameRootsWithOffset200AndLimit200TheFirst200EntriesArePassedOverTheLast50AreDeliveredTheResultIs250) {
  fill("a", 150);
  fill("b", 100);
  auto made = scanner({"a", "b"});
  made.offset = 200;
  made.limit = 200;
  const auto names = listed(made);
  ASSERT_EQ(names.size(), 50U);
  EXPECT_EQ(names.front(), "b50");
  EXPECT_EQ(names.back(), "b99");
  EXPECT_EQ(counted, 250U);
}

TEST_F(DirectoryEnumeratorTest, AnOffsetBeyondTheEndCountsAllEntries) {
  fill("a", 5);
  auto made = scanner({"a"});
  made.offset = 100;
  EXPECT_THAT(listed(made), IsEmpty());
  EXPECT_EQ(counted, 5U);
}

TEST_F(DirectoryEnumeratorTest, AFullPageThatEndsOnTheLastEntryCountsOffsetPlusLimit) {
  fill("a", 4);
  auto made = scanner({"a"});
  made.offset = 1;
  made.limit = 3;
  EXPECT_THAT(listed(made), ElementsAre("a1", "a2", "a3"));
  EXPECT_EQ(counted, 4U);
}

TEST_F(DirectoryEnumeratorTest, ALimitThatEndsWithARootLeavesTheNextRootUncounted) {
  fill("a", 2);
  fill("b", 2);
  auto made = scanner({"a", "b"});
  made.limit = 2;
  EXPECT_THAT(listed(made), ElementsAre("a0", "a1"));
  EXPECT_EQ(counted, 2U);
}

TEST_F(DirectoryEnumeratorTest,
       ARootThatCannotBeOpenedIsLoggedAndPassedOverTheOtherRootsAreStillListed) {
  fill("a", 1);
  system.folder("locked");
  system.tree.setMode(system.inStorage("locked"), 0);
  fill("b", 1);
  EXPECT_THAT(listed(scanner({"a", "locked", "gone", "b"})), ElementsAre("a0", "b0"));
  EXPECT_EQ(counted, 2U);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            (std::vector<std::string>{
                "[ERROR] can't create file enumerator at /storage/Documents/locked",
                "[ERROR] can't create file enumerator at /storage/Documents/gone"}));
}

class TreeListing : public DirectoryEnumeratorTest {
 protected:
  TreeListing() {
    system.file("top/.hidden");
    system.file("top/.hiddenFolder/inside");
    system.file("top/pack.tessera/inside");
    system.file("top/folder/deep");
    system.file("top/folder/.hidden");
    system.file("top/plain");
  }
};

TEST_F(
    TreeListing,
    HiddenFilesAndTheContentsOfPackagesAreNeverListedWithRecursivelyFalseNothingBelowASubfolderIsListedTheSubfolderItselfIs) {
  EXPECT_THAT(listed(scanner({"top"})), UnorderedElementsAre("pack.tessera", "folder", "plain"));
  EXPECT_EQ(counted, 3U);
}

TEST_F(TreeListing, WithRecursivelyTrueEntriesBelowSubfoldersAreListedToo) {
  auto made = scanner({"top"});
  made.recursively = true;
  EXPECT_THAT(listed(made), UnorderedElementsAre("pack.tessera", "folder", "deep", "plain"));
  EXPECT_EQ(counted, 4U);
}

TEST_F(TreeListing, OptionsGivenForARootReplaceTheUsualOnesForThatRoot) {
  system.file("other/.hidden");
  system.file("other/plain");
  auto made = scanner({"top", "other"});
  std::vector<std::string> asked;
  made.directoryEnumerationOptionsFor = [&](const FndURL& root) -> std::optional<std::uint8_t> {
    asked.emplace_back(root.lastPathComponent());
    if (root.lastPathComponent() == "top") return std::nullopt;
    return kSkipsSubdirectoryDescendants;
  };
  EXPECT_THAT(listed(made),
              UnorderedElementsAre("pack.tessera", "folder", "plain", ".hidden", "plain"));
  EXPECT_THAT(asked, ElementsAre("top", "other"));
}

TEST_F(DirectoryEnumeratorTest,
       AnUnreadableEntryWhoseErrorCodeIs260IsLoggedAtDebugLevelOnlyAndTheListingContinues) {
  fill("a", 3);
  const FndError error = FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile);
  system.tree.faults.failAt(FakeCall::NextEntry, system.inStorage("a/a1"), error);
  EXPECT_THAT(listed(scanner({"a"})), ElementsAre("a0", "a2"));
  EXPECT_EQ(counted, 2U);
  EXPECT_EQ(system.log.texts(),
            std::vector<std::string>{"[DEBUG] can't enumerate /storage/Documents/a/a1; " +
                                     error.description()});
}

TEST_F(DirectoryEnumeratorTest, AnyOtherUnreadableEntryIsAnErrorLineAndTheListingContinues) {
  fill("a", 3);
  const FndError error = FndError::posix(EACCES);
  system.tree.faults.failAt(FakeCall::NextEntry, system.inStorage("a/a1"), error);
  EXPECT_THAT(listed(scanner({"a"})), ElementsAre("a0", "a2"));
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] can't enumerate /storage/Documents/a/a1; " +
                                     error.description()});
}

TEST_F(DirectoryEnumeratorTest, AnErrorHandlerThatAnswersFalseEndsTheListingOfTheRoot) {
  fill("a", 3);
  fill("b", 1);
  system.tree.faults.failAt(FakeCall::NextEntry, system.inStorage("a/a1"), FndError::posix(EIO));
  auto made = scanner({"a", "b"});
  made.errorHandler = [](const FndURL&, const FndError&) { return false; };
  EXPECT_THAT(listed(made), ElementsAre("a0", "b0"));
}

TEST_F(DirectoryEnumeratorTest, AHandlerThatAnswersFalseLetsTheRootBeFinishedAndNoOtherBegun) {
  fill("a", 3);
  fill("b", 3);
  EXPECT_THAT(listed(scanner({"a", "b"}), false), ElementsAre("a0", "a1", "a2"));
  EXPECT_EQ(counted, 3U);
}

TEST_F(DirectoryEnumeratorTest, ALaterAnswerOverwritesAnEarlierOne) {
  fill("a", 2);
  fill("b", 1);
  int calls = 0;
  const auto result =
      scanner({"a", "b"}).enumerate([&](const FndURL&) -> Result<bool> { return ++calls != 1; });
  EXPECT_EQ(result, 3U);
}

TEST_F(DirectoryEnumeratorTest, AHandlerThatFailsStopsTheWholeCallAndItsErrorIsPassedOn) {
  fill("a", 3);
  int calls = 0;
  const auto result = scanner({"a"}).enumerate([&](const FndURL&) -> Result<bool> {
    if (++calls == 2) return std::unexpected(FndError::posix(EPIPE));
    return true;
  });
  ASSERT_FALSE(result);
  EXPECT_TRUE(result.error().isPosix(EPIPE));
  EXPECT_EQ(calls, 2);
}

TEST_F(DirectoryEnumeratorTest, EntriesBringTheNinePropertiesAlong) {
  fill("a", 1);
  scanner({"a"})
      .enumerate([](const FndURL& url) -> Result<bool> {
        for (const FndURLResourceKey key : LocalItem::urlKeys()) {
          EXPECT_TRUE(url.cachedResourceValue(key)) << resourceKeyName(key);
        }
        return true;
      })
      .value();
}

}  // namespace
}  // namespace vantrell
