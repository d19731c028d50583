#pragma once

#include <cstdint>
#include <random>
#include <set>
#include <string>
#include <vector>

#include "PackageTypes.h"
#include "linux/catalog/Catalog.h"

namespace vantrell::faults {

/// Works on a storage with a catalog, and reports each thing to a descriptor before or after it
/// is done, so that whoever reads the other end knows what was promised when it died.
///
/// Each report is one line, written at once:
///
///     T <document ID> <path>   the catalog has told this ID for the file at that path
///     R <old path> <new path>  the file is about to be renamed
///     E <text>                 the catalog has answered with an error
///
/// Threads: use from one thread. Lifetime: its own.
class CatalogWriter {
 public:
  CatalogWriter(std::string root, std::string state, int reports, std::uint64_t seed)
      : _root(std::move(root)), _state(std::move(state)), _reports(reports), _random(seed) {}

  /// Opens, looks and asks for all IDs; then makes, saves and renames files, looks and asks, for
  /// so many rounds. False when the catalog answered with an error.
  bool work(int rounds);

 private:
  bool lookAndAsk(linuxos::Catalog& catalog);
  bool askForFolder(linuxos::Catalog& catalog, const std::string& folder);
  void changeSomething();
  void createFile(const std::string& folder);
  void saveThroughTemporary(const std::string& path);
  void saveByExchange(const std::string& path);
  void rename(const std::string& path);
  std::vector<std::string> folders() const;
  std::vector<std::string> documentsIn(const std::string& folder) const;
  std::string freshName();
  void report(const std::string& line) const;

  std::string _root;
  std::string _state;
  int _reports;
  std::mt19937_64 _random;
  properties::PackageTypes _types;
  std::set<std::string> _changed;  ///< since the last look
};

}  // namespace vantrell::faults
