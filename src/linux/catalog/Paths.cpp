#include "linux/catalog/Paths.h"

#include <fcntl.h>

#include <algorithm>
#include <cerrno>
#include <unordered_set>

#include "linux/catalog/FolderReader.h"
#include "linux/catalog/Generations.h"

namespace vantrell::linuxos::catalog {

namespace {

std::string joined(const std::string& start, const std::vector<std::string>& namesFromTheEnd) {
  std::string path = start == "/" ? std::string() : start;
  std::for_each(namesFromTheEnd.rbegin(), namesFromTheEnd.rend(),
                [&](const std::string& name) { path += "/" + name; });
  return path;
}

}  // namespace

Result<std::optional<std::string>> pathOf(EntryTable& entries, const std::vector<RootRecord>& roots,
                                          FileID parent, const std::string& name) {
  std::vector<std::string> names{name};
  // Folders moved around each other while they were looked at may be catalogued in a circle.
  std::unordered_set<FileID> passed;
  while (passed.insert(parent).second) {
    const auto root = std::ranges::find_if(
        roots, [&](const RootRecord& candidate) { return candidate.object.fileID == parent; });
    if (root != roots.end()) return joined(root->path, names);
    const auto places = entries.placesOfFileID(parent);
    if (!places) return std::unexpected(places.error());
    const auto folder = std::ranges::find_if(
        *places, [](const PlacedEntry& place) { return place.entry.kind.isDirectory(); });
    if (folder == places->end()) return std::nullopt;
    names.push_back(folder->entry.name);
    parent = folder->parent;
  }
  return std::nullopt;
}

OsResult<StandingObject> objectStandingAt(const std::string& path) {
  auto descriptor = openWithoutLinks(AT_FDCWD, path, O_PATH | O_NOFOLLOW);
  if (!descriptor) return std::unexpected(descriptor.error());
  StandingObject object{std::move(*descriptor), {}, {}};
  auto entry = lookAtDescriptor(object.descriptor.get(), &object.device);
  if (!entry) return std::unexpected(entry.error());
  object.entry = std::move(*entry);
  const auto generation = generationOf(object.descriptor.get(), "");
  if (!generation) return std::unexpected(ENOENT);
  object.entry.generation = *generation;
  return object;
}

bool standsAt(const std::string& path, const ObjectID& object) {
  const auto found = objectStandingAt(path);
  return found && found->entry.object() == object;
}

}  // namespace vantrell::linuxos::catalog
