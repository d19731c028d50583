// One file under several names is one document, whichever of them is saved, moved or removed.
#include <gtest/gtest.h>

#include "JudgedStorage.h"

namespace vantrell::properties {
namespace {

/// A document "a" whose file is "F/b" as well.
class HardLink : public ::testing::Test {
 protected:
  void SetUp() override {
    storage().createFolder(path("F"));
    storage().createFile(path("a"), "content");
    storage().hardLink(path("a"), path("F/b"));
    _judged.look();
    _document = _judged.ask("a");
  }
  void TearDown() override { EXPECT_EQ(_judged.complaints(), ""); }

  std::string path(const std::string& name) const { return _judged.path(name); }
  TestStorage& storage() { return _judged.storage; }

  JudgedStorage _judged{TestStorage::defaultParent()};
  DocumentID _document;
};

TEST_F(HardLink, BothNamesHaveTheSameID) { EXPECT_EQ(_judged.ask("F/b"), _document); }

TEST_F(HardLink, TheDocumentGoesOnWithTheNameThatIsLeft) {
  storage().remove(path("a"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "F/b");
  storage().remove(path("F/b"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "");
}

TEST_F(HardLink, SavingTheNameItLivesUnderTakesTheDocumentAlong) {
  storage().createFile(path("a.tmp"), "new");
  storage().moveOver(path("a.tmp"), path("a"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "a");
  EXPECT_NE(_judged.ask("F/b"), _document);
}

TEST_F(HardLink, SavingTheOtherNameLeavesTheDocument) {
  storage().createFile(path("F/b.tmp"), "new");
  storage().moveOver(path("F/b.tmp"), path("F/b"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "a");
  EXPECT_NE(_judged.ask("F/b"), _document);
}

TEST_F(HardLink, ABackupMadeByALinkIsABackup) {
  storage().hardLink(path("a"), path("a~"));
  storage().createFile(path("a.tmp"), "new");
  storage().moveOver(path("a.tmp"), path("a"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "a");
}

TEST_F(HardLink, ALinkOverAnotherDocumentEndsThatOne) {
  storage().createFile(path("c"), "other");
  _judged.look();
  const DocumentID other = _judged.ask("c");
  storage().remove(path("c"));
  storage().hardLink(path("a"), path("c"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(other), "");
  EXPECT_EQ(_judged.ask("c"), _document);
}

TEST_F(HardLink, ALinkOutsideTheStorageBringsTheDocumentBack) {
  storage().hardLink(path("a"), storage().outside() + "/kept");
  storage().remove(path("a"));
  storage().remove(path("F/b"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "");
  storage().moveToFreeName(storage().outside() + "/kept", path("F/back"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "F/back");
}

TEST_F(HardLink, TheSameFileUnderTwoNamesOfOneFolderIsTwoEntries) {
  storage().hardLink(path("F/b"), path("F/c"));
  _judged.look();
  EXPECT_EQ(_judged.catalog().entryCountOfFolder(_judged.fileAt("F")), 2U);
}

TEST_F(HardLink, AttributesThatTheSavedFileTookAlongAreNoNewsUnderItsOtherName) {
  storage().setAttribute(path("a"), "com.quillon.favorite-rank.number#PS", "1");
  _judged.look();
  storage().createFile(path("a.tmp"), "new");
  storage().moveOver(path("a.tmp"), path("a"));
  storage().hardLink(path("a"), path("e"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "a");
  EXPECT_EQ(readAttributes(path("e")).size(), 1U);
}

TEST_F(HardLink, ANameInsideAPackageIsANameThatTheFileHadBefore) {
  storage().createPackage(path("p.tessera"));
  storage().hardLink(path("a"), path("p.tessera/b"));
  storage().remove(path("F/b"));
  _judged.look();
  storage().createFile(path("a.tmp"), "new");
  storage().moveOver(path("a.tmp"), path("a"));
  storage().moveOver(path("p.tessera"), path("p"));
  _judged.look();
  EXPECT_EQ(_judged.whereIs(_document), "a");
}

}  // namespace
}  // namespace vantrell::properties
