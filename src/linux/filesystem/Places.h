#pragma once

#include <expected>
#include <string>
#include <string_view>

#include "linux/FileDescriptor.h"

namespace vantrell::linuxos {

/// What a system call gave, or its errno value.
template <class T>
using OsResult = std::expected<T, int>;

/// Opens what stands at `path`, absolute or below `folder`, with `flags` of open(2). No symbolic
/// link is followed anywhere: one in the way is ELOOP, and one at the end is opened itself when
/// `flags` hold O_PATH and O_NOFOLLOW. A path may be longer than the kernel takes at once.
OsResult<FileDescriptor> openWithoutLinks(int folder, std::string_view path, int flags);

/// Where an object is, held by its folder so that what is done next cannot be led elsewhere.
struct Place {
  FileDescriptor folder;  ///< opened with O_PATH
  std::string_view name;  ///< ends in NUL; "." for the root. A view of the path it came from
};

/// Opens the folder of an absolute path that ends in NUL.
OsResult<Place> placeOf(const std::string& path);

}  // namespace vantrell::linuxos
