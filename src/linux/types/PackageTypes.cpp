#include "linux/types/PackageTypes.h"

#include <algorithm>
#include <filesystem>
#include <system_error>

#include "linux/types/GlobTable.h"
#include "linux/types/KeyFile.h"

namespace vantrell::linuxos {
namespace {

namespace fs = std::filesystem;

std::vector<std::string> declarationFiles(const std::string& folder) {
  std::vector<std::string> files;
  std::error_code error;
  fs::directory_iterator entries(folder, error);
  while (!error && entries != fs::directory_iterator()) {
    if (entries->path().extension() == ".ini") files.push_back(entries->path().string());
    entries.increment(error);
  }
  std::sort(files.begin(), files.end());
  return files;
}

// A type of this kind is a name in reverse-domain form; it must not pass for a MIME type.
bool isPackageTypeName(std::string_view name) {
  return !name.empty() && std::all_of(name.begin(), name.end(), [](char c) {
    return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9') || c == '.' ||
           c == '-';
  });
}

}  // namespace

PackageTypes::PackageTypes(const std::vector<std::string>& folders) {
  for (const std::string& folder : folders) {
    for (const std::string& file : declarationFiles(folder)) readFile(file);
  }
}

void PackageTypes::readFile(const std::string& path) {
  for (const KeyFileSection& section : readKeyFile(path)) {
    if (!isPackageTypeName(section.name)) continue;
    _descriptions.try_emplace(section.name, section.value("description").value_or(""));
    for (std::string_view extension : keyFileList(section.value("extensions").value_or(""))) {
      if (extension.starts_with('.')) extension.remove_prefix(1);
      _typesByExtension.try_emplace(lowerCase(extension), section.name);
    }
  }
}

std::string_view PackageTypes::typeForFolderName(std::string_view name) const {
  // The longest extension first; a name that begins with its only dot has none.
  for (std::size_t dot = name.find('.', 1); dot != std::string_view::npos;
       dot = name.find('.', dot + 1)) {
    const auto found = _typesByExtension.find(lowerCase(name.substr(dot + 1)));
    if (found != _typesByExtension.end()) return found->second;
  }
  return {};
}

bool PackageTypes::isPackageType(std::string_view type) const {
  return _descriptions.contains(type);
}

std::string_view PackageTypes::descriptionOfType(std::string_view type) const {
  const auto found = _descriptions.find(type);
  return found == _descriptions.end() ? std::string_view() : std::string_view(found->second);
}

}  // namespace vantrell::linuxos
