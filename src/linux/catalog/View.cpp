#include "linux/catalog/View.h"

#include <algorithm>

#include "linux/catalog/Names.h"

namespace vantrell::linuxos::catalog {

namespace {

bool isVisibleBelow(const std::string& root, std::string_view path) {
  if (!path.starts_with(root)) return false;
  std::string_view rest = path.substr(root.size());
  if (!rest.empty() && !root.ends_with('/') && !rest.starts_with('/')) return false;
  while (!rest.empty()) {
    const std::size_t start = rest.find_first_not_of('/');
    if (start == std::string_view::npos) break;
    const std::size_t end = std::min(rest.find('/', start), rest.size());
    const std::string_view name = rest.substr(start, end - start);
    if (isHiddenName(name) && name != kTrashFolderName) return false;
    rest.remove_prefix(end);
  }
  return true;
}

}  // namespace

bool View::isOutOfView(std::string_view path) const {
  return std::ranges::none_of(
      roots, [&](const RootRecord& root) { return isVisibleBelow(root.path, path); });
}

}  // namespace vantrell::linuxos::catalog
