#include "tests/fakes/FakeDirectoryEnumerator.h"

#include <cerrno>
#include <stdexcept>
#include <utility>

#include "tests/fakes/FakeResources.h"

namespace vantrell {

FakeDirectoryEnumerator::FakeDirectoryEnumerator(FakeTree& tree, const TypeRegistry& types,
                                                 FakeTree::Node folder, std::string path,
                                                 std::vector<FndURLResourceKey> keys,
                                                 std::uint8_t options,
                                                 DirectoryErrorHandler errorHandler)
    : _tree(tree),
      _types(types),
      _keys(std::move(keys)),
      _options(options),
      _errorHandler(std::move(errorHandler)) {
  if (options > 7) throw std::logic_error("these enumeration options are not modelled");
  // The one look at an entry tells these as well.
  _keys.insert(_keys.end(),
               {FndURLResourceKey::IsDirectory, FndURLResourceKey::IsPackage,
                FndURLResourceKey::FileResourceIdentifier, FndURLResourceKey::DocumentIdentifier,
                FndURLResourceKey::ContentVersion});
  _levels.push_back({std::move(folder), std::move(path)});
}

void FakeDirectoryEnumerator::report(const FndURL& url, const FndError& error) {
  const bool goesOn = _errorHandler && _errorHandler(url, error);
  if (!goesOn) _levels.clear();
}

void FakeDirectoryEnumerator::descend(const FakeTree::Node& node, const FndURL& url) {
  if (node->kind != FileKind::Directory || (_options & kSkipsSubdirectoryDescendants) != 0) {
    return;
  }
  const bool isPackage = isFakePackage(_types, *node, url.lastPathComponent());
  if (isPackage && (_options & kSkipsPackageDescendants) != 0) return;
  if (!node->isReadable()) return report(url, FndError::posix(EACCES));
  _levels.push_back({node, url.path()});
}

std::optional<FndURL> FakeDirectoryEnumerator::next() {
  const std::lock_guard lock(_tree.mutex);
  while (!_levels.empty()) {
    Level& level = _levels.back();
    if (level.position == level.folder->entries.size()) {
      _levels.pop_back();
      continue;
    }
    const auto [name, node] = level.folder->entries[level.position++];
    if (name.starts_with('.') && (_options & kSkipsHiddenFiles) != 0) continue;
    const FndURL url = FndURL::fileURLWithPath(level.path + "/" + name);
    if (const auto error = _tree.faults.next(FakeCall::NextEntry, url.path())) {
      report(url, *error);
      continue;
    }
    cacheFakeResources(_tree, _types, *node, url, _keys);
    descend(node, url);
    return url;
  }
  return std::nullopt;
}

}  // namespace vantrell
