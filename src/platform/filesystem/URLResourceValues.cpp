#include "platform/filesystem/URLResourceValues.h"

#include <array>
#include <cerrno>

#include "platform/Services.h"

namespace vantrell {

Result<std::optional<FndURL::ResourceValue>> resourceValue(const FndURL& url,
                                                           FndURLResourceKey key) {
  if (auto known = url.cachedResourceValue(key)) return known;
  if (!url.isFileURL()) return std::unexpected(FndError::posix(EINVAL));
  const std::array keys = {key};
  if (auto read = platform::services().fileSystem->readResourceValues(url, keys); !read) {
    return std::unexpected(std::move(read.error()));
  }
  return url.cachedResourceValue(key);
}

}  // namespace vantrell
