#include "tests/fakes/FakeResources.h"

#include <bit>

namespace vantrell {
namespace {

using Key = FndURLResourceKey;
using Value = std::optional<FndURL::ResourceValue>;

// Seconds, nanoseconds and size: what changes when the content does.
FndData contentVersion(const FakeNode& node) {
  FndData data;
  for (const std::uint64_t number :
       {static_cast<std::uint64_t>(node.modified.unixSeconds()),
        std::uint64_t{node.modified.nanoseconds()}, std::uint64_t{node.content.size()}}) {
    const auto bytes = std::bit_cast<std::array<std::uint8_t, sizeof number>>(number);
    data.insert(data.end(), bytes.begin(), bytes.end());
  }
  return data;
}

Value number(std::uint64_t value) { return FndURL::ResourceValue(FndNumber(value)); }

Value valueOf(const TypeRegistry& types, const FakeNode& node, const FndURL& url, Key key) {
  const std::string name(url.lastPathComponent());
  switch (key) {
    case Key::ParentDirectoryURL:
      return url.URLByDeletingLastPathComponent();
    case Key::Name:
    case Key::LocalizedName:
      return name;
    case Key::TypeIdentifier:
      return types.typeIdentifierForName(name, node.kind);
    case Key::FileSize:
      return node.kind == FileKind::RegularFile ? number(node.content.size()) : std::nullopt;
    case Key::CreationDate:
      return node.created;
    case Key::ContentModificationDate:
      return node.modified;
    case Key::IsReadable:
      return node.isReadable();
    case Key::IsWritable:
      return node.isWritable();
    case Key::IsDirectory:
      return node.kind == FileKind::Directory;
    case Key::IsPackage:
      return isFakePackage(types, node, name);
    case Key::FileResourceIdentifier:
      return number(node.fileID.value);
    case Key::DocumentIdentifier:
      return node.documentID.value == 0 ? std::nullopt : number(node.documentID.value);
    case Key::ContentVersion:
      return contentVersion(node);
  }
  return std::nullopt;
}

}  // namespace

bool isFakePackage(const TypeRegistry& types, const FakeNode& node, std::string_view name) {
  return node.kind == FileKind::Directory &&
         types.typeConformsTo(types.typeIdentifierForName(name, node.kind), kPackageTypeIdentifier);
}

void cacheFakeResources(const FakeTree& tree, const TypeRegistry& types, const FakeNode& node,
                        const FndURL& url, std::span<const Key> keys) {
  for (const Key key : keys) {
    if (tree.isWithheld(key)) continue;
    Value value = tree.givenResource(url.path(), key);
    if (!value) value = valueOf(types, node, url, key);
    if (value) url.setCachedResourceValue(key, std::move(*value));
  }
}

}  // namespace vantrell
