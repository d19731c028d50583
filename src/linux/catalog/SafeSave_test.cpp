#include <sys/xattr.h>

#include <filesystem>

#include "linux/catalog/CatalogTestStorage.h"

// Each row of the table in docs/guarantees.md, as it looks to somebody who was away while it
// happened.

namespace vantrell::linuxos {
namespace {

class SafeSave : public CatalogTest {
 protected:
  /// A file with an ID, catalogued long enough ago to be trusted.
  DocumentID document(std::string_view name) {
    if (fileID(name) == FileID{}) write(name);
    look();
    const DocumentID id = idOf(name);
    EXPECT_NE(id, DocumentID{});
    return id;
  }
};

TEST_F(SafeSave, Row1AFileThatStaysKeepsItsDocument) {
  const DocumentID a = document("a");
  lookAfterRestart();
  EXPECT_EQ(placeOf(a), "a");
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row1AFileWrittenInPlaceKeepsItsDocument) {
  const DocumentID a = document("a");
  close();
  write("a", "other text");
  EXPECT_EQ(look().changed, 1U);
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row1RenamingTheFolderChangesNothing) {
  makeFolder("one");
  const DocumentID a = document("one/a");
  close();
  rename("one", "two");
  look();
  EXPECT_EQ(placeOf(a), "two/a");
  EXPECT_EQ(idOf("two/a"), a);
}

TEST_F(SafeSave, Row2AMovedFileTakesItsDocumentAlong) {
  makeFolder("folder");
  const DocumentID a = document("a");
  close();
  rename("a", "folder/b");
  EXPECT_EQ(look().moved, 1U);
  EXPECT_EQ(placeOf(a), "folder/b");
  EXPECT_EQ(idOf("folder/b"), a);
}

TEST_F(SafeSave, Row3ADeletedFileEndsItsDocument) {
  const DocumentID a = document("a");
  close();
  remove("a");
  EXPECT_EQ(look().documentsGone, 1U);
  EXPECT_EQ(placeOf(a), "");
}

TEST_F(SafeSave, Row4ATemporaryFileRenamedOverHandsTheDocumentOn) {
  const DocumentID a = document("a");
  close();
  write("new");
  rename("new", "a");
  EXPECT_EQ(look().documentsHandedOver, 1U);
  EXPECT_EQ(placeOf(a), "a");
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row4DeletingAndCreatingUnderTheSameNameHandsTheDocumentOn) {
  const DocumentID a = document("a");
  close();
  remove("a");
  write("a", "again");
  look();
  EXPECT_EQ(placeOf(a), "a");
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row4AKnownFileWithoutAnIDThatIsMovedOverTakesTheDocument) {
  write("b");
  const DocumentID a = document("a");
  close();
  rename("b", "a");
  look();
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row5ABackupRenameAndANewFileHandTheDocumentOn) {
  for (const char* backup : {"a~", "a.bak", "a.BAK", "a.orig", "a.old", "a.tmp", "a.temp", "a.sav",
                             "#a#", "~a", ".a.swp"}) {
    const DocumentID a = document("a");
    close();
    rename("a", backup);
    write("a", "saved");
    look();
    EXPECT_EQ(idOf("a"), a) << backup;
    EXPECT_NE(idOf(backup), a) << backup;
    remove(backup);
    look();
    EXPECT_EQ(placeOf(a), "a") << backup;
  }
}

TEST_F(SafeSave, Row6ARenameAndANewFileInItsPlaceAreTwoDocuments) {
  const DocumentID a = document("a");
  close();
  rename("a", "b");
  write("a", "another");
  look();
  EXPECT_EQ(placeOf(a), "b");
  EXPECT_NE(idOf("a"), a);
}

TEST_F(SafeSave, Row7ExchangedDocumentsGoWithTheirFiles) {
  const DocumentID a = document("a");
  const DocumentID b = document("b");
  close();
  exchange("a", "b");
  look();
  EXPECT_EQ(placeOf(a), "b");
  EXPECT_EQ(placeOf(b), "a");
}

TEST_F(SafeSave, Row7ThreeDocumentsThatGoRoundGoWithTheirFiles) {
  const DocumentID a = document("a");
  const DocumentID b = document("b");
  const DocumentID c = document("c");
  close();
  rename("a", "x");
  rename("b", "a");
  rename("c", "b");
  rename("x", "c");
  look();
  EXPECT_EQ(placeOf(a), "c");
  EXPECT_EQ(placeOf(b), "a");
  EXPECT_EQ(placeOf(c), "b");
}

TEST_F(SafeSave, Row8ADocumentMovedOverAnotherStaysItself) {
  const DocumentID a = document("a");
  const DocumentID b = document("b");
  close();
  rename("b", "a");
  look();
  EXPECT_EQ(placeOf(b), "a");
  EXPECT_EQ(placeOf(a), "");
}

TEST_F(SafeSave, Row8aATemporaryFileThatSomebodyAskedForHandsTheDocumentOn) {
  for (const char* temporary : {"a.tmp", ".a.1234"}) {
    const DocumentID a = document("a");
    const DocumentID b = document(temporary);
    ASSERT_NE(a, b);
    close();
    rename(temporary, "a");
    look();
    EXPECT_EQ(idOf("a"), a) << temporary;
    EXPECT_EQ(placeOf(a), "a") << temporary;
    EXPECT_EQ(placeOf(b), "") << temporary;
  }
}

TEST_F(SafeSave, Row9AnExchangeWithATemporaryFileHandsTheDocumentOn) {
  const DocumentID a = document("a");
  write("a.tmp", "new");
  look();
  close();
  exchange("a", "a.tmp");
  look();
  EXPECT_EQ(idOf("a"), a);
  EXPECT_NE(idOf("a.tmp"), a);
}

TEST_F(SafeSave, Row9AnExchangeWithAHiddenFileThatIsThenDeletedHandsTheDocumentOn) {
  const DocumentID a = document("a");
  close();
  write(".a.new", "new");
  exchange("a", ".a.new");
  remove(".a.new");
  look();
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row10SavingOneNameOfALinkedFileHandsTheDocumentOn) {
  const DocumentID a = document("a");
  link("a", "b");
  look();
  close();
  write("new");
  rename("new", "a");
  look();
  EXPECT_EQ(idOf("a"), a);
  EXPECT_NE(idOf("b"), a);
}

TEST_F(SafeSave, Row10aDeletingOneNameOfALinkedFileMovesItsHome) {
  const DocumentID a = document("a");
  link("a", "b");
  look();
  close();
  remove("a");
  look();
  EXPECT_EQ(placeOf(a), "b");
  EXPECT_EQ(idOf("b"), a);
}

TEST_F(SafeSave, Row11AFolderInItsPlaceEndsADocument) {
  const DocumentID a = document("a");
  close();
  remove("a");
  makeFolder("a");
  look();
  EXPECT_EQ(placeOf(a), "");
}

TEST_F(SafeSave, Row11ALinkInItsPlaceEndsADocumentAndAMovedOneGoesOn) {
  const DocumentID a = document("a");
  const DocumentID b = document("b");
  close();
  remove("a");
  std::filesystem::create_symlink("b", path("a"));
  rename("b", "c");
  std::filesystem::create_symlink("c", path("b"));
  look();
  EXPECT_EQ(placeOf(a), "");
  EXPECT_EQ(placeOf(b), "c");
}

TEST_F(SafeSave, Row12PackagesFollowTheSameRows) {
  makeFolder("a.tessera");
  write("a.tessera/part");
  const DocumentID a = document("a.tessera");
  close();
  rename("a.tessera", "a.tessera~");
  makeFolder("a.tessera");
  look();
  EXPECT_EQ(idOf("a.tessera"), a);
  close();
  rename("a.tessera", "b.tessera");
  look();
  EXPECT_EQ(placeOf(a), "b.tessera");
}

TEST_F(SafeSave, Row13ACopyWithAllAttributesNeverTakesAnID) {
  const DocumentID a = document("a");
  setAttribute("a", "user.com.quillon.lastuseddate#PS", "date");
  look();
  close();
  std::filesystem::copy_file(path("a"), path("b"));
  setAttribute("b", "user.com.quillon.lastuseddate#PS", "date");
  look();
  EXPECT_EQ(placeOf(a), "a");
  EXPECT_NE(idOf("b"), a);
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(SafeSave, Row14AHiddenFileIsGoneAndHasItsIDAgainWhenShown) {
  const DocumentID a = document("a");
  close();
  rename("a", ".a");
  EXPECT_EQ(look().documentsGone, 1U);
  EXPECT_EQ(placeOf(a), "");
  close();
  rename(".a", "b");
  EXPECT_EQ(look().documentsReturned, 1U);
  EXPECT_EQ(placeOf(a), "b");
  EXPECT_EQ(idOf("b"), a);
}

TEST_F(SafeSave, Row15AFileThatLeavesAndComesBackHasItsIDAgain) {
  makeFolder("folder");
  const DocumentID a = document("folder/a");
  close();
  moveOut("folder", "away");
  look();
  EXPECT_EQ(placeOf(a), "");
  close();
  moveIn("away", "back");
  look();
  EXPECT_EQ(placeOf(a), "back/a");
  EXPECT_EQ(idOf("back/a"), a);
}

TEST_F(SafeSave, Row16AnOlderFileMovedToANameWhoseFileWasMovedAsideTakesNothing) {
  write("b");
  const DocumentID a = document("a");
  close();
  rename("a", "a.bak");
  rename("b", "a");
  look();
  EXPECT_EQ(placeOf(a), "a.bak");
  EXPECT_NE(idOf("a"), a);
}

TEST_F(SafeSave, ASecondSaveMovesTheBackupsDocumentToTheNewBackup) {
  const DocumentID a = document("a");
  const DocumentID backup = document("a~");
  close();
  rename("a", "a~");
  write("a", "saved again");
  look();
  EXPECT_EQ(idOf("a"), a);
  EXPECT_EQ(idOf("a~"), backup);
}

TEST_F(SafeSave, AFolderDeletedAndMadeAgainIsAnotherOneAndSoAreItsFiles) {
  makeFolder("folder");
  const DocumentID a = document("folder/a");
  close();
  remove("folder");
  makeFolder("folder");
  write("folder/a", "new");
  look();
  EXPECT_EQ(placeOf(a), "");
  EXPECT_NE(idOf("folder/a"), a);
}

TEST_F(SafeSave, AttributesThatADocumentKeepsGoToItsNewFile) {
  const DocumentID a = document("a");
  setAttribute("a", "user.com.quillon.lastuseddate#PS", "date");
  setAttribute("a", "user.com.quillon.metadata:_kMDItemUserTags", "tags");
  setAttribute("a", "user.com.quillon.favorite-rank.number#PS", "old rank");
  setAttribute("a", "user.somebody.else", "private");
  look();
  close();
  write("new");
  setAttribute("new", "user.com.quillon.favorite-rank.number#PS", "new rank");
  rename("new", "a");
  look();
  EXPECT_EQ(idOf("a"), a);
  EXPECT_EQ(attribute("a", "user.com.quillon.lastuseddate#PS"), "date");
  EXPECT_EQ(attribute("a", "user.com.quillon.metadata:_kMDItemUserTags"), "tags");
  EXPECT_EQ(attribute("a", "user.com.quillon.favorite-rank.number#PS"), "new rank");
  EXPECT_EQ(attribute("a", "user.somebody.else"), "none");
}

TEST_F(SafeSave, AttributesSetThroughThisProcessAreKeptWithoutALook) {
  const DocumentID a = document("a");
  const std::string value = "noted";
  catalog().noteAttribute(fileID("a"), "com.quillon.lastuseddate#PS",
                          FndDataView(reinterpret_cast<const std::uint8_t*>(value.data()), 5));
  close();
  write("new");
  rename("new", "a");
  look();
  EXPECT_EQ(idOf("a"), a);
  EXPECT_EQ(attribute("a", "user.com.quillon.lastuseddate#PS"), "noted");
}

TEST_F(SafeSave, AnAttributeRemovedAfterASaveDoesNotComeBackAtTheNextLook) {
  constexpr const char* kDate = "user.com.quillon.lastuseddate#PS";
  document("a");
  setAttribute("a", kDate, "date");
  look();
  close();
  write("new");
  rename("new", "a");
  look();
  ASSERT_EQ(attribute("a", kDate), "date");
  close();
  ASSERT_EQ(::lremovexattr(path("a").c_str(), kDate), 0);
  look();
  EXPECT_EQ(attribute("a", kDate), "none");
  close();
  write("newer");
  rename("newer", "a");
  look();
  EXPECT_EQ(attribute("a", kDate), "none");
}

TEST_F(SafeSave, AnAttributeThatWasRemovedDoesNotComeBack) {
  document("a");
  setAttribute("a", "user.com.quillon.lastuseddate#PS", "date");
  look();
  catalog().noteAttribute(fileID("a"), "com.quillon.lastuseddate#PS", std::nullopt);
  close();
  write("new");
  rename("new", "a");
  look();
  EXPECT_EQ(attribute("a", "user.com.quillon.lastuseddate#PS"), "none");
}

}  // namespace
}  // namespace vantrell::linuxos
