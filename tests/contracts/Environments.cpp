#include "tests/contracts/Environment.h"

namespace vantrell::testing {

const std::vector<EnvironmentMaker>& environments() {
  static const std::vector<EnvironmentMaker> kAll = {{"Linux", makeLinuxEnvironment},
                                                     {"LinuxWithCatalog", makeCatalogEnvironment},
                                                     {"Fake", makeFakeEnvironment}};
  return kAll;
}

}  // namespace vantrell::testing
