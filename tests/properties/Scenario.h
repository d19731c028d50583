#pragma once

#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "IdentityJudge.h"
#include "StepPlayer.h"

namespace vantrell::properties {

/// One line of a scenario.
struct Event {
  enum class Kind : std::uint8_t {
    Act,            ///< something happens on the disk
    Create,         ///< the same, before the catalog is opened for the first time
    Look,           ///< the open catalog looks
    ReopenAndLook,  ///< the catalog is closed, opened again, and looks
    Ask,            ///< somebody asks for the IDs of documents in view, of one folder
    AskHidden,      ///< or of one that is not in view
    NoteAttribute,  ///< an attribute is set through the catalog's own process
  };
  Kind kind = Kind::Look;
  Step step;
};

using Scenario = std::vector<Event>;

/// What came of a scenario.
struct ScenarioResult {
  std::vector<std::string> complaints;
  std::vector<std::string> trace;
  JudgeCounts counts;
  int reusedFileNumbers = 0;
};

/// What a scenario is played on.
struct Stage {
  std::string parent;           ///< the folder for the temporary storage
  std::string stateParent;      ///< the folder for the catalog's state
  bool takesAttributes = true;  ///< false where the volume refuses them
};

/// A stage in that folder. The state is kept in memory where that is possible: which file is
/// which document does not depend on it, and a disk would be waited for most of the time.
Stage stageIn(const std::string& parent);

/// A storage with a few things in it, and rounds of changes, looks and questions.
Scenario drawScenario(std::uint64_t seed);

/// Plays it on a new storage, with a judge, until the first complaint.
ScenarioResult play(const Scenario& scenario, const Stage& stage);

/// The shortest scenario found, by leaving out events, for which `fails` still holds.
Scenario shrink(Scenario scenario, const std::function<bool(const Scenario&)>& fails);

}  // namespace vantrell::properties
