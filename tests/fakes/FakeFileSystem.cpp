#include "tests/fakes/FakeFileSystem.h"

#include <array>
#include <cerrno>
#include <memory>
#include <utility>
#include <vector>

#include "tests/fakes/FakeDirectoryEnumerator.h"
#include "tests/fakes/FakeErrors.h"
#include "tests/fakes/FakeResources.h"

namespace vantrell {
namespace {

// Reads by place say in the foundation's words that nothing is there.
std::unexpected<FndError> failRead(const FndError& error) {
  if (error.isPosix(ENOENT) || error.isPosix(ENOTDIR)) {
    return std::unexpected(FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile));
  }
  return std::unexpected(error);
}

std::uint64_t sizeBelow(const FakeNode& node) {
  std::uint64_t size = node.kind == FileKind::RegularFile ? node.content.size() : 0;
  for (const auto& [name, entry] : node.entries) size += sizeBelow(*entry);
  return size;
}

// Hidden entries are not listed; the trash of a library is counted all the same.
std::uint64_t listedEntries(const FakeNode& folder, const FndURL& url) {
  std::uint64_t count = 0;
  for (const auto& [name, entry] : folder.entries) {
    const bool isTrash = name == ".Trash" && url.lastPathComponent() == "Documents";
    if (!name.starts_with('.') || isTrash) ++count;
  }
  return count;
}

std::size_t attributeBytes(const FakeNode& node) {
  std::size_t bytes = 0;
  for (const auto& [name, value] : node.attributes) bytes += name.size() + value.size();
  return bytes;
}

bool carriesAttributes(const FakeNode& node) {
  return node.kind == FileKind::RegularFile || node.kind == FileKind::Directory;
}

}  // namespace

Result<void> FakeFileSystem::readResourceValues(const FndURL& url,
                                                std::span<const FndURLResourceKey> keys) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::ReadResourceValues, url.path())) {
    return std::unexpected(*error);
  }
  const auto node = _tree.find(url.path());
  if (!node) return failRead(node.error());
  cacheFakeResources(_tree, _types, **node, url, keys);
  return {};
}

Result<std::unique_ptr<OpenFile>> FakeFileSystem::open(const FndURL& url, OpenMode mode) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::Open, url.path())) return std::unexpected(*error);
  const auto node = _tree.find(url.path());
  if (!node) return std::unexpected(node.error());
  const bool mayWrite = (*node)->isWritable() || (*node)->kind == FileKind::SymbolicLink;
  if (mode == OpenMode::ReadWrite && !mayWrite) return fakeFailure(EACCES);
  return std::make_unique<FakeOpenFile>(_tree, *node, url.path(), mode);
}

Result<FileStatus> FakeFileSystem::status(const FndURL& url) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::Status, url.path())) return std::unexpected(*error);
  const auto node = _tree.find(url.path(), FakeTree::FinalLink::Follow);
  if (!node) return std::unexpected(node.error());
  FileStatus status{.fileID = (*node)->fileID, .linkCount = 1};
  if ((*node)->kind == FileKind::Directory) status.linkCount = listedEntries(**node, url) + 2;
  if (const auto given = _tree.givenLinkCount(url.path())) status.linkCount = *given;
  return status;
}

Result<std::unique_ptr<DirectoryEnumerator>> FakeFileSystem::enumerateDirectory(
    const FndURL& folder, std::span<const FndURLResourceKey> prefetchedKeys, std::uint8_t options,
    DirectoryErrorHandler errorHandler) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::EnumerateDirectory, folder.path())) {
    return std::unexpected(*error);
  }
  const auto node = _tree.find(folder.path());
  if (!node) return failRead(node.error());
  if ((*node)->kind != FileKind::Directory) return fakeFailure(ENOTDIR);
  if (!(*node)->isReadable()) return fakeFailure(EACCES);
  return std::make_unique<FakeDirectoryEnumerator>(
      _tree, _types, *node, folder.path(),
      std::vector<FndURLResourceKey>(prefetchedKeys.begin(), prefetchedKeys.end()), options,
      std::move(errorHandler));
}

Result<void> FakeFileSystem::createDirectory(const FndURL& url) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::CreateDirectory, url.path())) {
    return std::unexpected(*error);
  }
  if (const auto node = _tree.find(url.path())) {
    if ((*node)->kind == FileKind::Directory) return {};
    return fakeFailure(EEXIST);
  }
  const FndURL parent = url.URLByDeletingLastPathComponent();
  if (const auto made = createDirectory(parent); !made) return made;
  const auto folder = _tree.find(parent.path());
  if (!folder) return std::unexpected(folder.error());
  if (!(*folder)->isWritable()) return fakeFailure(EACCES);
  _tree.create(*folder, url.lastPathComponent(), FileKind::Directory);
  return {};
}

Result<std::uint64_t> FakeFileSystem::recursiveSizeOfDirectory(const FndURL& url) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::RecursiveSize, url.path())) {
    return std::unexpected(*error);
  }
  const auto node = _tree.find(url.path());
  if (!node) return failRead(node.error());
  if ((*node)->kind != FileKind::Directory) return fakeFailure(ENOTDIR);
  return sizeBelow(**node);
}

Result<FndURL> FakeFileSystem::canonicalURL(const FndURL& url) {
  if (auto error = _tree.faults.next(FakeCall::CanonicalURL, url.path())) {
    return std::unexpected(*error);
  }
  const auto real = _tree.realPath(url.path());
  if (!real) return std::unexpected(real.error());
  return FndURL::fileURLWithPath(*real);
}

Result<DeviceID> FakeOpenFile::deviceID() {
  if (auto error = _tree.faults.next(FakeCall::DeviceID, _path)) return std::unexpected(*error);
  return _node->device;
}

Result<FileIdentity> FakeOpenFile::identity() {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::Identity, _path)) return std::unexpected(*error);
  return FileIdentity{
      .kind = _node->kind, .documentID = _node->documentID, .fileID = _node->fileID};
}

Result<void> FakeOpenFile::setAttribute(std::string_view name, FndDataView value) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::SetAttribute, _path)) return std::unexpected(*error);
  if (_mode != OpenMode::ReadWrite) return fakeFailure(EACCES);
  if (!carriesAttributes(*_node)) return fakeFailure(EPERM);
  const auto old = _node->attributes.find(name);
  const std::size_t freed =
      old == _node->attributes.end() ? 0 : old->first.size() + old->second.size();
  const std::size_t needed = attributeBytes(*_node) - freed + name.size() + value.size();
  if (needed > _tree.attributeCapacity()) return fakeFailure(ENOSPC);
  _node->attributes.insert_or_assign(std::string(name), FndData(value.begin(), value.end()));
  return {};
}

Result<void> FakeOpenFile::removeAttribute(std::string_view name) {
  const std::lock_guard lock(_tree.mutex);
  if (auto error = _tree.faults.next(FakeCall::RemoveAttribute, _path)) {
    return std::unexpected(*error);
  }
  if (_mode != OpenMode::ReadWrite) return fakeFailure(EACCES);
  if (!carriesAttributes(*_node)) return fakeFailure(EPERM);
  const auto found = _node->attributes.find(name);
  if (found == _node->attributes.end()) return fakeFailure(ENODATA);
  _node->attributes.erase(found);
  return {};
}

}  // namespace vantrell
