// A document keeps its identifier, its tags, its rank and its date through what real programs do
// to its file, with the program started anew before and after.

#include <gmock/gmock.h>

#include <filesystem>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

namespace fs = std::filesystem;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::Not;

class Identity : public VantrellTest {
 protected:
  // A document with an identifier and everything that can be set on one.
  std::string document(const std::string& relativePath) {
    const std::string file = write(relativePath, "hello\n");
    dress(file);
    return identifierOf(file);
  }

  void dress(const std::string& item) {
    object({"tag", item, "Work", "Wichtig"});
    object({"rank", item, "42"});
    object({"used", item, "2026-11-21T18:53:15.25Z"});
  }

  void expectSameDocument(const std::string& identifier, const std::string& relativePath) {
    EXPECT_EQ(identifierOf(path(relativePath)), identifier);
    EXPECT_EQ(pathOf(identifier), path(relativePath));
    const Json record = object({"item", identifier});
    EXPECT_EQ(record.value("tags", Json()), Json::array({"Work", "Wichtig"}));
    EXPECT_EQ(record.value("favoriteRank", Json()), 42);
    EXPECT_EQ(record.value("lastUsedDate", Json()), "2026-11-21T18:53:15.25Z");
  }

  void vim(const std::string& settings, const std::string& file) {
    // An empty backupskip: below /tmp the editor would write in place, which proves nothing.
    tool({"vim", "-u", "NONE", "-i", "NONE", "-n", "-es", "-c",
          "set nocompatible backupskip= " + settings, "-c", "%s/hello/edited/", "-c", "wq", file});
    EXPECT_EQ(contentOf(path(file)), "edited\n");
  }

  std::uint64_t fileID(const std::string& relativePath) {
    return object({"item", path(relativePath)})["fileID"];
  }
};

TEST_F(Identity, HoldsWhenNothingHappens) {
  const std::string identifier = document("a.txt");
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughRenameAndMove) {
  const std::string identifier = document("a.txt");
  tool({"mv", "a.txt", "b.md"});
  expectSameDocument(identifier, "b.md");
  makeFolder("Deep/deeper");
  tool({"mv", "b.md", "Deep/deeper/c.txt"});
  expectSameDocument(identifier, "Deep/deeper/c.txt");
}

TEST_F(Identity, HoldsWhenAFolderAboveMoves) {
  const std::string identifier = document("Letters/2026/a.txt");
  dress(path("Letters"));
  const std::string folder = identifierOf(path("Letters"));
  makeFolder("Archive");
  tool({"mv", "Letters", "Archive/Briefe"});
  expectSameDocument(identifier, "Archive/Briefe/2026/a.txt");
  expectSameDocument(folder, "Archive/Briefe");
}

TEST_F(Identity, HoldsThroughASaveWithVim) {
  const std::string identifier = document("a.txt");
  vim("", "a.txt");
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughASaveWithVimThatReplacesTheFile) {
  const std::string identifier = document("a.txt");
  const std::uint64_t before = fileID("a.txt");
  vim("backupcopy=no", "a.txt");
  expectSameDocument(identifier, "a.txt");
  EXPECT_NE(fileID("a.txt"), before) << "the editor did not replace the file";
}

TEST_F(Identity, HoldsThroughASaveWithVimThatKeepsABackup) {
  const std::string identifier = document("a.txt");
  vim("backup backupcopy=no", "a.txt");
  expectSameDocument(identifier, "a.txt");
  EXPECT_TRUE(fs::exists(path("a.txt~")));
  EXPECT_NE(identifierOf(path("a.txt~")), identifier);
}

TEST_F(Identity, HoldsThroughASaveWithVimThatWritesInPlace) {
  const std::string identifier = document("a.txt");
  const std::uint64_t before = fileID("a.txt");
  vim("backupcopy=yes", "a.txt");
  expectSameDocument(identifier, "a.txt");
  EXPECT_EQ(fileID("a.txt"), before);
}

TEST_F(Identity, HoldsThroughSed) {
  const std::string identifier = document("a.txt");
  tool({"sed", "-i", "s/hello/edited/", "a.txt"});
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughSedThatKeepsABackup) {
  const std::string identifier = document("a.txt");
  tool({"sed", "-i.bak", "s/hello/edited/", "a.txt"});
  expectSameDocument(identifier, "a.txt");
  EXPECT_NE(identifierOf(path("a.txt.bak")), identifier);
}

TEST_F(Identity, HoldsThroughPerl) {
  const std::string identifier = document("a.txt");
  tool({"perl", "-pi", "-e", "s/hello/edited/", "a.txt"});
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughManySavesInARow) {
  const std::string identifier = document("a.txt");
  for (int i = 0; i < 5; ++i) tool({"sed", "-i", "s/$/./", "a.txt"});
  EXPECT_EQ(contentOf(path("a.txt")), "hello.....\n");
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughASaveAndARenameOfTheFolder) {
  const std::string identifier = document("Letters/a.txt");
  tool({"sed", "-i", "s/hello/edited/", "Letters/a.txt"});
  tool({"mv", "Letters", "Briefe"});
  expectSameDocument(identifier, "Briefe/a.txt");
}

