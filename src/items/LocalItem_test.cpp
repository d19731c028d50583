#include "items/LocalItem.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cerrno>
#include <regex>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "items/LocalAppLibraryItem.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using Key = FndURLResourceKey;

class LocalItemTest : public testing::Test {
 protected:
  using Item = std::shared_ptr<const LocalItem>;

  Item itemAt(std::string_view relativePath, const LocalItem::Options& options = {}) {
    return LocalItem::init(system.urlInStorage(relativePath), options);
  }
  Item root() { return LocalItem::init(FndURL::fileURLWithPath(TestSystem::kStorageRoot)); }

  TestSystem system;
};

TEST_F(LocalItemTest,
       TheStorageRootIdentifierAndParentAreBothTheRootContainerIdentifierCapabilities1) {
  const Item item = root();
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->itemIdentifier(), DochostRootContainerItemIdentifier);
  EXPECT_EQ(item->parentItemIdentifier(), DochostRootContainerItemIdentifier);
  EXPECT_EQ(item->capabilities(), 1U);
  EXPECT_FALSE(item->isTrashed());
  EXPECT_EQ(item->filename(), "Documents");
}

TEST_F(LocalItemTest, AFilesRecordHoldsWhatTheDiskSays) {
  const FndURL url = system.file("folder/a.txt", "hello");
  const Item item = itemAt("folder/a.txt");
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->itemIdentifier(), *itemIdentifier(url));
  EXPECT_EQ(item->parentItemIdentifier(), *itemIdentifier(system.urlInStorage("folder")));
  EXPECT_EQ(item->itemIdentifierAsString(), item->itemIdentifier());
  EXPECT_EQ(item->parentItemIdentifierAsString(), item->parentItemIdentifier());
  EXPECT_EQ(item->filename(), "a.txt");
  EXPECT_EQ(item->typeIdentifier(), "text/plain");
  EXPECT_EQ(item->documentSize(), 5U);
  EXPECT_EQ(item->creationDate(), FndDate::fromUnixTime(1'700'000'000));
  EXPECT_EQ(item->contentModificationDate(), FndDate::fromUnixTime(1'700'000'000));
  EXPECT_EQ(item->childItemCount(), std::nullopt);
  EXPECT_EQ(item->capabilities(), 3U);
  EXPECT_TRUE(item->versionIdentifier().has_value());
  EXPECT_FALSE(item->isTrashed());
  EXPECT_FALSE(item->trashed());
  EXPECT_EQ(item->lastUsedDate(), std::nullopt);
  EXPECT_EQ(item->tagData(), std::nullopt);
  EXPECT_EQ(item->favoriteRank(), std::nullopt);
  EXPECT_EQ(item->fileID(), system.tree.fileID(url.path()));
  EXPECT_EQ(item->docID(), system.tree.documentID(url.path()));
  EXPECT_EQ(item->fileURL(), url);
  EXPECT_EQ(item->dh_lumenDomainIdentifier(), std::nullopt);
  EXPECT_EQ(item->dh_appContainerBundleIdentifier(), std::nullopt);
  EXPECT_FALSE(item->dh_isUbiquitous());
  EXPECT_TRUE(system.log.textsAt(LogLevel::Error).empty());
}

TEST_F(LocalItemTest, ATopLevelItemsParentIsTheRootContainer) {
  system.file("a.txt");
  EXPECT_EQ(itemAt("a.txt")->parentItemIdentifier(), DochostRootContainerItemIdentifier);
}

TEST_F(LocalItemTest, AFoldersRecordHasACountAndNoSizeOrDocumentID) {
  system.folder("folder");
  const Item item = itemAt("folder");
  EXPECT_TRUE(item->isFolder());
  EXPECT_FALSE(item->isPackage());
  EXPECT_EQ(item->documentSize(), std::nullopt);
  EXPECT_EQ(item->childItemCount(), 0U);
  EXPECT_EQ(item->docID(), std::nullopt);
  EXPECT_EQ(item->fileID(), system.tree.fileID(system.inStorage("folder")));
}

TEST_F(LocalItemTest, ARecordIsASnapshot) {
  const FndURL url = system.file("a.txt", "old");
  const Item before = itemAt("a.txt");
  system.file("a.txt", "longer");
  EXPECT_EQ(before->documentSize(), 3U);
  const Item after = itemAt("a.txt");
  EXPECT_EQ(after->documentSize(), 6U);
  EXPECT_NE(after->versionIdentifier(), before->versionIdentifier());
  EXPECT_EQ(after->itemIdentifier(), before->itemIdentifier());
}

TEST_F(LocalItemTest, ValuesThatTheURLRemembersAreNotReadAgain) {
  const FndURL url = system.file("a.txt");
  LocalItem::init(url);
  const std::size_t reads = system.tree.faults.calls(FakeCall::ReadResourceValues);
  LocalItem::init(url, {.customItemID = {},
                        .customParentItemID = "fid=1",
                        .customFilename = {},
                        .hasLumenDomainIdentifier = false,
                        .bundleIdentifier = {}});
  EXPECT_EQ(system.tree.faults.calls(FakeCall::ReadResourceValues), reads);
}

TEST_F(LocalItemTest, CustomValuesReplaceTheComputedOnes) {
  system.file("a.txt");
  const Item item = itemAt("a.txt", {.customItemID = "did=77",
                                     .customParentItemID = "fid=88",
                                     .customFilename = "Other name",
                                     .hasLumenDomainIdentifier = true,
                                     .bundleIdentifier = "org.example.a"});
  EXPECT_EQ(item->itemIdentifier(), "did=77");
  EXPECT_EQ(item->docID(), DocumentID{77});
  EXPECT_EQ(item->parentItemIdentifier(), "fid=88");
  EXPECT_EQ(item->filename(), "Other name");
  EXPECT_EQ(item->dh_lumenDomainIdentifier(), "org.example.a");
  EXPECT_EQ(item->dh_appContainerBundleIdentifier(), "org.example.a");
  EXPECT_EQ(system.verstow.allocations(), 0U);
}

TEST_F(LocalItemTest, URLKeysAreTheNineToPrefetchInThisOrder) {
  EXPECT_THAT(LocalItem::urlKeys(),
              testing::ElementsAre(Key::ParentDirectoryURL, Key::Name, Key::LocalizedName,
                                   Key::TypeIdentifier, Key::FileSize, Key::CreationDate,
                                   Key::ContentModificationDate, Key::IsReadable, Key::IsWritable));
}

// What a record cannot do without.
class MissingValueTest : public LocalItemTest {
 protected:
  void expectRefusal(const Item& item, LogLevel level, const std::string& line) {
    EXPECT_EQ(item, nullptr);
    EXPECT_TRUE(system.log.has(level, line)) << testing::PrintToString(system.log.texts());
  }
};

TEST_F(MissingValueTest, AnItemWithoutAnIDIsADebugLine) {
  expectRefusal(itemAt("gone.txt"), LogLevel::Debug, "[DEBUG] can't create an item without an ID");
}

TEST_F(MissingValueTest, AnItemWithoutAParentIDIsAnErrorLine) {
  system.tree.writeFile("/elsewhere/a.txt");
  const Item item = LocalItem::init(FndURL::fileURLWithPath("/elsewhere/a.txt"),
                                    {.customItemID = "did=5",
                                     .customParentItemID = {},
                                     .customFilename = {},
                                     .hasLumenDomainIdentifier = false,
                                     .bundleIdentifier = {}});
  expectRefusal(item, LogLevel::Error,
                "[ERROR] can't create an item without a parent ID (itemIdentifier: did=5)");
}

TEST_F(MissingValueTest, AnItemWithoutAFilenameIsAnErrorLine) {
  const FndURL url = system.file("folder/a.txt");
  system.tree.withholdResource(Key::Name);
  const std::string identifiers =
      "(itemIdentifier: " + *itemIdentifier(url) +
      ", parentItemIdentifier: " + *itemIdentifier(system.urlInStorage("folder")) + ")";
  expectRefusal(itemAt("folder/a.txt"), LogLevel::Error,
                "[ERROR] can't create an item without a filename " + identifiers);
}

TEST_F(MissingValueTest, AnItemWithoutATypeIdentifierIsAnErrorLine) {
  const FndURL url = system.file("a.txt");
  system.tree.withholdResource(Key::TypeIdentifier);
  expectRefusal(itemAt("a.txt"), LogLevel::Error,
                "[ERROR] can't create an item without a type identifier (itemIdentifier: " +
                    *itemIdentifier(url) +
                    ", parentItemIdentifier: DochostRootContainerItemIdentifier, filename: a.txt)");
}

TEST_F(MissingValueTest, AllOtherMissingValuesLeaveThePropertyNone) {
  system.file("a.txt");
  for (const Key key : {Key::FileSize, Key::CreationDate, Key::ContentModificationDate,
                        Key::IsWritable, Key::ContentVersion, Key::FileResourceIdentifier}) {
    system.tree.withholdResource(key);
  }
  system.tree.faults.failNext(FakeCall::Status, {FndError::posix(EIO)});
  const Item item = itemAt("a.txt");
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->documentSize(), std::nullopt);
  EXPECT_EQ(item->creationDate(), std::nullopt);
  EXPECT_EQ(item->contentModificationDate(), std::nullopt);
  EXPECT_EQ(item->versionIdentifier(), std::nullopt);
  EXPECT_EQ(item->fileID(), std::nullopt);
  EXPECT_EQ(item->capabilities(), 1U);
}

class InboxTest : public MissingValueTest {};

TEST_F(InboxTest,
       AFolderNamedInboxAtTheTopOfTheStorageRootOrOfAnAppLibraryIsNotReturnedOneDeeperDownIs) {
  const std::string line = "[DEBUG] can't create an item for the \"Inbox\" directory";
  system.folder("Inbox");
  expectRefusal(itemAt("Inbox"), LogLevel::Debug, line);

  const FndURL library = system.addApp("org.example.a");
  system.tree.makeFolder("/apps/org.example.a/Documents/Inbox");
  system.log.clear();
  expectRefusal(LocalItem::init(library.URLByAppendingPathComponent("Inbox")), LogLevel::Debug,
                line);

  system.folder("folder/Inbox");
  EXPECT_NE(itemAt("folder/Inbox"), nullptr);
}

TEST_F(InboxTest, AFileNamedInboxIsReturned) {
  system.file("Inbox");
  EXPECT_NE(itemAt("Inbox"), nullptr);
}

TEST_F(LocalItemTest,
       AFolderWith5EntriesOnAFileSystemWhoseDirectoryLinkCountIsEntriesPlus2ShowsAChildCountOf5) {
  for (const char* name : {"a", "b", "c", "d", "e"}) system.file(std::string("folder/") + name);
  EXPECT_EQ(itemAt("folder")->childItemCount(), 5U);
}

TEST_F(LocalItemTest, ALinkCountBelow2GivesNoChildCount) {
  system.folder("folder");
  system.tree.setLinkCount(system.inStorage("folder"), 1);
  EXPECT_EQ(itemAt("folder")->childItemCount(), std::nullopt);
  system.tree.setLinkCount(system.inStorage("folder"), 2);
  EXPECT_EQ(itemAt("folder")->childItemCount(), 0U);
}

TEST_F(LocalItemTest, TheChildCountCanBeSetBeforeARecordIsShared) {
  system.folder("folder");
  const auto item = std::const_pointer_cast<LocalItem>(itemAt("folder"));
  item->setChildItemCount(9);
  EXPECT_EQ(item->childItemCount(), 9U);
}

TEST_F(
    LocalItemTest,
    APackageWhoseTypeBeginsWithComQuillonTesseraHasASizeAPackageOfAnotherTypeHasNoneAPlainFolderHasNone) {
  for (const std::string name : {"a.tessera", "b.brindle", "c.pouch", "plain"}) {
    system.file(name + "/content/one.txt", "12345");
    system.file(name + "/two.txt", "67");
  }
  EXPECT_EQ(itemAt("a.tessera")->documentSize(), 7U);
  EXPECT_EQ(itemAt("b.brindle")->documentSize(), 7U);
  EXPECT_EQ(itemAt("c.pouch")->documentSize(), std::nullopt);
  EXPECT_EQ(itemAt("plain")->documentSize(), std::nullopt);
  EXPECT_TRUE(itemAt("a.tessera")->isPackage());
  EXPECT_FALSE(itemAt("a.tessera")->isFolder());
  EXPECT_EQ(itemAt("a.tessera")->childItemCount(), std::nullopt);
}

TEST_F(LocalItemTest, APackageWhoseSizeCannotBeReadHasNone) {
  system.folder("a.tessera");
  system.tree.faults.failNext(FakeCall::RecursiveSize, {FndError::posix(EACCES)});
  const Item item = itemAt("a.tessera");
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->documentSize(), std::nullopt);
}

TEST_F(LocalItemTest, AReadOnlyFileHasCapabilities1AWritableOne3) {
  const FndURL url = system.file("a.txt");
  EXPECT_EQ(itemAt("a.txt")->capabilities(), 3U);
  system.tree.setMode(url.path(), 0400);
  EXPECT_EQ(itemAt("a.txt")->capabilities(), 1U);
}

TEST_F(LocalItemTest, AReadOnlyFolderHasCapabilities1AWritableOne3) {
  const FndURL url = system.folder("folder");
  EXPECT_EQ(itemAt("folder")->capabilities(), 3U);
  system.tree.setMode(url.path(), 0500);
  EXPECT_EQ(itemAt("folder")->capabilities(), 1U);
}

TEST_F(
    LocalItemTest,
    AnItemAnywhereBelowATrashFolderThatLiesDirectlyInADocumentsFolderIsTrashedATrashFolderElsewhereDoesNotMakeItsContentsTrashed) {
  for (const std::string path : {".Trash/a.txt", ".Trash/x/y/b.txt", "x/Documents/.Trash/c.txt",
                                 "x/.Trash/d.txt", ".Trashed/e.txt", "Documents/x/.Trash/f.txt",
                                 "xDocuments/.Trash/g.txt", "Documents.Trash/h.txt"}) {
    system.file(path);
  }
  EXPECT_TRUE(itemAt(".Trash")->isTrashed());
  EXPECT_TRUE(itemAt(".Trash/a.txt")->isTrashed());
  EXPECT_TRUE(itemAt(".Trash/x/y/b.txt")->isTrashed());
  EXPECT_TRUE(itemAt("x/Documents/.Trash/c.txt")->isTrashed());
  EXPECT_FALSE(itemAt("x/.Trash/d.txt")->isTrashed());
  EXPECT_FALSE(itemAt(".Trashed/e.txt")->isTrashed());
  EXPECT_FALSE(itemAt("Documents/x/.Trash/f.txt")->isTrashed());
  EXPECT_FALSE(itemAt("xDocuments/.Trash/g.txt")->isTrashed());
  EXPECT_FALSE(itemAt("Documents.Trash/h.txt")->isTrashed());
}

TEST_F(LocalItemTest, ALinksRecordTellsTheFileIDOfItsTarget) {
  const FndURL url = system.file("a.txt");
  system.tree.makeLink(system.inStorage("link"), "a.txt");
  const Item item = itemAt("link");
  EXPECT_EQ(item->fileID(), system.tree.fileID(url.path()));
  EXPECT_EQ(item->typeIdentifier(), kSymbolicLinkTypeIdentifier);
  EXPECT_FALSE(item->isFolder());
}

TEST_F(LocalItemTest, ALinkToNowhereHasARecordAndADebugLine) {
  system.tree.makeLink(system.inStorage("link"), "gone");
  const Item item = itemAt("link");
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->fileID(), std::nullopt);
  EXPECT_TRUE(system.log.has(LogLevel::Debug, "[DEBUG] can't find fileID for item \"" +
                                                  system.inStorage("link") + "\"; " +
                                                  FndError::posix(ENOENT).description()));
}

