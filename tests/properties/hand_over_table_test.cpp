// The judge of the random scenarios, judged: it knows the table, and it notices lies.
#include <gtest/gtest.h>

#include <map>

#include "CatalogRows.h"
#include "HandOverTable.h"
#include "IdentityJudge.h"
#include "JudgedStorage.h"

namespace vantrell::properties {
namespace {

/// A storage with a document "a" (ID 1) and, where a test says so, more of them; the table says
/// what becomes of them after some changes.
class HandOverTableTest : public ::testing::Test {
 protected:
  std::string in(const std::string& name) const { return _storage.root() + "/" + name; }
  ObjectNumber objectAt(const std::string& name) const {
    const ObservedTree tree = _storage.observe();
    const Place* place = tree.at({tree.root(), name});
    return place == nullptr ? ObjectNumber{} : place->object;
  }
  void file(const std::string& name) { _storage.createFile(in(name), name); }
  void document(const std::string& name) {
    if (objectAt(name) == ObjectNumber{}) file(name);
    const DocumentID documentID{static_cast<std::uint32_t>(_documents.size() + 1)};
    const Home home{_storage.observe().root(), name};
    _documents.push_back({documentID, objectAt(name), true, {home}, {}});
  }
  void startWatching() { _before = _storage.observe(); }
  std::set<ObjectNumber> allowedFor(std::size_t document) const {
    const ObservedTree after = _storage.observe();
    return HandOverTable(_before, after, _documents).expectationFor(_documents[document]).allowed;
  }
  std::set<ObjectNumber> only(const std::string& name) const { return {objectAt(name)}; }
  std::set<ObjectNumber> gone() const { return {ObjectNumber{}}; }
  std::set<ObjectNumber> itself(std::size_t document) const {
    return {_documents[document].object};
  }

  TestStorage _storage{TestStorage::defaultParent()};
  ObservedTree _before;
  std::vector<TrackedDocument> _documents;
};

TEST_F(HandOverTableTest, AMovedFileIsItsDocument) {
  document("a");
  startWatching();
  _storage.moveOver(in("a"), in("b"));
  EXPECT_EQ(allowedFor(0), only("b"));
}

TEST_F(HandOverTableTest, ARemovedFileEndsItsDocument) {
  document("a");
  startWatching();
  _storage.remove(in("a"));
  EXPECT_EQ(allowedFor(0), gone());
}

TEST_F(HandOverTableTest, ATemporaryFileRenamedOverTakesTheDocument) {
  document("a");
  startWatching();
  file("a.tmp");
  _storage.moveOver(in("a.tmp"), in("a"));
  EXPECT_EQ(allowedFor(0), only("a"));
  EXPECT_NE(allowedFor(0), itself(0));
}

TEST_F(HandOverTableTest, ABackupLeavesTheDocumentToTheNewFile) {
  document("a");
  startWatching();
  _storage.moveOver(in("a"), in("a~"));
  file("a");
  EXPECT_EQ(allowedFor(0), only("a"));
}

TEST_F(HandOverTableTest, ARenameAndANewFileAreNoSave) {
  document("a");
  startWatching();
  _storage.moveOver(in("a"), in("b"));
  file("a");
  EXPECT_EQ(allowedFor(0), only("b"));
}

TEST_F(HandOverTableTest, TwoOrdinaryDocumentsExchangedTakeTheirIDsAlong) {
  document("a");
  document("b");
  startWatching();
  _storage.exchange(in("a"), in("b"));
  EXPECT_EQ(allowedFor(0), only("b"));
  EXPECT_EQ(allowedFor(1), only("a"));
}

TEST_F(HandOverTableTest, ADocumentMovedOverAnotherEndsThatOne) {
  document("a");
  document("b");
  startWatching();
  _storage.moveOver(in("b"), in("a"));
  EXPECT_EQ(allowedFor(0), gone());
  EXPECT_EQ(allowedFor(1), only("a"));
}

TEST_F(HandOverTableTest, ATemporaryFileThatWasGivenAnIDLosesItToTheSavedDocument) {
  document("a");
  document("a.tmp");
  startWatching();
  _storage.moveOver(in("a.tmp"), in("a"));
  EXPECT_EQ(allowedFor(0), only("a"));
  EXPECT_FALSE(allowedFor(1).contains(objectAt("a")));
}

TEST_F(HandOverTableTest, AnExchangedTemporaryFileTakesTheDocument) {
  document("a");
  file("a.tmp");
  startWatching();
  _storage.exchange(in("a.tmp"), in("a"));
  EXPECT_EQ(allowedFor(0), only("a"));
}

TEST_F(HandOverTableTest, SavingOneNameOfALinkedFileTakesTheDocument) {
  document("a");
  _storage.hardLink(in("a"), in("b"));
  startWatching();
  _storage.remove(in("a"));
  file("a");
  EXPECT_EQ(allowedFor(0), only("a"));
}

TEST_F(HandOverTableTest, AFolderInTheFilesPlaceEndsTheDocument) {
  document("a");
  startWatching();
  _storage.remove(in("a"));
  _storage.createFolder(in("a"));
  EXPECT_EQ(allowedFor(0), gone());
}

TEST_F(HandOverTableTest, ACopyTakesNothing) {
  document("a");
  startWatching();
  _storage.copy(in("a"), in("b"), true);
  EXPECT_EQ(allowedFor(0), only("a"));
}

TEST_F(HandOverTableTest, AHiddenFileIsGone) {
  document("a");
  startWatching();
  _storage.moveOver(in("a"), in(".a"));
  EXPECT_EQ(allowedFor(0), gone());
}

TEST_F(HandOverTableTest, AShownFileComesBack) {
  document("a");
  _storage.moveOver(in("a"), in(".a"));
  _documents[0].alive = false;
  startWatching();
  _storage.moveOver(in(".a"), in("c"));
  EXPECT_EQ(allowedFor(0), only("c"));
}

/// An index that passes everything on, but for what a test makes it lie about.
class LyingIndex final : public linuxos::FileIndex {
 public:
  explicit LyingIndex(linuxos::FileIndex& truth) : _truth(truth) {}

