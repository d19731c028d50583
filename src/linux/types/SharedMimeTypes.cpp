#include "linux/types/SharedMimeTypes.h"

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <system_error>
#include <utility>

namespace vantrell::linuxos {
namespace {

namespace fs = std::filesystem;

constexpr std::size_t kLargestDescriptionFile = 256 * 1024;  // bytes

std::vector<std::string> foldersWithDatabase(const TypeFolders& folders) {
  std::vector<std::string> found;
  for (const std::string& folder : folders.dataFolders) {
    std::error_code error;
    std::string mime = folder + "/mime";
    if (fs::exists(mime + "/globs2", error)) found.push_back(std::move(mime));
  }
  return found;
}

std::vector<std::string> packageFolders(const TypeFolders& folders) {
  std::vector<std::string> all;
  for (const std::string& folder : folders.dataFolders) {
    all.push_back(folder + "/vantrell/package-types");
  }
  all.insert(all.end(), folders.packageTypeFolders.begin(), folders.packageTypeFolders.end());
  return all;
}

std::string_view typeOfSpecialFile(FileKind kind) {
  switch (kind) {
    case FileKind::SymbolicLink:
      return kSymbolicLinkTypeIdentifier;
    case FileKind::Fifo:
      return "inode/fifo";
    case FileKind::Socket:
      return "inode/socket";
    case FileKind::CharacterDevice:
      return "inode/chardevice";
    case FileKind::BlockDevice:
      return "inode/blockdevice";
    case FileKind::RegularFile:
    case FileKind::Directory:
      break;
  }
  return kDataTypeIdentifier;
}

void replaceAll(std::string& text, std::string_view what, std::string_view with) {
  for (std::size_t at = text.find(what); at != std::string::npos;
       at = text.find(what, at + with.size())) {
    text.replace(at, what.size(), with);
  }
}

// The text of the first comment without a language, in a type's description file.
std::string commentOf(std::string_view xml) {
  constexpr std::string_view kOpen = "<comment>";
  const std::size_t start = xml.find(kOpen);
  const std::size_t end = xml.find("</comment>", start);
  if (start == std::string_view::npos || end == std::string_view::npos) return {};
  std::string text(xml.substr(start + kOpen.size(), end - start - kOpen.size()));
  replaceAll(text, "&lt;", "<");
  replaceAll(text, "&gt;", ">");
  replaceAll(text, "&quot;", "\"");
  replaceAll(text, "&apos;", "'");
  replaceAll(text, "&amp;", "&");
  return text;
}

}  // namespace

SharedMimeTypes::SharedMimeTypes(const TypeFolders& folders)
    : _databaseFolders(foldersWithDatabase(folders)),
      _database(readMimeDatabase(_databaseFolders)),
      _globs(std::exchange(_database.globs, {})),
      _packages(packageFolders(folders)) {}

std::string SharedMimeTypes::typeIdentifierForName(std::string_view name, FileKind kind) const {
  if (kind == FileKind::Directory) {
    const std::string_view package = _packages.typeForFolderName(name);
    return std::string(package.empty() ? kFolderTypeIdentifier : package);
  }
  if (kind != FileKind::RegularFile) return std::string(typeOfSpecialFile(kind));
  const std::string_view type = _globs.typeForName(name);
  return std::string(type.empty() ? kDataTypeIdentifier : type);
}

std::string_view SharedMimeTypes::canonicalType(std::string_view type) const {
  const auto alias = _database.aliases.find(type);
  return alias == _database.aliases.end() ? type : std::string_view(alias->second);
}

bool SharedMimeTypes::typeConformsTo(std::string_view type, std::string_view supertype) const {
  if (type == supertype) return true;
  // Every listed item is asked this: what is declared here is settled before the database is.
  if (_packages.isPackageType(type)) return supertype == kPackageTypeIdentifier;
  if (type == kPackageTypeIdentifier || supertype == kPackageTypeIdentifier) return false;

  const std::string_view wanted = canonicalType(supertype);
  // Breadth first over the types above; each is visited once, so that cycles end.
  std::vector<std::string_view> above = {canonicalType(type)};
  for (std::size_t i = 0; i < above.size(); ++i) {
    const std::string_view current = above[i];
    if (current == wanted) return true;
    if (wanted == kDataTypeIdentifier && !current.starts_with("inode/")) return true;
    if (wanted == "text/plain" && current.starts_with("text/")) return true;
    const auto supertypes = _database.supertypes.find(current);
    if (supertypes == _database.supertypes.end()) continue;
    for (const std::string& next : supertypes->second) {
      const std::string_view canonical = canonicalType(next);
      if (std::find(above.begin(), above.end(), canonical) == above.end()) {
        above.push_back(canonical);
      }
    }
  }
  return false;
}

std::string SharedMimeTypes::descriptionOfType(std::string_view type) const {
  const std::string_view declared = _packages.descriptionOfType(type);
  if (!declared.empty()) return std::string(declared);
  const std::string_view canonical = canonicalType(type);
  if (!isTypeName(canonical)) return std::string(type);
  const MutexLock lock(_mutex);
  const auto [entry, isNew] = _descriptions.try_emplace(std::string(canonical));
  if (isNew) entry->second = readDescription(canonical);
  return entry->second.empty() ? std::string(type) : entry->second;
}

std::string SharedMimeTypes::readDescription(std::string_view type) const {
  for (const std::string& folder : _databaseFolders) {
    std::ifstream file(folder + '/' + std::string(type) + ".xml", std::ios::binary);
    std::string xml(kLargestDescriptionFile, '\0');
    file.read(xml.data(), static_cast<std::streamsize>(xml.size()));
    xml.resize(static_cast<std::size_t>(file.gcount()));
    if (std::string text = commentOf(xml); !text.empty()) return text;
  }
  return {};
}

}  // namespace vantrell::linuxos
