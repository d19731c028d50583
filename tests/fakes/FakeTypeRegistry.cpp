#include "tests/fakes/FakeTypeRegistry.h"

#include <algorithm>

namespace vantrell {
namespace {

std::string_view extensionOf(std::string_view name) {
  const std::size_t dot = name.rfind('.');
  return dot == std::string_view::npos || dot == 0 ? std::string_view() : name.substr(dot + 1);
}

std::string nameOfKind(FileKind kind) {
  switch (kind) {
    case FileKind::Directory:
      return std::string(kFolderTypeIdentifier);
    case FileKind::SymbolicLink:
      return std::string(kSymbolicLinkTypeIdentifier);
    case FileKind::Fifo:
      return "inode/fifo";
    case FileKind::Socket:
      return "inode/socket";
    case FileKind::CharacterDevice:
      return "inode/chardevice";
    case FileKind::BlockDevice:
      return "inode/blockdevice";
    case FileKind::RegularFile:
      break;
  }
  return std::string(kDataTypeIdentifier);
}

}  // namespace

FakeTypeRegistry::FakeTypeRegistry() {
  const std::string data(kDataTypeIdentifier);
  declareFile("txt", "text/plain", {data});
  declareFile("md", "text/markdown", {"text/plain"});
  declareFile("png", "image/png", {data});
  declarePackage("tessera", "com.quillon.tessera.document");
  declarePackage("brindle", "com.quillon.brindle.sheet");
  declarePackage("pouch", "org.example.pouch");
}

void FakeTypeRegistry::declareFile(std::string extension, std::string type,
                                   std::vector<std::string> supertypes) {
  _supertypes[type] = std::move(supertypes);
  _files[std::move(extension)] = std::move(type);
}

void FakeTypeRegistry::declarePackage(std::string extension, std::string type) {
  _supertypes[type] = {std::string(kPackageTypeIdentifier)};
  _packages[std::move(extension)] = std::move(type);
}

void FakeTypeRegistry::declareAlias(std::string alias, std::string type) {
  _aliases[std::move(alias)] = std::move(type);
}

std::string FakeTypeRegistry::unaliased(std::string_view type) const {
  const auto found = _aliases.find(type);
  return found == _aliases.end() ? std::string(type) : found->second;
}

std::string FakeTypeRegistry::typeIdentifierForName(std::string_view name, FileKind kind) const {
  if (kind != FileKind::RegularFile && kind != FileKind::Directory) return nameOfKind(kind);
  const auto& known = kind == FileKind::RegularFile ? _files : _packages;
  const auto found = known.find(extensionOf(name));
  return found == known.end() ? nameOfKind(kind) : found->second;
}

bool FakeTypeRegistry::typeConformsTo(std::string_view type, std::string_view supertype) const {
  const std::string mine = unaliased(type);
  const std::string wanted = unaliased(supertype);
  if (mine == wanted) return true;
  const auto found = _supertypes.find(mine);
  if (found == _supertypes.end()) return false;
  return std::ranges::any_of(
      found->second, [&](const std::string& above) { return typeConformsTo(above, wanted); });
}

std::string FakeTypeRegistry::descriptionOfType(std::string_view type) const {
  return std::string(type);
}

}  // namespace vantrell
