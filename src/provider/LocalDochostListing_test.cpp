#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "tests/support/ProviderTest.h"

namespace vantrell {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;

class ListingTest : public ProviderTest {
 protected:
  // The names on each page of the listing.
  std::vector<std::vector<std::string>> pages(std::string_view container) {
    std::vector<std::vector<std::string>> all;
    const auto listed = extension->_listItemsInContainer_pageHandler(
        container, [&](std::vector<DochostItemRef> items) {
          std::vector<std::string> names;
          for (const DochostItemRef& item : items) names.push_back(item->filename());
          all.push_back(std::move(names));
          return true;
        });
    EXPECT_TRUE(listed.has_value()) << listed.error().description();
    return all;
  }
  FndError failure(std::string_view container) {
    const auto listed = extension->_listItemsInContainer_pageHandler(
        container, [](std::vector<DochostItemRef>) { return true; });
    EXPECT_FALSE(listed);
    return listed ? FndError::posix(0) : listed.error();
  }
  std::string identifierOf(std::string_view relativePath) {
    return *itemIdentifier(system.urlInStorage(relativePath));
  }
};

TEST_F(ListingTest, TheRootContainersItemsAreThoseAtTheTopOfTheStorage) {
  system.file("a.txt");
  system.file("folder/inside.txt");
  system.file(".hidden");
  system.folder("Inbox");
  EXPECT_THAT(pages(DochostRootContainerItemIdentifier),
              ElementsAre(ElementsAre("a.txt", "folder")));
  EXPECT_TRUE(hasSection("list items of DochostRootContainerItemIdentifier"));
}

TEST_F(ListingTest, AFoldersItemsHaveItAsParentAndWhatALookupFinds) {
  system.file("folder/a.txt", "hello");
  system.file("folder/b.tessera/x", "xx");
  const std::string folder = identifierOf("folder");
  const auto listed =
      extension->_listItemsInContainer_pageHandler(folder, [&](std::vector<DochostItemRef> items) {
        for (const DochostItemRef& item : items) {
          EXPECT_EQ(item->parentItemIdentifier(), folder);
          const auto found = extension->itemForIdentifier_error(item->itemIdentifier());
          EXPECT_TRUE(found.has_value());
          if (!found) continue;
          EXPECT_EQ((*found)->parentItemIdentifier(), folder);
          EXPECT_EQ((*found)->filename(), item->filename());
          EXPECT_EQ((*found)->fileID(), item->fileID());
          EXPECT_EQ((*found)->documentSize(), item->documentSize());
          EXPECT_EQ((*found)->versionIdentifier(), item->versionIdentifier());
        }
        return true;
      });
  EXPECT_TRUE(listed);
}

TEST_F(ListingTest, AFullPageHas200Items) {
  for (int i = 0; i < 450; ++i) system.file("folder/" + std::to_string(i));
  const auto all = pages(identifierOf("folder"));
  ASSERT_EQ(all.size(), 3U);
  EXPECT_EQ(all[0].size(), 200U);
  EXPECT_EQ(all[1].size(), 200U);
  EXPECT_EQ(all[2].size(), 50U);
  EXPECT_EQ(all[0].front(), "0");
  EXPECT_EQ(all[2].back(), "449");
  EXPECT_EQ(system.tree.faults.calls(FakeCall::EnumerateDirectory), 1U);
}

TEST_F(ListingTest, ExactlyOneFullPageIsNotFollowedByAnEmptyOne) {
  for (int i = 0; i < 200; ++i) system.file("folder/" + std::to_string(i));
  EXPECT_EQ(pages(identifierOf("folder")).size(), 1U);
}

TEST_F(ListingTest, AnEmptyFolderHasNoPage) {
  system.folder("folder");
  EXPECT_THAT(pages(identifierOf("folder")), IsEmpty());
}

TEST_F(ListingTest, AHandlerThatAnswersFalseEndsTheListing) {
  for (int i = 0; i < 450; ++i) system.file("folder/" + std::to_string(i));
  int calls = 0;
  EXPECT_TRUE(extension->_listItemsInContainer_pageHandler(identifierOf("folder"),
                                                           [&](std::vector<DochostItemRef>) {
                                                             ++calls;
                                                             return false;
                                                           }));
  EXPECT_EQ(calls, 1);
}

TEST_F(ListingTest, ARecordThatCannotBeMadeLeavesTheOthers) {
  system.file("folder/a");
  system.file("folder/b");
  system.tree.faults.failAt(FakeCall::Open, system.inStorage("folder/a"), FndError::posix(EIO));
  EXPECT_THAT(pages(identifierOf("folder")), ElementsAre(ElementsAre("b")));
}

TEST_F(ListingTest, WhatIsNoFolderCannotBeListed) {
  system.file("a.txt");
  system.folder("doc.tessera");
  system.folder("folder");
  system.tree.makeLink(system.inStorage("link"), "folder");
  EXPECT_TRUE(failure(identifierOf("a.txt")).isPosix(ENOTDIR));
  EXPECT_TRUE(failure(identifierOf("doc.tessera")).isPosix(ENOTDIR));
  EXPECT_TRUE(failure(identifierOf("link")).isPosix(ENOTDIR));
}

TEST_F(ListingTest, AFolderThatMayNotBeReadIsAnError) {
  system.folder("folder");
  const std::string folder = identifierOf("folder");
  system.tree.setMode(system.inStorage("folder"), 0300);
  EXPECT_TRUE(failure(folder).isPosix(EACCES));
}

TEST_F(ListingTest, AContainerThatIsNotThereIsTheNonExistentItemError) {
  expectNoSuchItem(failure("fid=999"), "fid=999");
  expectNoSuchItem(failure("#org.example.none"), "#org.example.none");
}

TEST_F(ListingTest, ContainersThatSpanFoldersAreNotHereYet) {
  for (const std::string_view container :
       {DochostWorkingSetContainerItemIdentifier, DochostAllDirectoriesContainerItemIdentifier}) {
    EXPECT_TRUE(failure(container).is(kVantrellErrorDomain,
                                      static_cast<std::int64_t>(VantrellErrorCode::NotHereYet)));
  }
}

TEST(ListingOfAppLibrary, AnAppLibrarysItemsAreItsChildren) {
  TestSystem system;
  const FndURL root = system.addApp("org.example.a");
  system.tree.writeFile(root.path() + "/a.txt");
  system.tree.makeFolder(root.path() + "/Inbox");
  LocalDochost extension;
  std::vector<std::string> parents;
  EXPECT_TRUE(extension._listItemsInContainer_pageHandler(
      "#org.example.a", [&](std::vector<DochostItemRef> items) {
        for (const DochostItemRef& item : items) {
          parents.push_back(item->parentItemIdentifier() + " " + item->filename() + " " +
                            item->dh_lumenDomainIdentifier().value_or("none"));
        }
        return true;
      }));
  EXPECT_THAT(parents, ElementsAre("#org.example.a a.txt org.example.a"));
}

}  // namespace
}  // namespace vantrell
