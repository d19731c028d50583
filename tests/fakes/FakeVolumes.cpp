#include "tests/fakes/FakeVolumes.h"

#include <cerrno>

namespace vantrell {

Result<FndUUID> FakeVolumes::volumeUUIDForURL(const FndURL& url) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::VolumeUUID, url.path())) {
    return std::unexpected(*error);
  }
  const auto node = _tree.find(url.path());
  if (!node) return std::unexpected(node.error());
  return _uuids.try_emplace((*node)->device, FndUUID::random()).first->second;
}

Result<std::string> FakeVolumes::pathForFileID(DeviceID device, FileID fileID) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::PathForFileID, "")) return std::unexpected(*error);
  if (device != FakeTree::kDevice) return std::unexpected(FndError::posix(ENODEV));
  if (const auto given = _paths.find(fileID.value); given != _paths.end()) return given->second;
  return _tree.pathOf(device, fileID);
}

}  // namespace vantrell
