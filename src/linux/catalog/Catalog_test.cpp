#include "linux/catalog/Catalog.h"

#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

#include <algorithm>
#include <atomic>
#include <set>
#include <thread>

#include "linux/catalog/CatalogTestStorage.h"

namespace vantrell::linuxos {
namespace {

TEST_F(CatalogTest, WhatIsInsideAPackageIsCataloguedAndGetsAnIDOnlyWhenAskedForByName) {
  makeFolder("a.tessera/parts");
  write("a.tessera/parts/1");
  look();
  EXPECT_EQ(catalog().entryCountOfFolder(fileID("a.tessera")), 1U);
  EXPECT_EQ(knownIDOf("a.tessera/parts/1"), DocumentID{});
  const DocumentID part = idOf("a.tessera/parts/1");
  EXPECT_NE(part, DocumentID{});
  EXPECT_EQ(placeOf(part), "a.tessera/parts/1");
  close();
  rename("a.tessera/parts/1", "a.tessera/parts/2");
  look();
  EXPECT_EQ(placeOf(part), "");
  close();
  rename("a.tessera/parts/2", "shown");
  look();
  EXPECT_EQ(placeOf(part), "shown");
}

TEST_F(CatalogTest, AHiddenFileAskedForByNameHasAnIDThatHoldsWhileItStaysAndWhenItIsShown) {
  look();
  write(".hidden");
  const DocumentID hidden = idOf(".hidden");
  EXPECT_NE(hidden, DocumentID{});
  EXPECT_EQ(idOf(".hidden"), hidden);
  EXPECT_EQ(knownIDOf(".hidden"), hidden);
  catalog().noteSeen(seen(".hidden"));
  EXPECT_EQ(placeOf(hidden), ".hidden");
  lookAfterRestart();
  EXPECT_EQ(placeOf(hidden), ".hidden");
  rename(".hidden", ".moved");
  EXPECT_EQ(placeOf(hidden), "");
  rename(".moved", "shown");
  look();
  EXPECT_EQ(placeOf(hidden), "shown");
  EXPECT_EQ(idOf("shown"), hidden);
}

TEST_F(CatalogTest, AnObjectOutOfViewResolvesAsLongAsItStaysWhereItWasSeen) {
  makeFolder(".hidden/folder");
  look();
  const FileID folder = fileID(".hidden/folder");
  EXPECT_FALSE(catalog().pathForFileID(folder));
  catalog().noteSeen(seen(".hidden/folder"));
  EXPECT_EQ(*catalog().pathForFileID(folder), path(".hidden/folder"));
  lookAfterRestart();
  EXPECT_EQ(*catalog().pathForFileID(folder), path(".hidden/folder"));
  rename(".hidden/folder", ".hidden/other");
  EXPECT_TRUE(catalog().pathForFileID(folder).error().isPosix(ENOENT));
}

TEST_F(CatalogTest, QuestionsFindWhatHappenedSinceTheLook) {
  makeFolder("one");
  makeFolder("two");
  write("one/a");
  write("one/b");
  look();
  const DocumentID a = idOf("one/a");
  const DocumentID b = idOf("one/b");
  rename("one/a", "two/c");
  EXPECT_EQ(*catalog().pathForFileID(fileID("two/c")), path("two/c"));
  EXPECT_EQ(placeOf(a), "two/c");
  EXPECT_EQ(idOf("two/c"), a);
  write("one/new");
  rename("one/new", "one/b");
  EXPECT_EQ(placeOf(b), "one/b");
  EXPECT_EQ(idOf("one/b"), b);
  makeFolder("three");
  EXPECT_EQ(*catalog().pathForFileID(fileID("three")), path("three"));
  rename("two", "four");
  EXPECT_EQ(placeOf(a), "four/c");
}

TEST_F(CatalogTest, ASaveBetweenTwoListingsNeverMakesASecondDocument) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  for (int round = 0; round < 20; ++round) {
    write("a.new", std::string(static_cast<std::size_t>(round), 'x'));
    rename("a.new", "a");
    EXPECT_EQ(idOf("a"), a) << round;
    rename("a", "a~");
    write("a", "again");
    EXPECT_EQ(idOf("a"), a) << round;
  }
}

TEST_F(CatalogTest, KnownFilesKeepTheirIDsWithoutALookAfterAChangeInPlace) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  letTimePass();
  EXPECT_EQ(idOf("a"), a);
  write("a", "other");
  EXPECT_EQ(knownIDOf("a"), a);
  EXPECT_EQ(idOf("a"), a);
}