  std::map<FileID, std::string> paths;
  std::map<FileID, std::uint64_t> counts;
  std::map<FileID, DocumentID> documentIDs;
  std::map<DocumentID, FileID> files;

  Result<std::string> pathForFileID(FileID fileID) override {
    return paths.contains(fileID) ? paths[fileID] : _truth.pathForFileID(fileID);
  }
  std::optional<std::uint64_t> entryCountOfFolder(FileID folder) override {
    return counts.contains(folder) ? counts[folder] : _truth.entryCountOfFolder(folder);
  }
  DocumentID documentIDOfObject(const linuxos::SeenObject& object) override {
    return documentIDs.contains(object.fileID) ? documentIDs[object.fileID]
                                               : _truth.documentIDOfObject(object);
  }
  Result<std::vector<DocumentID>> documentIDsOfObjects(
      FileID folder, std::span<const linuxos::SeenObject> documents) override {
    return _truth.documentIDsOfObjects(folder, documents);
  }
  Result<FileID> fileIDOfDocument(DocumentID documentID) override {
    return files.contains(documentID) ? files[documentID] : _truth.fileIDOfDocument(documentID);
  }
  void noteSeen(const linuxos::SeenObject& object) override { _truth.noteSeen(object); }
  void noteAttribute(FileID fileID, std::string_view name,
                     std::optional<FndDataView> value) override {
    _truth.noteAttribute(fileID, name, value);
  }

 private:
  linuxos::FileIndex& _truth;
};

/// Two documents "a" and "F/b", looked at and told their IDs.
class IdentityJudgeTest : public ::testing::Test {
 protected:
  void SetUp() override {
    _judged.storage.createFolder(_judged.path("F"));
    _judged.storage.createFile(_judged.path("a"), "a");
    _judged.storage.createFile(_judged.path("F/b"), "b");
    _judged.look();
    _idA = _judged.ask("a");
    _idB = _judged.ask("F/b");
    _judged.look();
    ASSERT_EQ(_judged.complaints(), "");
  }

