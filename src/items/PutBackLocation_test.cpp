#include "items/PutBackLocation.h"

#include <gtest/gtest.h>

#include "items/ItemMetadata.h"
#include "items/LocalItem.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class PutBackTest : public testing::Test {
 protected:
  void store(const std::string& path, std::string location) {
    system.tree.setAttribute(path, kPutBackAttribute,
                             *archivedDataWithRootObject(ArchiveValue(std::move(location))));
  }
  // Where the item goes back to when `location` is stored on it, or "none".
  std::string putBack(std::string location) {
    store(trashed.path(), std::move(location));
    const auto url = putBackURLOfItemAt(trashed);
    return url ? url->path() : "none";
  }
  void expectNone(const std::string& location) {
    system.log.clear();
    EXPECT_EQ(putBack(location), "none") << location;
    EXPECT_EQ(system.log.textsAt(LogLevel::Error),
              std::vector<std::string>{"[ERROR] couldn't compute putback url"});
  }

  TestSystem system;
  const FndURL trashed = system.file(".Trash/a.txt");
};

TEST_F(PutBackTest, AStoredLocationCountsFromTheLibrarysRoot) {
  system.folder("x/y");
  EXPECT_EQ(putBack("x/y/a.txt"), system.inStorage("x/y/a.txt"));
  EXPECT_TRUE(system.log.has(LogLevel::Debug,
                             "[DEBUG] putback: '/storage/Documents/x/y/a.txt' library: "
                             "'/storage/Documents'"));
}

TEST_F(PutBackTest, AFolderThatIsGoneIsNoObstacle) {
  EXPECT_EQ(putBack("gone/deeper/a.txt"), system.inStorage("gone/deeper/a.txt"));
}

TEST_F(PutBackTest, AnAppLibraryComesBeforeTheStorage) {
  const FndURL library = system.addApp("org.example.a");
  system.tree.writeFile("/apps/org.example.a/Documents/.Trash/b.txt");
  const FndURL url = library.URLByAppendingPathComponent(".Trash/b.txt");
  store(url.path(), "x/b.txt");
  EXPECT_EQ(putBackURLOfItemAt(url), library.URLByAppendingPathComponent("x/b.txt"));
  EXPECT_EQ(libraryRootOfItemAt(url), library);
}

TEST_F(PutBackTest, NothingStoredIsADebugLine) {
  EXPECT_EQ(putBackURLOfItemAt(trashed), std::nullopt);
  EXPECT_EQ(system.log.texts(),
            std::vector<std::string>{
                "[DEBUG] couldn't find putback xattr for /storage/Documents/.Trash/a.txt"});
}

TEST_F(PutBackTest, ALocationInAnotherFormThanWeWriteIsNone) {
  for (const std::string location : {"", "/", "/a.txt", "x//a.txt", "x/", "./a.txt", "x/./a.txt",
                                     "..", "../a.txt", "x/../../../etc/passwd", "x/..", "."}) {
    expectNone(location);
  }
  expectNone(std::string("x\0/a.txt", 8));
}

TEST_F(PutBackTest, ALinkThatLeadsOutOfTheLibraryIsNone) {
  system.tree.makeFolder("/elsewhere");
  system.tree.makeLink(system.inStorage("out"), "/elsewhere");
  expectNone("out/a.txt");
  expectNone("out");
}

TEST_F(PutBackTest, ALinkThatStaysInTheLibraryIsFollowed) {
  system.folder("real");
  system.tree.makeLink(system.inStorage("in"), "real");
  EXPECT_EQ(putBack("in/a.txt"), system.inStorage("real/a.txt"));
}

TEST_F(PutBackTest, ALinkToNowhereIsNone) {
  system.tree.makeLink(system.inStorage("dangling"), "/nowhere/at/all");
  expectNone("dangling/a.txt");
}

TEST_F(PutBackTest, WhatLiesInNoLibraryHasNone) {
  system.tree.writeFile("/elsewhere/a.txt");
  store("/elsewhere/a.txt", "x/a.txt");
  EXPECT_EQ(putBackURLOfItemAt(FndURL::fileURLWithPath("/elsewhere/a.txt")), std::nullopt);
  EXPECT_EQ(libraryRootOfItemAt(FndURL::fileURLWithPath("/elsewhere/a.txt")), std::nullopt);
}

TEST_F(PutBackTest, ARecordFindsItOutOnFirstUseAndKeepsIt) {
  store(trashed.path(), "b.txt");
  const auto item = LocalItem::init(trashed);
  const std::size_t reads = system.tree.faults.calls(FakeCall::SizeOfAttribute);
  EXPECT_EQ(item->putBackURL(), system.urlInStorage("b.txt"));
  EXPECT_EQ(system.tree.faults.calls(FakeCall::SizeOfAttribute), reads + 1);
  store(trashed.path(), "c.txt");
  EXPECT_EQ(item->putBackURL(), system.urlInStorage("b.txt"));
  EXPECT_EQ(system.tree.faults.calls(FakeCall::SizeOfAttribute), reads + 1);
}

}  // namespace
}  // namespace vantrell
