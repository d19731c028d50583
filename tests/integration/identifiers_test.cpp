// Identifiers that are not ones, or not any more.

#include <gmock/gmock.h>

#include <filesystem>
#include <fstream>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

namespace fs = std::filesystem;
using testing::HasSubstr;

class Identifiers : public VantrellTest {
 protected:
  // Every command that takes an item refuses the identifier, as an item that is not there.
  void expectNoSuchItem(const std::string& identifier) {
    const std::vector<Words> commands = {{"item", identifier},      {"path", identifier},
                                         {"ls", identifier},        {"tag", identifier, "x"},
                                         {"rank", identifier, "1"}, {"used", identifier, "now"}};
    for (const Words& words : commands) {
      const Json refused = error(words);
      EXPECT_EQ(refused["domain"], "DochostErrorDomain") << testing::PrintToString(words);
      EXPECT_EQ(refused["code"], -1001) << testing::PrintToString(words);
    }
  }
};

TEST_F(Identifiers, WrongFormsAreNoItems) {
  write("a.txt", "x");
  for (const char* identifier :
       {"fid=12=3", "did==", "fid=", "did=abc", "fid=abc", "#", "#nobody", "did=5 =6"}) {
    expectNoSuchItem(identifier);
  }
}

TEST_F(Identifiers, NumbersThatNothingHasAreNoItems) {
  write("a.txt", "x");
  for (const char* identifier :
       {"fid=0", "did=0", "fid=1", "did=1", "fid=-1", "did=-1", "did=4294967295", "did=4294967296",
        "fid=18446744073709551615", "fid=99999999999999999999999", "did=99999999999999999999999"}) {
    expectNoSuchItem(identifier);
  }
}

TEST_F(Identifiers, AnUnknownItemIsToldForPeopleToo) {
  const Outcome outcome = vantrell({"item", "did=1"});
  EXPECT_EQ(outcome.status, 1);
  EXPECT_EQ(outcome.out, "");
  EXPECT_THAT(outcome.err, testing::StartsWith("vantrell: did=1: "));
  EXPECT_THAT(outcome.err, HasSubstr("DochostErrorDomain -1001"));
}

TEST_F(Identifiers, WhatHasNoPrefixOfOneIsAPathAndNotThere) {
  for (const char* argument : {"did", "xid=5", "FID=5", "DID=5", " fid=5", "nothing"}) {
    const Json refused = error({"item", argument});
    EXPECT_EQ(refused["domain"], "FndFoundationErrorDomain") << argument;
    EXPECT_EQ(refused["code"], 260) << argument;
  }
}

TEST_F(Identifiers, AnEmptyPathIsRefused) {
  EXPECT_EQ(error({"item", ""})["code"], 8);
  EXPECT_EQ(error({"id", ""})["code"], 8);
}

TEST_F(Identifiers, TheNumberOfADocumentIsNoFileID) {
  const std::string file = write("a.txt", "x");
  const Json record = object({"item", file});
  const std::string byFileID = "fid=" + std::to_string(record["fileID"].get<std::uint64_t>());
  EXPECT_EQ(pathOf(byFileID), file) << "a file can be asked for by its file ID, too";
  EXPECT_EQ(object({"item", byFileID})["itemIdentifier"], record["itemIdentifier"]);
}

TEST_F(Identifiers, AnIdentifierOfWhatIsGoneIsNoItem) {
  const std::string document = identifierOf(write("a.txt", "x"));
  const std::string folder = identifierOf(makeFolder("Letters"));
  fs::remove(path("a.txt"));
  fs::remove(path("Letters"));
  expectNoSuchItem(document);
  expectNoSuchItem(folder);
}

TEST_F(Identifiers, AnIdentifierNeverLeadsOutOfTheStorage) {
  std::ofstream(home() / "outside.txt") << "secret";
  write("a.txt", "x");
  struct stat outside;
  ASSERT_EQ(::stat((home() / "outside.txt").c_str(), &outside), 0);
  expectNoSuchItem("fid=" + std::to_string(outside.st_ino));
  ASSERT_EQ(::stat(home().c_str(), &outside), 0);
  expectNoSuchItem("fid=" + std::to_string(outside.st_ino));
}

TEST_F(Identifiers, AFileThatMovedOutOfTheStorageIsNoItemUntilItComesBack) {
  const std::string file = write("a.txt", "x");
  const std::string identifier = identifierOf(file);
  fs::rename(file, home() / "a.txt");
  expectNoSuchItem(identifier);
  fs::rename(home() / "a.txt", path("b.txt"));
  EXPECT_EQ(pathOf(identifier), path("b.txt"));
}

TEST_F(Identifiers, APathOutsideTheStorageIsRefused) {
  std::ofstream(home() / "outside.txt") << "x";
  const Json refused = error({"id", home() / "outside.txt"});
  EXPECT_EQ(refused["domain"], "com.quillon.vantrell");
  EXPECT_EQ(refused["code"], 8);
  EXPECT_THAT(refused["message"], HasSubstr(storage().native()));
}

TEST_F(Identifiers, ALinkThatLeadsOutIsAnItemAndWhatItLeadsToIsNot) {
  std::ofstream(home() / "outside.txt") << "x";
  fs::create_symlink(home() / "outside.txt", path("link"));
  fs::create_directory_symlink(home(), path("door"));
  EXPECT_EQ(object({"item", "link"})["typeIdentifier"], "inode/symlink");
  EXPECT_EQ(error({"id", "door/outside.txt"})["code"], 8);
}

TEST_F(Identifiers, ALinkInsideTheStorageIsAWayToWhatItLeadsTo) {
  const std::string file = write("Letters/a.txt", "x");
  fs::create_directory_symlink("Letters", path("door"));
  EXPECT_EQ(identifierOf("door/a.txt"), identifierOf(file));
}

TEST_F(Identifiers, TheInboxFolderIsNotShown) {
  makeFolder("Inbox");
  write("Letters/Inbox/a.txt", "x");
  EXPECT_EQ(error({"id", "Inbox"})["code"], -1001);
  EXPECT_EQ(object({"item", "Letters/Inbox"})["filename"], "Inbox");
}

TEST_F(Identifiers, AHiddenFileHasOneWhenItIsAskedForByName) {
  const std::string file = write(".hidden", "x");
  EXPECT_EQ(pathOf(identifierOf(file)), file);
  EXPECT_EQ(vantrell({"ls"}).out, "");
}

TEST_F(Identifiers, TheTemporaryFolderIsMadeWhenItIsAskedFor) {
  const Json record = object({"item", "DochostTemporaryLocalFolderItemIdentifier"});
  EXPECT_EQ(record["filename"], ".TemporaryLocalFolder");
  EXPECT_TRUE(fs::is_directory(path(".TemporaryLocalFolder")));
}

}  // namespace
}  // namespace vantrell::integration
