#pragma once

#include "platform/filesystem/FileSystem.h"
#include "tests/fakes/FakeTree.h"

namespace vantrell {

/// The extended attributes of a `FakeTree`.
///
/// Lifetime: borrows the tree.
class FakeExtendedAttributes : public ExtendedAttributes {
 public:
  explicit FakeExtendedAttributes(FakeTree& tree) : _tree(tree) {}

  Result<std::size_t> sizeOfAttribute(const FndURL& url, std::string_view name) override;
  Result<std::size_t> copyAttribute(const FndURL& url, std::string_view name,
                                    std::span<std::uint8_t> buffer) override;

 private:
  Result<FndData> valueOf(const FndURL& url, std::string_view name);

  FakeTree& _tree;
};

}  // namespace vantrell
