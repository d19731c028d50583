#include "IdentityRun.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdlib>
#include <iostream>
#include <optional>
#include <random>

#include "Scenario.h"

namespace vantrell::properties {
namespace {

using std::chrono::seconds;
using std::chrono::steady_clock;

std::optional<std::uint64_t> seedFromEnvironment() {
  const char* text = std::getenv("VANTRELL_SEED");
  if (text == nullptr) return std::nullopt;
  return std::strtoull(text, nullptr, 0);
}

std::string joined(const std::vector<std::string>& lines) {
  std::string text;
  for (const std::string& line : lines) text += "  " + line + "\n";
  return text;
}

/// The least scenario that still fails, and what it does.
std::string explain(const Scenario& scenario, std::uint64_t seed, const Stage& stage) {
  std::optional<ScenarioResult> failure;
  const Scenario least = shrink(scenario, [&](const Scenario& shorter) {
    ScenarioResult result = play(shorter, stage);
    if (result.complaints.empty()) return false;
    failure = std::move(result);
    return true;
  });
  if (!failure) failure = play(least, stage);
  return "VANTRELL_SEED=" + std::to_string(seed) + " in " + stage.parent + "\nwhat happened:\n" +
         joined(failure->trace) + "what is wrong:\n" + joined(failure->complaints);
}

struct RunCounts {
  JudgeCounts judge;
  int scenarios = 0;
  int reusedFileNumbers = 0;
};

/// False for a run that never came near what it is to show.
bool sawEverything(const RunCounts& counts) {
  const JudgeCounts& judge = counts.judge;
  return judge.handedOver > 0 && judge.moved > 0 && judge.gone > 0 && judge.cameBack > 0;
}

/// Plays scenarios for that long, and longer on a machine so slow that it has not seen much by
/// then; or the one of VANTRELL_SEED. A failure ends it.
RunCounts run(const std::string& parent, seconds duration) {
  const Stage stage = stageIn(parent);
  const std::optional<std::uint64_t> chosenSeed = seedFromEnvironment();
  std::uint64_t seed = chosenSeed.value_or(std::random_device{}());
  std::cout << "first seed " << seed << " in " << parent
            << (stage.takesAttributes ? "" : ", which takes no attributes") << "\n";
  RunCounts counts;
  const auto end = steady_clock::now() + duration;
  do {
    const Scenario scenario = drawScenario(seed);
    const ScenarioResult result = play(scenario, stage);
    if (!result.complaints.empty()) {
      ADD_FAILURE() << explain(scenario, seed, stage) << "as it was first seen:\n"
                    << joined(result.trace) << joined(result.complaints);
      return counts;
    }
    counts.judge.add(result.counts);
    counts.reusedFileNumbers += result.reusedFileNumbers;
    ++counts.scenarios;
    ++seed;
    const auto now = steady_clock::now();
    if (now > end && (sawEverything(counts) || now > end + 5 * duration)) break;
  } while (!chosenSeed);
  return counts;
}

void print(const RunCounts& counts) {
  const JudgeCounts& judge = counts.judge;
  std::cout << counts.scenarios << " scenarios, " << judge.looks << " looks, "
            << judge.documentsToldAnID << " IDs told, " << judge.certain << " verdicts certain, "
            << judge.uncertain << " with a choice; " << judge.handedOver << " handed over, "
            << judge.moved << " moved, " << judge.gone << " gone, " << judge.cameBack
            << " came back, " << judge.attributesCarried << " attributes carried, "
            << counts.reusedFileNumbers << " file numbers reused\n";
}

}  // namespace

void documentsKeepTheirIdentity(const std::string& parent, seconds duration) {
  const RunCounts counts = run(parent, duration);
  print(counts);
  if (seedFromEnvironment() || ::testing::Test::HasFailure()) return;
  EXPECT_TRUE(sawEverything(counts));
  EXPECT_GT(counts.judge.certain, 10 * counts.judge.uncertain);
}

}  // namespace vantrell::properties
