#include "platform/dochost/DhURLOperations.h"

#include <string_view>

#include "platform/Services.h"
#include "platform/filesystem/URLResourceValues.h"

namespace vantrell {
namespace {

DhURLRelationship relationshipOfPaths(std::string_view folder, std::string_view item) {
  // Roots are many and mostly wrong: the byte after the folder's path settles it for nearly all
  // of them before any comparison of the paths themselves.
  if (item.size() > folder.size()) {
    const bool isRoot = folder.size() == 1;
    const bool atBoundary = isRoot || item[folder.size()] == '/';
    const bool contains = atBoundary && item.starts_with(folder);
    return contains ? DhURLRelationship::Contains : DhURLRelationship::Other;
  }
  return item == folder ? DhURLRelationship::Same : DhURLRelationship::Other;
}

FndURL canonical(const FndURL& url) {
  if (!url.hasParentReference()) return url;
  auto resolved = platform::services().fileSystem->canonicalURL(url);
  return resolved ? *resolved : url;
}

bool flag(const FndURL& url, FndURLResourceKey key) {
  const auto value = resourceValue(url, key);
  if (!value || !*value) return false;
  const bool* truth = std::get_if<bool>(&**value);
  return truth != nullptr && *truth;
}

}  // namespace

DhURLRelationship dh_relationshipToItemAtURL(const FndURL& folder, const FndURL& item) {
  if (folder.hasParentReference() || item.hasParentReference()) {
    return relationshipOfPaths(canonical(folder).path(), canonical(item).path());
  }
  if (folder.isFileURL() && item.isFileURL()) {
    return relationshipOfPaths(folder.path(), item.path());
  }
  return folder == item ? DhURLRelationship::Same : DhURLRelationship::Other;
}

bool dh_isFolder(const FndURL& url) {
  return flag(url, FndURLResourceKey::IsDirectory) && !flag(url, FndURLResourceKey::IsPackage);
}

Result<void> dh_withReadWriteAccess(const FndURL& url,
                                    const std::function<Result<void>(OpenFile&)>& work) {
  auto file = platform::services().fileSystem->open(url, OpenMode::ReadWrite);
  if (!file) return std::unexpected(std::move(file.error()));
  return work(**file);
}

}  // namespace vantrell