  FileID fileAt(const std::string& name) const { return _judged.fileAt(name); }
  std::size_t complaintsAfterLookThrough(LyingIndex& liar) {
    _judged.look(&liar);
    return _judged.judge().complaints().size();
  }

  JudgedStorage _judged{TestStorage::defaultParent()};
  DocumentID _idA;
  DocumentID _idB;
};

TEST_F(IdentityJudgeTest, AnHonestIndexIsNotBlamed) {
  LyingIndex honest(_judged.catalog());
  EXPECT_EQ(complaintsAfterLookThrough(honest), 0U);
}

TEST_F(IdentityJudgeTest, DocumentsThatChangedPlacesAreNoticed) {
  LyingIndex liar(_judged.catalog());
  liar.files[_idA] = fileAt("F/b");
  liar.files[_idB] = fileAt("a");
  EXPECT_GT(complaintsAfterLookThrough(liar), 0U);
}

TEST_F(IdentityJudgeTest, TwoDocumentsOfOneFileAreNoticed) {
  LyingIndex liar(_judged.catalog());
  liar.files[_idA] = fileAt("F/b");
  EXPECT_GT(complaintsAfterLookThrough(liar), 0U);
}

TEST_F(IdentityJudgeTest, ADocumentThatOutlivesItsFileIsNoticed) {
  LyingIndex liar(_judged.catalog());
  liar.files[_idA] = fileAt("a");
  _judged.storage.remove(_judged.path("a"));
  EXPECT_GT(complaintsAfterLookThrough(liar), 0U);
}

TEST_F(IdentityJudgeTest, AWrongPathIsNoticed) {
  LyingIndex liar(_judged.catalog());
  liar.paths[fileAt("a")] = _judged.path("F/b");
  EXPECT_GT(complaintsAfterLookThrough(liar), 0U);
}

TEST_F(IdentityJudgeTest, AWrongCountIsNoticed) {
  LyingIndex liar(_judged.catalog());
  liar.counts[fileAt("F")] = 2;
  EXPECT_GT(complaintsAfterLookThrough(liar), 0U);
}

TEST_F(IdentityJudgeTest, ADocumentWithoutItsIDIsNoticed) {
  LyingIndex liar(_judged.catalog());
  liar.documentIDs[fileAt("a")] = DocumentID{};
  EXPECT_GT(complaintsAfterLookThrough(liar), 0U);
}

TEST_F(IdentityJudgeTest, AnIDToldTwiceIsNoticed) {
  _judged.storage.createFile(_judged.path("c"), "c");
  const ObservedTree tree = _judged.storage.observe();
  _judged.judge().told({*tree.at({tree.root(), "c"})}, {_idA});
  EXPECT_EQ(_judged.judge().complaints().size(), 1U);
}

TEST_F(IdentityJudgeTest, AnAttributeThatALookMadeUpIsNoticed) {
  const ObservedTree looked = _judged.storage.observe();
  ASSERT_TRUE(_judged.catalog().look());
  _judged.storage.setAttribute(_judged.path("a"), "com.quillon.lastuseddate#PS", "made up");
  _judged.judge().lookDone(_judged.catalog(), looked, _judged.storage.observe());
  EXPECT_EQ(_judged.judge().complaints().size(), 1U);
}

TEST_F(IdentityJudgeTest, MissingAndExcessRowsAreNoticed) {
  _judged.storage.createFile(_judged.path("c"), "c");
  _judged.storage.moveOver(_judged.path("F/b"), _judged.path("c"));
  const auto differences = differencesFromRows(_judged.storage.state(), _judged.storage.observe());
  // "c" is new, "F/b" is no more, and "F" has another time.
  EXPECT_EQ(differences.size(), 4U);
}

}  // namespace
}  // namespace vantrell::properties