TEST_F(LocalItemTest, AStatusThatCannotBeTakenForAnotherReasonIsAnErrorLine) {
  system.folder("folder");
  system.tree.faults.failNext(FakeCall::Status, {FndError::posix(EIO)});
  const Item item = itemAt("folder");
  ASSERT_NE(item, nullptr);
  EXPECT_EQ(item->fileID(), std::nullopt);
  EXPECT_EQ(item->childItemCount(), std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] can't find fileID for item \"" +
                                     system.inStorage("folder") + "\"; " +
                                     FndError::posix(EIO).description()});
}

TEST_F(LocalItemTest, AnItemInAnAppLibraryCarriesItsBundleIdentifierWhenAskedFor) {
  const FndURL library = system.addApp("org.example.a");
  system.addApp("org.example.b");
  system.tree.writeFile("/apps/org.example.a/Documents/x/a.txt");
  const FndURL url = library.URLByAppendingPathComponent("x/a.txt");
  const Item item = LocalItem::init(url);
  EXPECT_EQ(item->dh_lumenDomainIdentifier(), "org.example.a");
  EXPECT_EQ(item->dh_appContainerBundleIdentifier(), "org.example.a");

  LocalItem::Options notAsked;
  notAsked.hasLumenDomainIdentifier = false;
  EXPECT_EQ(LocalItem::init(url, notAsked)->dh_lumenDomainIdentifier(), std::nullopt);
}

