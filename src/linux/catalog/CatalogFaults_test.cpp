#include <signal.h>
#include <sqlite3.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <map>
#include <set>

#include "linux/catalog/CatalogTestStorage.h"
#include "linux/catalog/FaultyDisk.h"

namespace vantrell::linuxos {
namespace {

class CatalogFaults : public CatalogTest {
 protected:
  /// Opens, looks, asks for IDs, changes files and looks again, as far as it gets; every ID that
  /// it is told goes into `told`.
  void work(std::map<std::string, DocumentID>& told, int round) {
    const auto opened = Catalog::open(options());
    if (!opened || !(*opened)->look()) return;
    ask(**opened, {"a", "b", "c"}, told);
    const std::string saved = "saved in round " + std::to_string(round);
    write("a.new", saved);
    rename("a.new", "a");
    static_cast<void>((*opened)->look());
    const std::string added = "new" + std::to_string(round);
    write(added);
    ask(**opened, {"a", added}, told);
  }

  void ask(Catalog& asked, const std::vector<std::string>& names,
           std::map<std::string, DocumentID>& told) {
    std::vector<SeenObject> objects;
    for (const std::string& name : names) objects.push_back(seen(name));
    const auto ids = asked.documentIDsOfObjects(fileID(""), objects);
    if (!ids) return;
    for (std::size_t i = 0; i < names.size(); ++i) {
      const auto [known, isNew] = told.try_emplace(names[i], (*ids)[i]);
      EXPECT_EQ(known->second, (*ids)[i]) << names[i];
    }
  }

  /// Every ID that was told stands for the file that it was told for.
  void expectAllHold(const std::map<std::string, DocumentID>& told, const std::string& when) {
    lookAfterRestart();
    std::set<DocumentID> ids;
    for (const auto& [name, id] : told) {
      EXPECT_EQ(placeOf(id), name) << when;
      EXPECT_EQ(idOf(name), id) << when;
      EXPECT_TRUE(ids.insert(id).second) << when;
    }
    for (const std::string& line : errorLines()) {
      EXPECT_EQ(line.find("is damaged"), std::string::npos) << when << ": " << line;
    }
    close();
  }

  void sweep(FaultyDisk::Fault fault, int code) {
    for (const char* name : {"a", "b", "c"}) write(name);
    std::map<std::string, DocumentID> told;
    bool isOver = false;
    for (int nth = 1; !isOver; ++nth) {
      {
        FaultyDisk disk(nth, fault, code);
        work(told, nth);
        isOver = disk.faultsInjected() == 0;
      }
      expectAllHold(told, "call " + std::to_string(nth));
      ASSERT_LT(nth, 2000);
    }
    EXPECT_GE(told.size(), 4U);
  }
};

TEST_F(CatalogFaults, EachWriteThatFailsOnceLeavesEveryIDAsItWasTold) {
  sweep(FaultyDisk::Fault::Once, SQLITE_IOERR_WRITE);
}

TEST_F(CatalogFaults, ADiskThatIsFullFromAnyWriteOnLeavesEveryIDAsItWasTold) {
  sweep(FaultyDisk::Fault::FromThenOn, SQLITE_FULL);
}

TEST_F(CatalogFaults, AFullDiskIsTheErrorThatTheCallerSees) {
  write("a");
  look();
  close();
  const FaultyDisk disk(1, FaultyDisk::Fault::FromThenOn, SQLITE_FULL);
  const auto opened = Catalog::open(options());
  ASSERT_FALSE(opened);
  EXPECT_TRUE(opened.error().is(kVantrellErrorDomain,
                                static_cast<int>(VantrellErrorCode::StateUnavailable)));
  EXPECT_GT(disk.faultsInjected(), 0);
}

TEST_F(CatalogFaults, AFullDiskWhileLookingIsAnErrorAndTheCatalogStaysWhatItWas) {
  write("a");
  look();
  const DocumentID a = idOf("a");
  write("b");
  close();
  FaultyDisk(1, FaultyDisk::Fault::Once, SQLITE_FULL);  // the layer is there from now on
  catalog();
  {
    const FaultyDisk disk(1, FaultyDisk::Fault::FromThenOn, SQLITE_FULL);
    const auto report = catalog().look();
    ASSERT_FALSE(report);
    EXPECT_TRUE(report.error().isPosix(ENOSPC)) << report.error().description();
  }
  EXPECT_EQ(look().created, 1U);
  EXPECT_EQ(placeOf(a), "a");
}

/// Killed at any moment: what it was told went through a pipe, so that it counts as told.
TEST_F(CatalogFaults, KilledAtAnyMomentEveryIDThatWasToldHolds) {
  for (int i = 0; i < 40; ++i) write("f" + std::to_string(i));
  std::map<std::string, DocumentID> told;
  for (int cycle = 0; cycle < 12; ++cycle) {
    std::array<int, 2> pipe{};
    ASSERT_EQ(::pipe(pipe.data()), 0);
    const pid_t child = ::fork();
    if (child == 0) {
      const auto opened = Catalog::open(options());
      if (!opened || !(*opened)->look()) ::_exit(1);
      for (int i = cycle; i < 40; ++i) {
        const std::vector<SeenObject> objects{seen("f" + std::to_string(i))};
        const auto ids = (*opened)->documentIDsOfObjects(fileID(""), objects);
        const std::array<std::uint32_t, 2> message{static_cast<std::uint32_t>(i),
                                                   ids ? ids->front().value : 0};
        if (::write(pipe[1], message.data(), sizeof message) != sizeof message) ::_exit(1);
      }
      ::pause();
    }
    ::close(pipe[1]);
    const int wanted = (cycle * 5) % 8;
    for (int message = 0; message < wanted; ++message) {
      std::array<std::uint32_t, 2> heard{};
      if (::read(pipe[0], heard.data(), sizeof heard) != sizeof heard) break;
      const DocumentID id{heard[1]};
      ASSERT_NE(id, DocumentID{});
      const auto [known, isNew] = told.try_emplace("f" + std::to_string(heard[0]), id);
      EXPECT_EQ(known->second, id) << known->first;
    }
    ::kill(child, SIGKILL);
    ::waitpid(child, nullptr, 0);
    ::close(pipe[0]);
    expectAllHold(told, "cycle " + std::to_string(cycle));
  }
  EXPECT_GT(told.size(), 5U);
}

}  // namespace
}  // namespace vantrell::linuxos