TEST_F(CatalogTest, ManyDocumentsGetTheirIDsInOneStepAndInOrder) {
  std::vector<SeenObject> objects;
  for (int i = 0; i < 300; ++i) {
    write(std::to_string(i));
    objects.push_back(seen(std::to_string(i)));
  }
  look();
  const auto ids = *catalog().documentIDsOfObjects(fileID(""), objects);
  ASSERT_EQ(ids.size(), 300U);
  EXPECT_EQ(std::set<DocumentID>(ids.begin(), ids.end()).size(), 300U);
  close();
  std::ranges::reverse(objects);
  auto again = *catalog().documentIDsOfObjects(fileID(""), objects);
  std::ranges::reverse(again);
  EXPECT_EQ(again, ids);
  EXPECT_EQ(catalog().documentIDsOfObjects(fileID(""), {})->size(), 0U);
}

TEST_F(CatalogTest, LookingUpNeverAllocates) {
  write("a");
  look();
  EXPECT_EQ(knownIDOf("a"), DocumentID{});
  EXPECT_EQ(catalog().statistics()->documents, 0U);
}

TEST_F(CatalogTest, AFileThatIsGonePassesForNoDocument) {
  look();
  write("a");
  const std::vector<SeenObject> objects{seen("a")};
  remove("a");
  EXPECT_EQ(catalog().documentIDsOfObjects(fileID(""), objects)->front(), DocumentID{});
  EXPECT_EQ(catalog().documentIDOfObject(objects.front()), DocumentID{});
}

