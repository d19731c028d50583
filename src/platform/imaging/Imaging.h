#pragma once

#include <memory>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"

namespace vantrell {

/// A decoded picture.
class Image {
 public:
  virtual ~Image() = default;
};

/// Decodes and encodes pictures within bounds of memory and time.
///
/// Threads: all members may be called from any thread.
class Imaging {
 public:
  virtual ~Imaging() = default;
  /// Reads the icon bitmap that the application registry hands out. Errors: DamagedData.
  virtual Result<std::unique_ptr<Image>> imageFromIconBitmap(FndDataView bytes) = 0;
  /// Appends the picture to `buffer` as one PNG. Errors: POSIX.
  virtual Result<void> appendPNG(const Image& image, FndData& buffer) = 0;
};

}  // namespace vantrell
