#pragma once

#include <string>

#include "platform/filesystem/FileSystem.h"
#include "platform/types/TypeRegistry.h"
#include "tests/fakes/FakeTree.h"

namespace vantrell {

/// The files and folders of a `FakeTree`.
///
/// Lifetime: borrows the tree and the types.
class FakeFileSystem : public FileSystem {
 public:
  FakeFileSystem(FakeTree& tree, const TypeRegistry& types) : _tree(tree), _types(types) {}

  Result<void> readResourceValues(const FndURL& url,
                                  std::span<const FndURLResourceKey> keys) override;
  Result<std::unique_ptr<OpenFile>> open(const FndURL& url, OpenMode mode) override;
  Result<FileStatus> status(const FndURL& url) override;
  Result<std::unique_ptr<DirectoryEnumerator>> enumerateDirectory(
      const FndURL& folder, std::span<const FndURLResourceKey> prefetchedKeys, std::uint8_t options,
      DirectoryErrorHandler errorHandler) override;
  Result<void> createDirectory(const FndURL& url) override;
  Result<std::uint64_t> recursiveSizeOfDirectory(const FndURL& url) override;
  Result<FndURL> canonicalURL(const FndURL& url) override;

 private:
  FakeTree& _tree;
  const TypeRegistry& _types;
};

/// An open file of a `FakeTree`: it stays what it is when its name goes to another object.
class FakeOpenFile : public OpenFile {
 public:
  FakeOpenFile(FakeTree& tree, FakeTree::Node node, std::string path, OpenMode mode)
      : _tree(tree), _node(std::move(node)), _path(std::move(path)), _mode(mode) {}

  Result<DeviceID> deviceID() override;
  Result<FileIdentity> identity() override;
  Result<void> setAttribute(std::string_view name, FndDataView value) override;
  Result<void> removeAttribute(std::string_view name) override;

  FakeNode& node() { return *_node; }
  const std::string& path() const { return _path; }

 private:
  FakeTree& _tree;
  const FakeTree::Node _node;
  const std::string _path;
  const OpenMode _mode;
};

}  // namespace vantrell
