#include "identity/ItemForIdentifierString.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "items/LocalAppLibraryItem.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class ItemForIdentifierTest : public testing::Test {
 protected:
  TestSystem system;
};

TEST_F(ItemForIdentifierTest, ADocumentsIdentifierGivesItsRecord) {
  const FndURL url = system.file("a.txt");
  const std::string identifier = *itemIdentifier(url);
  const auto item = itemForIdentifierString(identifier);
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->itemIdentifier(), identifier);
  EXPECT_EQ(item->fileURL(), url);
  EXPECT_EQ(item->filename(), "a.txt");
}

TEST_F(ItemForIdentifierTest, TheRootContainerGivesTheStorageRootAsItIsNow) {
  const auto before = itemForIdentifierString(DochostRootContainerItemIdentifier);
  ASSERT_NE(before, nullptr);
  system.tree.setMode(TestSystem::kStorageRoot, 0500);
  system.file("a.txt");
  const auto after = itemForIdentifierString(DochostRootContainerItemIdentifier);
  EXPECT_EQ(before->childItemCount(), 0U);
  EXPECT_EQ(after->childItemCount(), 1U);
}

TEST_F(ItemForIdentifierTest, TheHashFormGivesTheAppLibrarysItem) {
  const FndURL root = system.addApp("org.example.a", "Example");
  const auto item = itemForIdentifierString("#org.example.a");
  ASSERT_NE(dynamic_cast<const LocalAppLibraryItem*>(item.get()), nullptr);
  EXPECT_EQ(item->itemIdentifier(), "#org.example.a");
  EXPECT_EQ(item->fileURL(), root);
  EXPECT_EQ(item->filename(), "Example");
}

TEST_F(ItemForIdentifierTest, AnUnknownBundleIdentifierGivesNone) {
  system.addApp("org.example.a");
  for (const std::string_view identifier : {"#", "#org.example.b", "##org.example.a"}) {
    EXPECT_EQ(itemForIdentifierString(identifier), nullptr) << identifier;
  }
}

TEST_F(ItemForIdentifierTest, TheTemporaryLocalFolderIsMadeAndGiven) {
  const auto item = itemForIdentifierString(DochostTemporaryLocalFolderItemIdentifier);
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->fileURL(), system.urlInStorage(".TemporaryLocalFolder"));
  EXPECT_TRUE(item->isFolder());
  EXPECT_EQ(item->parentItemIdentifier(), DochostRootContainerItemIdentifier);
}

TEST_F(ItemForIdentifierTest, ATemporaryLocalFolderThatIsThereIsNoFailure) {
  system.folder(".TemporaryLocalFolder");
  EXPECT_NE(itemForIdentifierString(DochostTemporaryLocalFolderItemIdentifier), nullptr);
  EXPECT_TRUE(system.log.textsAt(LogLevel::Error).empty());
}

TEST_F(ItemForIdentifierTest, ATemporaryLocalFolderThatCannotBeMadeIsAnErrorLine) {
  system.tree.setMode(TestSystem::kStorageRoot, 0500);
  EXPECT_EQ(itemForIdentifierString(DochostTemporaryLocalFolderItemIdentifier), nullptr);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] can't create temporary directory; " +
                                     FndError::posix(EACCES).description()});
}

TEST_F(ItemForIdentifierTest, AnIdentifierThatLeadsNowhereGivesNone) {
  for (const std::string_view identifier : {"", "did=99", "fid=99", "fid=abc", "did", "xid=1",
                                            "DochostWorkingSetContainerItemIdentifier"}) {
    EXPECT_EQ(itemForIdentifierString(identifier), nullptr) << identifier;
  }
}

TEST(ItemForIdentifierWithoutRegistry, TheHashFormGivesNone) {
  FakeTypeRegistry types;
  FakeTree tree;
  FakeLogSink log;
  FakeFileSystem fileSystem(tree, types);
  FakeManager manager("/storage");
  platform::Services services;
  services.fileSystem = &fileSystem;
  services.types = &types;
  services.log = &log;
  services.manager = &manager;
  const platform::Installation installation = platform::install(services);
  EXPECT_EQ(itemForIdentifierString("#org.example.a"), nullptr);
}

}  // namespace
}  // namespace vantrell
