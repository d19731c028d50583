#pragma once

#include <map>

#include "platform/filesystem/Volumes.h"
#include "tests/fakes/FakeTree.h"

namespace vantrell {

/// The volumes of a `FakeTree`. Only its first one, `FakeTree::kDevice`, is recorded.
///
/// Lifetime: borrows the tree.
class FakeVolumes : public Volumes {
 public:
  explicit FakeVolumes(FakeTree& tree) : _tree(tree) {}

  Result<FndUUID> volumeUUIDForURL(const FndURL& url) override;
  Result<std::string> pathForFileID(DeviceID device, FileID fileID) override;

  /// Answers `path` for that number, as a record that is out of date would.
  void setPath(FileID fileID, std::string path) { _paths[fileID.value] = std::move(path); }

 private:
  FakeTree& _tree;
  std::map<DeviceID, FndUUID> _uuids;
  std::map<std::uint64_t, std::string> _paths;
};

}  // namespace vantrell
