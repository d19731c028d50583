#pragma once

#include <cstddef>
#include <vector>

#include "platform/types/TypeRegistry.h"
#include "platform/verstow/VerstowManager.h"
#include "tests/fakes/FakeTree.h"

namespace vantrell {

/// The documents of a `FakeTree`.
///
/// Threads: set it up before it is used.
/// Lifetime: borrows the tree and the types.
class FakeVerstow : public VerstowManager {
 public:
  FakeVerstow(FakeTree& tree, const TypeRegistry& types) : _tree(tree), _types(types) {}

  /// The next resolutions fail with these errno values, one after the other.
  void failResolutions(std::vector<int> osErrors) { _failures = std::move(osErrors); }
  /// No document gets a new ID.
  void refuseAllocations(int osError) { _allocationError = osError; }
  std::size_t resolutions() const { return _resolutions; }
  std::size_t allocations() const { return _allocations; }

  void prepare() override { _prepared = true; }
  Result<FileID> resolveDocumentID(DocumentID documentID, DeviceID device) override;
  Result<DocumentID> getOrAllocateDocumentID(OpenFile& file) override;
  Result<DocumentID> permanentStorageAtURL(const FndURL& url, bool allocateIfNone) override;

 private:
  void needPrepared() const;
  Result<DocumentID> allocate(FakeNode& node, std::string_view path);

  FakeTree& _tree;
  const TypeRegistry& _types;
  std::vector<int> _failures;
  int _allocationError = 0;
  std::size_t _resolutions = 0;
  std::size_t _allocations = 0;
  bool _prepared = false;
};

}  // namespace vantrell
