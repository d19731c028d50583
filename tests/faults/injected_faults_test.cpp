// Each system call by which the catalog writes fails once, or is the last one of the process; what
// had been told by then is true afterwards. `strace` does the injecting.
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <iostream>
#include <iterator>

#include "CatalogRows.h"
#include "KilledWriter.h"
#include "PackageTypes.h"
#include "TestStorage.h"
#include "ToldIDs.h"
#include "linux/catalog/Catalog.h"

namespace vantrell::faults {
namespace {

using properties::TestStorage;

constexpr int kRounds = 2;

/// One run of the writer with one fault, and what it left behind.
class FaultyRun {
 public:
  explicit FaultyRun(const std::string& seed) : _seed(seed) {
    _storage.createFolder(_storage.root() + "/folder");
    for (const char* name : {"/a", "/b", "/folder/c", "/folder/d"}) {
      _storage.createFile(_storage.root() + name, "content");
    }
  }

  /// True when the fault was injected. `how` is strace's word for what is to happen.
  bool run(const std::string& call, const std::string& how, int nth) {
    const std::string trace = _storage.outside() + "/trace";
    _end = runProgram({"strace", "-f", "-qq", "-o", trace, "-e", "trace=" + call, "-e",
                       "inject=" + call + ":" + how + ":when=" + std::to_string(nth),
                       VANTRELL_CATALOG_WRITER, _storage.root(), _storage.state(), _seed,
                       std::to_string(kRounds)});
    std::ifstream file(trace);
    const std::string text((std::istreambuf_iterator<char>(file)), {});
    return text.find("INJECTED") != std::string::npos ||
           text.find("killed by SIGKILL") != std::string::npos;
  }

  /// Holds the catalog, now without faults, to what the run had told.
  void judge(const std::string& what, bool wasInjected) {
    ToldIDs promises;
    promises.read(_end.reports);
    const bool endedWell = _end.wasKilled || _end.exitStatus == 0 || _end.exitStatus == 3;
    EXPECT_TRUE(endedWell) << what << ": exit status " << _end.exitStatus << _end.reports;
    EXPECT_TRUE(wasInjected || _end.exitStatus == 0) << what << ": " << _end.reports;
    EXPECT_EQ(_end.exitStatus == 3, !promises.errors().empty()) << what;
    std::string errors;
    auto opened = linuxos::Catalog::open(
        {_storage.state(), {_storage.root()}, _types, [&](LogLevel level, const std::string& line) {
           if (level == LogLevel::Error) errors += line;
         }});
    ASSERT_TRUE(opened) << what << ": " << opened.error().description();
    ASSERT_TRUE((*opened)->look()) << what;
    promises.expectAllKept(**opened);
    EXPECT_EQ(promises.complaints(), "") << what;
    EXPECT_EQ(errors, "") << what;
    EXPECT_TRUE(properties::damageOfDatabase(_storage.state()).empty()) << what;
    told += promises.count();
  }

  std::size_t told = 0;

 private:
  std::string _seed;
  TestStorage _storage{TestStorage::defaultParent()};
  properties::PackageTypes _types;
  WriterEnd _end;
};

class InjectedFaults : public ::testing::TestWithParam<const char*> {
 protected:
  void SetUp() override {
    // The sanitizers' own leak check cannot run under another tracer.
    ::setenv("ASAN_OPTIONS", "detect_leaks=0", 1);
    const WriterEnd end = runProgram({"strace", "-qq", "-o", "/dev/null", "true"});
    if (end.exitStatus == 0) return;
    std::cout << "strace is missing or may not attach: no fault was injected\n";
    GTEST_SKIP() << "strace is missing or may not attach";
  }
};

TEST_P(InjectedFaults, LeaveEveryToldIDTrue) {
  const std::string call = GetParam();
  for (const std::string how : {"signal=KILL", "error=EIO", "error=ENOSPC"}) {
    std::size_t told = 0;
    int nth = 1;
    for (bool wasInjected = true; wasInjected && !HasFailure(); ++nth) {
      const std::string what = call + " " + how + " at call " + std::to_string(nth);
      FaultyRun run("7");
      wasInjected = run.run(call, how, nth);
      run.judge(what, wasInjected);
      told += run.told;
    }
    std::cout << call << " " << how << ": " << nth - 2 << " calls, " << told << " IDs told\n";
    EXPECT_GT(nth, 2) << "nothing was injected";
    EXPECT_GT(told, 0U);
  }
}

INSTANTIATE_TEST_SUITE_P(, InjectedFaults, ::testing::Values("fdatasync", "pwrite64"),
                         [](const auto& parameter) { return std::string(parameter.param); });

}  // namespace
}  // namespace vantrell::faults
