#include "items/LocalAppLibraryItem.h"

#include <gtest/gtest.h>

#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class LocalAppLibraryItemTest : public testing::Test {
 protected:
  using Item = std::shared_ptr<const LocalAppLibraryItem>;

  static Item itemOf(const AppregBundleProxy& proxy) {
    return LocalAppLibraryItem::initWithBundleProxy(proxy);
  }
  Item itemOf(const std::string& bundleIdentifier) {
    return itemOf(*system.appreg.bundleProxyForIdentifier(bundleIdentifier));
  }

  TestSystem system;
};

TEST_F(LocalAppLibraryItemTest, ItIsTheDocumentsFolderUnderTheApplicationsName) {
  const FndURL root = system.addApp("org.example.a", "Example");
  const Item item = itemOf("org.example.a");
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->itemIdentifier(), "#org.example.a");
  EXPECT_EQ(item->parentItemIdentifier(), DochostRootContainerItemIdentifier);
  EXPECT_EQ(item->filename(), "Example");
  EXPECT_EQ(item->fileURL(), root);
  EXPECT_EQ(item->typeIdentifier(), kFolderTypeIdentifier);
  EXPECT_EQ(item->capabilities(), 3U);
  EXPECT_EQ(item->dh_lumenDomainIdentifier(), "org.example.a");
  EXPECT_EQ(item->dh_appContainerBundleIdentifier(), "org.example.a");
  EXPECT_EQ(item->docID(), std::nullopt);
  EXPECT_EQ(item->fileID(), system.tree.fileID(root.path()));
}

TEST_F(LocalAppLibraryItemTest,
       AnApplicationWhoseDocumentsFolderHoldsOnlyTrashAndInboxShowsAChildCountOf0) {
  const std::string root = system.addApp("org.example.a").path();
  system.tree.makeFolder(root + "/.Trash");
  system.tree.makeFolder(root + "/Inbox");
  EXPECT_EQ(itemOf("org.example.a")->childItemCount(), 0U);
}

TEST_F(LocalAppLibraryItemTest, InboxAndTrashAreNotCountedAmongOthers) {
  const std::string root = system.addApp("org.example.a").path();
  system.tree.makeFolder(root + "/Inbox");
  system.tree.writeFile(root + "/a.txt");
  system.tree.writeFile(root + "/b.txt");
  EXPECT_EQ(itemOf("org.example.a")->childItemCount(), 2U);
  system.tree.makeFolder(root + "/.Trash");
  EXPECT_EQ(itemOf("org.example.a")->childItemCount(), 2U);
}

TEST_F(LocalAppLibraryItemTest, TheChildCountIsNeverBelow0) {
  const std::string root = system.addApp("org.example.a").path();
  system.tree.makeFolder(root + "/Inbox");
  system.tree.makeFolder(root + "/.Trash");
  system.tree.setLinkCount(root, 3);
  EXPECT_EQ(itemOf("org.example.a")->childItemCount(), 0U);
}

TEST_F(LocalAppLibraryItemTest, AChildCountThatIsAbsentStaysAbsent) {
  const std::string root = system.addApp("org.example.a").path();
  system.tree.setLinkCount(root, 1);
  EXPECT_EQ(itemOf("org.example.a")->childItemCount(), std::nullopt);
}

TEST_F(LocalAppLibraryItemTest, AnApplicationWithoutALocalizedNameShowsTheFolderNameDocuments) {
  system.addApp("org.example.a");
  EXPECT_EQ(itemOf("org.example.a")->filename(), "Documents");
}

TEST_F(LocalAppLibraryItemTest, ARecordWithoutABundleIdentifierGetsTheIdentifierNullInParentheses) {
  system.tree.makeFolder("/apps/nameless/Documents");
  const Item item = itemOf(FakeApplicationProxy({.dataContainerPath = "/apps/nameless"}));
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->itemIdentifier(), "#(null)");
  EXPECT_EQ(item->dh_lumenDomainIdentifier(), std::nullopt);
}

TEST_F(LocalAppLibraryItemTest, ARecordWithoutADataContainerIsAnErrorLine) {
  EXPECT_EQ(itemOf(FakeApplicationProxy({.bundleIdentifier = "org.example.a"})), nullptr);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{
                "[ERROR] can't create an app library item without a data container URL"});
}

TEST_F(LocalAppLibraryItemTest, AnApplicationWithoutADocumentsFolderHasNoItem) {
  system.tree.makeFolder("/apps/empty");
  EXPECT_EQ(itemOf(FakeApplicationProxy(
                {.bundleIdentifier = "org.example.a", .dataContainerPath = "/apps/empty"})),
            nullptr);
}

TEST_F(LocalAppLibraryItemTest, TheInitializerOfAPlainRecordIsThereToo) {
  system.folder("folder");
  const Item item = LocalAppLibraryItem::init(system.urlInStorage("folder"), {});
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->filename(), "folder");
  EXPECT_EQ(item->fetchAppLibraryItem(), item);
  EXPECT_EQ(LocalAppLibraryItem::init(system.urlInStorage("gone"), {}), nullptr);
}

}  // namespace
}  // namespace vantrell