TEST_F(Identity, HoldsThroughACopyWrittenOverIt) {
  const std::string identifier = document("a.txt");
  write("b.txt", "new\n");
  tool({"cp", "-a", "b.txt", "a.txt"});
  EXPECT_EQ(contentOf(path("a.txt")), "new\n");
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughRsync) {
  const std::string identifier = document("Letters/a.txt");
  fs::create_directory(home() / "source");
  tool({"sh", "-c", "echo longer than before > ../source/a.txt"});
  tool({"rsync", "-a", "../source/", "Letters/"});
  EXPECT_EQ(contentOf(path("Letters/a.txt")), "longer than before\n");
  expectSameDocument(identifier, "Letters/a.txt");
}

TEST_F(Identity, HoldsThroughTheExtractionOfAnArchive) {
  const std::string identifier = document("a.txt");
  tool({"tar", "-cf", "../archive.tar", "a.txt"});
  tool({"sed", "-i", "s/hello/edited/", "a.txt"});
  tool({"tar", "-xf", "../archive.tar"});
  EXPECT_EQ(contentOf(path("a.txt")), "hello\n");
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsThroughACheckout) {
  const std::string identifier = document("a.txt");
  tool({"git", "init", "-q", "."});
  tool({"git", "add", "a.txt"});
  tool({"git", "-c", "user.name=N", "-c", "user.email=n@example.org", "commit", "-q", "-m", "one"});
  tool({"sed", "-i", "s/hello/edited/", "a.txt"});
  tool({"git", "checkout", "-q", "a.txt"});
  EXPECT_EQ(contentOf(path("a.txt")), "hello\n");
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsWhenTheProgramLooksInTheMiddleOfASave) {
  const std::string identifier = document("a.txt");
  write("a.txt.tmp", "edited\n");
  EXPECT_EQ(vantrell({"ls"}).status, 0);
  tool({"mv", "a.txt.tmp", "a.txt"});
  expectSameDocument(identifier, "a.txt");
}

TEST_F(Identity, HoldsForAPackageThatIsReplacedWhole) {
  write("book.tessera/content", "hello\n");
  dress(path("book.tessera"));
  const std::string identifier = identifierOf(path("book.tessera"));
  tool({"cp", "-r", "book.tessera", ".new"});
  tool({"mv", "book.tessera", "book.tessera~"});
  tool({"mv", ".new", "book.tessera"});
  tool({"rm", "-r", "book.tessera~"});
  expectSameDocument(identifier, "book.tessera");
}

TEST_F(Identity, ACopyGetsItsOwn) {
  const std::string identifier = document("a.txt");
  tool({"cp", "a.txt", "plain.txt"});
  tool({"cp", "-a", "a.txt", "whole.txt"});
  const std::string plain = identifierOf(path("plain.txt"));
  const std::string whole = identifierOf(path("whole.txt"));
  EXPECT_NE(plain, identifier);
  EXPECT_NE(whole, identifier);
  EXPECT_NE(plain, whole);
  expectSameDocument(identifier, "a.txt");
  EXPECT_FALSE(object({"item", plain}).contains("tags"));
  EXPECT_THAT(object({"item", whole})["tags"], ElementsAre("Work", "Wichtig"));
}

TEST_F(Identity, AnotherDocumentMovedOverItTakesItsPlaceAndKeepsItsOwn) {
  const std::string gone = document("a.txt");
  const std::string other = document("b.txt");
  tool({"mv", "b.txt", "a.txt"});
  expectSameDocument(other, "a.txt");
  EXPECT_EQ(error({"item", gone})["code"], -1001);
}

TEST_F(Identity, ANewFileInPlaceOfADeletedOneIsAnotherDocumentUnderAnotherName) {
  const std::string identifier = document("a.txt");
  tool({"rm", "a.txt"});
  EXPECT_EQ(error({"item", identifier})["code"], -1001);
  for (int i = 0; i < 20; ++i) {
    const std::string other = identifierOf(write("b" + std::to_string(i) + ".txt", "x"));
    EXPECT_NE(other, identifier);
  }
  EXPECT_EQ(error({"item", identifier})["code"], -1001);
}

TEST_F(Identity, HoldsWhileADocumentIsHidden) {
  const std::string identifier = document("a.txt");
  tool({"mv", "a.txt", ".a.txt"});
  EXPECT_EQ(vantrell({"ls"}).out, "");
  tool({"mv", ".a.txt", "b.txt"});
  expectSameDocument(identifier, "b.txt");
}

TEST_F(Identity, HoldsForTwoNamesOfOneFile) {
  const std::string identifier = document("a.txt");
  tool({"ln", "a.txt", "b.txt"});
  EXPECT_EQ(identifierOf(path("b.txt")), identifier);
  tool({"rm", "a.txt"});
  expectSameDocument(identifier, "b.txt");
}

TEST_F(Identity, ATagSetAfterASaveIsTheOneThatHolds) {
  const std::string identifier = document("a.txt");
  tool({"sed", "-i", "s/hello/edited/", "a.txt"});
  object({"tag", identifier, "Later"});
  object({"rank", identifier, "--clear"});
  tool({"sed", "-i", "s/edited/again/", "a.txt"});
  const Json record = object({"item", identifier});
  EXPECT_EQ(record["tags"], Json::array({"Later"}));
  EXPECT_FALSE(record.contains("favoriteRank"));
}

}  // namespace
}  // namespace vantrell::integration