TEST_F(CatalogTest, UnknownAndImpossibleNumbersAreNotThere) {
  look();
  for (const std::uint64_t number : {0ULL, 1ULL, ~0ULL, 1ULL << 63U}) {
    EXPECT_TRUE(catalog().pathForFileID(FileID{number}).error().isPosix(ENOENT)) << number;
  }
  EXPECT_TRUE(catalog().fileIDOfDocument(DocumentID{0}).error().isPosix(ENOENT));
  EXPECT_TRUE(catalog().fileIDOfDocument(DocumentID{4'000'000'000}).error().isPosix(ENOENT));
}

TEST_F(CatalogTest, ANumberThatComesBackAsAnotherObjectIsADeletionAndACreation) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  const FileID number = fileID("a");
  close();
  remove("a");
  std::string reused;
  for (int i = 0; i < 500 && reused.empty(); ++i) {
    const std::string name = "n" + std::to_string(i);
    write(name);
    if (fileID(name) == number) reused = name;
  }
  if (reused.empty()) GTEST_SKIP() << "this file system does not use a number again";
  look();
  EXPECT_EQ(placeOf(a), "");
  EXPECT_NE(idOf(reused), a);
}

TEST_F(CatalogTest, AFolderWithTheNumberOfADeletedOneHasNoneOfItsDocuments) {
  makeFolder("old");
  write("old/a");
  look();
  const DocumentID a = idOf("old/a");
  const FileID number = fileID("old");
  close();
  remove("old");
  std::string reused;
  for (int i = 0; i < 500 && reused.empty(); ++i) {
    const std::string name = "n" + std::to_string(i);
    makeFolder(name);
    if (fileID(name) == number) reused = name;
  }
  if (reused.empty()) GTEST_SKIP() << "this file system does not use a number again";
  write(reused + "/a", "another file");
  look();
  EXPECT_EQ(placeOf(a), "");
  EXPECT_NE(idOf(reused + "/a"), a);
  EXPECT_EQ(catalog().entryCountOfFolder(number), 1U);
}

TEST_F(CatalogTest, EveryNameOfALinkedFileResolvesAndAllHaveOneDocument) {
  makeFolder("folder");
  write("a");
  link("a", "folder/b");
  look();
  const DocumentID a = idOf("a");
  EXPECT_EQ(idOf("folder/b"), a);
  remove("a");
  EXPECT_EQ(*catalog().pathForFileID(fileID("folder/b")), path("folder/b"));
  look();
  EXPECT_EQ(placeOf(a), "folder/b");
}

TEST_F(CatalogTest, NamesThatAreNoTextAndTheLongestNamesAreOrdinary) {
  const std::string odd = "a\xff\xfe\n\x01";
  const std::string longest(255, 'n');
  write(odd);
  makeFolder(longest);
  write(longest + "/" + longest);
  look();
  const DocumentID one = idOf(odd);
  const DocumentID other = idOf(longest + "/" + longest);
  lookAfterRestart();
  EXPECT_EQ(placeOf(one), odd);
  EXPECT_EQ(placeOf(other), longest + "/" + longest);
}

TEST_F(CatalogTest, AThousandLevelsOfLongNamesAreFoundAgain) {
  const std::string name(200, 'd');
  std::vector<int> levels{::open(path("").c_str(), O_RDONLY | O_DIRECTORY)};
  for (int level = 0; level < 1000; ++level) {
    ASSERT_EQ(::mkdirat(levels.back(), name.c_str(), 0700), 0);
    const int next = ::openat(levels.back(), name.c_str(), O_RDONLY | O_DIRECTORY);
    ::close(levels.back());
    levels = {next};
  }
  const int file = ::openat(levels.back(), "leaf", O_CREAT | O_WRONLY, 0600);
  struct stat status {};
  ASSERT_EQ(::fstat(file, &status), 0);
  ::close(file);
  ::close(levels.back());
  EXPECT_EQ(look().entriesSeen, 1001U);
  const auto leaf = catalog().pathForFileID(FileID{status.st_ino});
  ASSERT_TRUE(leaf) << leaf.error().description();
  EXPECT_EQ(leaf->size(), path("").size() + 1000 * 201 + 5);
  EXPECT_EQ(lookAfterRestart().entriesSeen, 1001U);
}

TEST_F(CatalogTest, StatisticsTellWhatIsThere) {
  makeFolder("folder");
  write("folder/a");
  look();
  const DocumentID a = idOf("folder/a");
  const auto statistics = catalog().statistics();
  ASSERT_TRUE(statistics);
  EXPECT_EQ(statistics->entries, 2U);
  EXPECT_EQ(statistics->folders, 2U);
  EXPECT_EQ(statistics->documents, 1U);
  EXPECT_EQ(statistics->highestDocumentID, a);
  EXPECT_EQ(statistics->schemaVersion, 1U);
  EXPECT_GT(statistics->databaseBytes, 0U);
  EXPECT_GT(statistics->lastLook.time_since_epoch().count(), 0);
  EXPECT_GT(statistics->lastLookDuration.count(), 0);
}

TEST_F(CatalogTest, ThreadsMayAskAndLookAtTheSameTime) {
  for (int i = 0; i < 20; ++i) write("f" + std::to_string(i));
  look();
  const DocumentID first = idOf("f0");
  std::vector<std::jthread> threads;
  std::atomic<int> wrong = 0;
  for (int thread = 0; thread < 4; ++thread) {
    threads.emplace_back([&, thread] {
      for (int round = 0; round < 20; ++round) {
        const std::string name = "f" + std::to_string((thread * 7 + round) % 20);
        if (idOf(name) != idOf(name) || placeOf(first) != "f0") ++wrong;
        if (round % 10 == 0 && !catalog().look()) ++wrong;
      }
    });
  }
  threads.clear();
  EXPECT_EQ(wrong, 0);
}

}  // namespace
}  // namespace vantrell::linuxos