TEST_F(LocalItemTest, TheAppLibraryItemOfAnItemIsThatOfItsLibrary) {
  const FndURL library = system.addApp("org.example.a");
  system.tree.writeFile("/apps/org.example.a/Documents/x/a.txt");
  const Item item = LocalItem::init(library.URLByAppendingPathComponent("x/a.txt"));
  const auto libraryItem = item->fetchAppLibraryItem();
  ASSERT_NE(libraryItem, nullptr);
  EXPECT_EQ(libraryItem->itemIdentifier(), "#org.example.a");
  EXPECT_EQ(libraryItem->fetchAppLibraryItem(), libraryItem);
}

TEST_F(LocalItemTest, AnItemInNoAppLibraryHasNoAppLibraryItem) {
  system.addApp("org.example.a");
  system.file("a.txt");
  EXPECT_EQ(itemAt("a.txt")->fetchAppLibraryItem(), nullptr);
}

class DescriptionTest : public LocalItemTest {
 protected:
  // The description with the address, which is not ours to choose, as "0x1".
  static std::string of(const LocalItem& item) {
    return std::regex_replace(item.description(), std::regex("0x[0-9a-f]+"), "0x1");
  }
};

TEST_F(DescriptionTest, TellsIdentifierNameParentAndType) {
  system.file("folder/a b.txt");
  LocalItem::Options options;
  options.customItemID = "did=5";
  options.customParentItemID = "fid=7";
  EXPECT_EQ(of(*itemAt("folder/a b.txt", options)),
            "<LocalItem:0x1 did=5 name:\"a b.txt\" parent:fid=7 type:text/plain>");
}

TEST_F(DescriptionTest, CallsTheRootContainerRootAndShowsTrashAndRank) {
  const FndURL url = system.file(".Trash/a.txt");
  system.tree.setAttribute(url.path(), "com.quillon.favorite-rank.number#PS",
                           *archivedDataWithRootObject(ArchiveValue(FndNumber(std::uint64_t{12}))));
  LocalItem::Options options;
  options.customItemID = "did=5";
  options.customParentItemID = DochostItemIdentifier(DochostRootContainerItemIdentifier);
  EXPECT_EQ(of(*itemAt(".Trash/a.txt", options)),
            "<LocalItem:0x1 did=5 name:\"a.txt\" parent:root type:text/plain trashed "
            "favorite:12>");
}

TEST_F(DescriptionTest, NamesTheClassAndTheObject) {
  system.addApp("org.example.a", "Example");
  const auto item = LocalAppLibraryItem::initWithBundleProxy(
      *system.appreg.bundleProxyForIdentifier("org.example.a"));
  EXPECT_EQ(of(*item),
            "<LocalAppLibraryItem:0x1 #org.example.a name:\"Example\" parent:root "
            "type:inode/directory>");
  EXPECT_NE(item->description(), root()->description());
}

}  // namespace
}  // namespace vantrell
