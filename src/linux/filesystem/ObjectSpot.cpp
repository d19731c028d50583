#include "linux/filesystem/ObjectSpot.h"

#include <cerrno>
#include <utility>

namespace vantrell::linuxos {

OsResult<ObjectSpot> ObjectSpot::of(const FndURL& url) {
  ObjectSpot spot;
  spot._entry = EntryInHand::find(url);
  if (spot._entry != nullptr) return spot;
  if (!url.isFileURL()) return std::unexpected(EINVAL);
  auto place = placeOf(url.path());
  if (!place) return std::unexpected(place.error());
  spot._place = std::move(*place);
  return spot;
}

}  // namespace vantrell::linuxos
