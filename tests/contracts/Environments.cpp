#include "tests/contracts/Environment.h"

namespace vantrell::testing {

const std::vector<EnvironmentMaker>& environments() {
  static const std::vector<EnvironmentMaker> kAll = {{"Linux", makeLinuxEnvironment},
                                                     {"Fake", makeFakeEnvironment}};
  return kAll;
}

}  // namespace vantrell::testing
