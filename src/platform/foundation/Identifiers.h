#pragma once

#include <compare>
#include <cstdint>
#include <functional>

namespace vantrell {

/// The file system's number of one object on its volume (an inode number). 0 names none.
struct FileID {
  std::uint64_t value = 0;
  auto operator<=>(const FileID&) const = default;
};

/// The number of a document, kept when an application saves it by replacing its file. 0 names none.
struct DocumentID {
  std::uint32_t value = 0;
  auto operator<=>(const DocumentID&) const = default;
};

/// The volume that holds a path, for as long as it stays mounted. 0 names none.
struct DeviceID {
  std::uint32_t value = 0;
  auto operator<=>(const DeviceID&) const = default;
};

/// The place of an event in the history of the file system. They only grow.
struct EventID {
  std::uint64_t value = 0;
  auto operator<=>(const EventID&) const = default;
};

}  // namespace vantrell

template <>
struct std::hash<vantrell::FileID> {
  std::size_t operator()(const vantrell::FileID& id) const noexcept {
    return std::hash<std::uint64_t>()(id.value);
  }
};
