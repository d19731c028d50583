#include "tests/fakes/FakeVerstow.h"

#include <cerrno>
#include <stdexcept>

#include "tests/fakes/FakeErrors.h"
#include "tests/fakes/FakeFileSystem.h"
#include "tests/fakes/FakeResources.h"

namespace vantrell {
void FakeVerstow::needPrepared() const {
  if (!_prepared) throw std::logic_error("the storage service is used before it is prepared");
}

Result<FileID> FakeVerstow::resolveDocumentID(DocumentID documentID, DeviceID device) {
  const std::lock_guard lock(_tree.mutex);
  needPrepared();
  ++_resolutions;
  if (!_failures.empty()) {
    const int osError = _failures.front();
    _failures.erase(_failures.begin());
    return fakeFailure(osError);
  }
  const FakeTree::Node node = documentID.value == 0 ? nullptr : _tree.nodeOfDocument(documentID);
  if (node == nullptr || node->device != device) return fakeFailure(ENOENT);
  return node->fileID;
}

Result<DocumentID> FakeVerstow::allocate(FakeNode& node, std::string_view path) {
  if (node.documentID.value != 0) return node.documentID;
  const bool isDocument =
      node.kind == FileKind::RegularFile || isFakePackage(_types, node, splitFakePath(path).second);
  if (!isDocument) throw std::logic_error("only documents have document IDs");
  if (_allocationError != 0) return fakeFailure(_allocationError);
  if (node.device != FakeTree::kDevice) return fakeFailure(EXDEV);
  ++_allocations;
  return _tree.allocateDocumentID(node);
}

Result<DocumentID> FakeVerstow::getOrAllocateDocumentID(OpenFile& file) {
  const std::lock_guard lock(_tree.mutex);
  needPrepared();
  auto* mine = dynamic_cast<FakeOpenFile*>(&file);
  if (mine == nullptr) throw std::logic_error("a file of another file system");
  return allocate(mine->node(), mine->path());
}

Result<DocumentID> FakeVerstow::permanentStorageAtURL(const FndURL& url, bool allocateIfNone) {
  const std::lock_guard lock(_tree.mutex);
  needPrepared();
  const auto node = _tree.find(url.path());
  if (!node) return std::unexpected(node.error());
  if (!allocateIfNone) return (*node)->documentID;
  return allocate(**node, url.path());
}

}  // namespace vantrell
