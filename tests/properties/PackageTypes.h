#pragma once

#include "platform/types/TypeRegistry.h"

namespace vantrell::properties {

/// Types by name alone, with one declared package: folders called "*.tessera".
///
/// Threads: any. Lifetime: must outlive the catalog that borrows it.
class PackageTypes final : public TypeRegistry {
 public:
  std::string typeIdentifierForName(std::string_view name, FileKind kind) const override {
    if (kind == FileKind::SymbolicLink) return std::string(kSymbolicLinkTypeIdentifier);
    if (kind != FileKind::Directory) return std::string(kDataTypeIdentifier);
    return std::string(name.ends_with(".tessera") ? kPackage : kFolderTypeIdentifier);
  }
  bool typeConformsTo(std::string_view type, std::string_view supertype) const override {
    return type == supertype || (type == kPackage && supertype == kPackageTypeIdentifier);
  }
  std::string descriptionOfType(std::string_view type) const override { return std::string(type); }

 private:
  static constexpr std::string_view kPackage = "application/x-tessera";
};

}  // namespace vantrell::properties
