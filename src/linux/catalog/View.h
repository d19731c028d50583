#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <vector>

#include "linux/catalog/EntryTable.h"
#include "linux/catalog/FolderReader.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// What the last look looked at, and the way to look again.
struct View {
  std::vector<RootRecord> roots;
  DeviceID device;  ///< 0 before the first look
  /// Looks at the folders that changed, and lets the documents follow.
  std::function<Result<void>()> lookAgain;

  /// True for a path that no look can bring into the catalog: outside the roots, or below a
  /// hidden name.
  bool isOutOfView(std::string_view path) const;
};

}  // namespace vantrell::linuxos::catalog
