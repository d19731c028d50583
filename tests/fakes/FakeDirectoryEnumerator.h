#pragma once

#include <string>
#include <vector>

#include "platform/filesystem/FileSystem.h"
#include "platform/types/TypeRegistry.h"
#include "tests/fakes/FakeTree.h"

namespace vantrell {

/// Walks a folder of a `FakeTree`.
class FakeDirectoryEnumerator : public DirectoryEnumerator {
 public:
  FakeDirectoryEnumerator(FakeTree& tree, const TypeRegistry& types, FakeTree::Node folder,
                          std::string path, std::vector<FndURLResourceKey> keys,
                          std::uint8_t options, DirectoryErrorHandler errorHandler);

  std::optional<FndURL> next() override;

 private:
  struct Level {
    FakeTree::Node folder;
    std::string path;
    std::size_t position = 0;
  };

  void descend(const FakeTree::Node& node, const FndURL& url);
  // Leaves no level when the error handler wants no more.
  void report(const FndURL& url, const FndError& error);

  FakeTree& _tree;
  const TypeRegistry& _types;
  std::vector<FndURLResourceKey> _keys;
  const std::uint8_t _options;
  const DirectoryErrorHandler _errorHandler;
  std::vector<Level> _levels;
};

}  // namespace vantrell
