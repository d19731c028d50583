#include "items/PutBackLocation.h"

#include <string>
#include <vector>

#include "applibraries/ZubAppLibraryManager.h"
#include "items/ItemMetadata.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"
#include "support/Log.h"

namespace vantrell {
namespace {

bool contains(const FndURL& root, const FndURL& url) {
  return dh_relationshipToItemAtURL(root, url) == DhURLRelationship::Contains;
}

// The components of a stored location; none at all when it is not in the form we write.
std::vector<std::string_view> components(std::string_view location) {
  std::vector<std::string_view> parts;
  if (location.find('\0') != std::string_view::npos) return {};
  for (;;) {
    const std::size_t slash = location.find('/');
    const std::string_view part = location.substr(0, slash);
    if (part.empty() || part == "." || part == "..") return {};
    parts.push_back(part);
    if (slash == std::string_view::npos) return parts;
    location.remove_prefix(slash + 1);
  }
}

bool isLink(const FndURL& url) {
  const auto file = platform::services().fileSystem->open(url, OpenMode::EventOnly);
  if (!file) return false;  // nothing is there any more, so nothing leads on
  const auto identity = (*file)->identity();
  return identity && identity->kind == FileKind::SymbolicLink;
}

// Where `url` really is: itself, or what the link there leads to; none for a link to nowhere.
std::optional<FndURL> throughLink(const FndURL& url) {
  if (!isLink(url)) return url;
  const auto below =
      platform::services().fileSystem->canonicalURL(url.URLByAppendingPathComponent("-"));
  return below ? std::optional(below->URLByDeletingLastPathComponent()) : std::nullopt;
}

// Walks down from the root link by link: whoever puts the item back must stay in the library.
std::optional<FndURL> resolved(std::string_view location, const FndURL& libraryRoot) {
  const std::vector<std::string_view> parts = components(location);
  if (parts.empty()) return std::nullopt;
  FndURL url = libraryRoot;
  for (const std::string_view part : parts) {
    const auto next = throughLink(url.URLByAppendingPathComponent(part));
    if (!next || !contains(libraryRoot, *next)) return std::nullopt;
    url = *next;
  }
  return url;
}

}  // namespace

std::optional<FndURL> libraryRootOfItemAt(const FndURL& url) {
  const auto roots = ZubAppLibraryManager::rootURLsForAppLibraries();
  for (const FndURL& root : *roots) {
    if (contains(root, url)) return root;
  }
  const FndURL& storageRoot = platform::services().manager->documentStorageURL();
  return contains(storageRoot, url) ? std::optional(storageRoot) : std::nullopt;
}

std::optional<FndURL> putBackURLOfItemAt(const FndURL& url) {
  const std::optional<std::string> location = readPutBackLocation(url);
  if (!location) {
    logDebug("couldn't find putback xattr for ", url.path());
    return std::nullopt;
  }
  const std::optional<FndURL> library = libraryRootOfItemAt(url);
  const std::optional<FndURL> putBack = library ? resolved(*location, *library) : std::nullopt;
  if (!putBack) {
    logError("couldn't compute putback url");
    return std::nullopt;
  }
  logDebug("putback: '", putBack->path(), "' library: '", library->path(), "'");
  return putBack;
}

}  // namespace vantrell
