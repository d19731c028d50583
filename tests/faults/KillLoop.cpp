#include "KillLoop.h"

#include <gtest/gtest.h>

#include <chrono>
#include <iostream>
#include <random>

#include "CatalogRows.h"
#include "KilledWriter.h"
#include "PackageTypes.h"
#include "Seed.h"
#include "TestStorage.h"
#include "ToldIDs.h"
#include "linux/catalog/Catalog.h"

namespace vantrell::faults {
namespace {

using properties::TestStorage;
using std::chrono::duration_cast;
using std::chrono::microseconds;
using std::chrono::steady_clock;

constexpr int kFilesAtFirst = 60;

void fill(TestStorage& storage) {
  for (const char* folder : {"/one", "/two", "/three"}) {
    storage.createFolder(storage.root() + folder);
    for (int number = 0; number < kFilesAtFirst / 3; ++number) {
      storage.createFile(storage.root() + folder + "/" + std::to_string(number), "content");
    }
  }
}

void judge(const TestStorage& storage, ToldIDs& promises) {
  const properties::PackageTypes types;
  std::string errors;
  auto opened = linuxos::Catalog::open(
      {storage.state(), {storage.root()}, types, [&](LogLevel level, const std::string& line) {
         if (level == LogLevel::Error) errors += line + "\n";
       }});
  ASSERT_TRUE(opened) << opened.error().description();
  const auto looked = (*opened)->look();
  ASSERT_TRUE(looked) << looked.error().description();
  promises.expectAllKept(**opened);
  EXPECT_EQ(promises.complaints(), "");
  EXPECT_EQ(errors, "");
  EXPECT_TRUE(properties::damageOfDatabase(storage.state()).empty());
}

/// Some die while the database is opened or while they look, others among the questions.
WriterEnd killOne(const TestStorage& storage, std::mt19937_64& random, microseconds oneSession,
                  int cycle) {
  const WriterWork work{storage.root(), storage.state(), random()};
  WriterEnd end;
  if (cycle % 2 == 0) {
    end = runWriterForReports(work, 1 + random() % (3 * kFilesAtFirst));
  } else {
    const auto longest = static_cast<std::uint64_t>(2 * oneSession.count());
    end = runWriterUntilKilled(work, microseconds(random() % longest));
  }
  EXPECT_TRUE(end.wasKilled) << end.exitStatus << " " << end.reports;
  return end;
}

}  // namespace

void killOftenAndJudge(int cycles) {
  const std::uint64_t seed = seedOrRandom();
  std::cout << "VANTRELL_SEED=" << seed << "\n";
  std::mt19937_64 random(seed);
  TestStorage storage(TestStorage::defaultParent());
  fill(storage);
  ToldIDs promises;
  const auto begin = steady_clock::now();
  judge(storage, promises);
  const auto oneSession = duration_cast<microseconds>(steady_clock::now() - begin);
  for (int cycle = 0; cycle < cycles && !::testing::Test::HasFailure(); ++cycle) {
    promises.read(killOne(storage, random, oneSession, cycle).reports);
    // Now and then the next writer finds what two or more have left behind.
    if (random() % 3 != 0) judge(storage, promises);
  }
  judge(storage, promises);
  std::cout << cycles << " writers killed, " << promises.count() << " IDs told, " << promises.kept()
            << " times found kept\n";
  EXPECT_GT(promises.count(), 0U);
}

}  // namespace vantrell::faults
