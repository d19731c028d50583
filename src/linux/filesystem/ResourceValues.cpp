#include "linux/filesystem/ResourceValues.h"

namespace vantrell::linuxos {
namespace {

void appendLittleEndian(FndData& data, std::uint64_t value) {
  for (int shift = 0; shift < 64; shift += 8) {
    data.push_back(static_cast<std::uint8_t>(value >> shift));
  }
}

}  // namespace

FndData contentVersion(const ObjectStatus& status) {
  const auto seconds = static_cast<std::uint64_t>(status.modified.unixSeconds());
  FndData version;
  version.reserve(16);
  appendLittleEndian(version, seconds * 1'000'000'000U + status.modified.nanoseconds());
  appendLittleEndian(version, status.size);
  return version;
}

std::optional<FndURL::ResourceValue> makeResourceValue(FndURLResourceKey key, const FndURL& url,
                                                       const FndURL& parent,
                                                       const ObjectView& view) {
  const ObjectStatus& status = view.status;
  switch (key) {
    case FndURLResourceKey::ParentDirectoryURL:
      return parent;
    case FndURLResourceKey::Name:
    case FndURLResourceKey::LocalizedName:
      return std::string(url.lastPathComponent());
    case FndURLResourceKey::TypeIdentifier:
      return view.typeIdentifier;
    case FndURLResourceKey::FileSize:
      if (status.kind != FileKind::RegularFile) return std::nullopt;
      return FndNumber(status.size);
    case FndURLResourceKey::CreationDate:
      if (!status.created) return std::nullopt;
      return *status.created;
    case FndURLResourceKey::ContentModificationDate:
      return status.modified;
    case FndURLResourceKey::IsReadable:
      return view.access.readable;
    case FndURLResourceKey::IsWritable:
      return view.access.writable;
    case FndURLResourceKey::IsDirectory:
      return status.kind == FileKind::Directory;
    case FndURLResourceKey::IsPackage:
      return view.isPackage;
    case FndURLResourceKey::FileResourceIdentifier:
      return FndNumber(status.fileID.value);
    case FndURLResourceKey::DocumentIdentifier:
      if (view.documentID.value == 0) return std::nullopt;
      return FndNumber(std::uint64_t{view.documentID.value});
    case FndURLResourceKey::ContentVersion:
      return contentVersion(status);
  }
  return std::nullopt;
}

}  // namespace vantrell::linuxos
