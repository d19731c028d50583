#pragma once

#include <string>
#include <vector>

#include "ObservedTree.h"

namespace vantrell::properties {

/// How the entries that the catalog's database in that folder holds differ from a fresh walk,
/// one line each. Reads the database through a connection of its own that cannot write.
std::vector<std::string> differencesFromRows(const std::string& stateFolder,
                                             const ObservedTree& tree);

/// What SQLite itself finds wrong with the database in that folder, one line each.
std::vector<std::string> damageOfDatabase(const std::string& stateFolder);

}  // namespace vantrell::properties
