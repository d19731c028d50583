#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "linux/types/StringMap.h"

namespace vantrell::linuxos {

/// The declared package types: folders that people see as one document. Each section of a
/// declaration file declares one:
///
///     [com.quillon.tessera.document]
///     extensions=tessera;
///     description=Tessera document
///
/// Threads: immutable once it is made.
class PackageTypes {
 public:
  /// Reads every "*.ini" file of the folders, the most important folder first. In a folder, files
  /// count in the order of their names; of two declarations of one extension the first counts.
  explicit PackageTypes(const std::vector<std::string>& folders);

  /// The type of a folder of that name; empty when it is no package.
  std::string_view typeForFolderName(std::string_view name) const;
  bool isPackageType(std::string_view type) const;
  /// Empty when there is none.
  std::string_view descriptionOfType(std::string_view type) const;

 private:
  void readFile(const std::string& path);

  StringMap<std::string> _typesByExtension;  // in lower case, without dot
  StringMap<std::string> _descriptions;      // of every declared type
};

}  // namespace vantrell::linuxos
