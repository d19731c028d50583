#include "linux/catalog/SeenTable.h"

namespace vantrell::linuxos::catalog {

Result<std::optional<SeenPlace>> SeenTable::place(FileID fileID) {
  const auto row = _place.with(fileID).step();
  if (!row) return std::unexpected(row.error());
  if (!*row) return std::nullopt;
  SeenPlace place{_place.bits(0), std::string(_place.bytes(1))};
  _place.reset();
  return place;
}

Result<void> SeenTable::put(const ObjectID& object, const std::string& path) {
  return _put.with(object.fileID, object.generation, path).run();
}

}  // namespace vantrell::linuxos::catalog
