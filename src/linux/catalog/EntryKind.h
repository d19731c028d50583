#pragma once

#include <cstdint>

#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos::catalog {

/// What an entry is, as one small number that the database keeps:
///
///     bits 0..3   the `FileKind`
///     bit  4      a directory that is a package
///     bit  5      lies inside a package
///     bit  6      changed so shortly before it was looked at that the same time stamp may hide a
///                 later change; the next look asks for the generation whatever the stamps say
struct EntryKind {
  static constexpr std::uint32_t kFileKindBits = 15;
  static constexpr std::uint32_t kPackage = 16;
  static constexpr std::uint32_t kInsidePackage = 32;
  static constexpr std::uint32_t kRecent = 64;

  std::uint32_t bits = 0;

  static EntryKind of(FileKind kind) { return {static_cast<std::uint32_t>(kind)}; }

  bool isDirectory() const {
    return (bits & kFileKindBits) == static_cast<std::uint32_t>(FileKind::Directory);
  }
  bool isPackage() const { return (bits & kPackage) != 0; }
  bool isInsidePackage() const { return (bits & kInsidePackage) != 0; }
  bool isRecent() const { return (bits & kRecent) != 0; }
  /// A regular file or a package, and not a part of one.
  bool isDocument() const {
    const bool isFile = (bits & kFileKindBits) == static_cast<std::uint32_t>(FileKind::RegularFile);
    return (isFile || isPackage()) && !isInsidePackage();
  }
  EntryKind with(std::uint32_t flag) const { return {bits | flag}; }
  EntryKind without(std::uint32_t flag) const { return {bits & ~flag}; }

  bool operator==(const EntryKind&) const = default;
};

/// `EntryKind::isDocument` of a column "kind", for statements.
#define VANTRELL_SQL_IS_DOCUMENT "((kind & 32) = 0 AND ((kind & 15) = 0 OR (kind & 16) <> 0))"
/// `EntryKind::isDirectory` of a column "kind"; the partial index is used for these words only.
#define VANTRELL_SQL_IS_DIRECTORY "((kind & 15) = 1)"

static_assert(static_cast<int>(FileKind::RegularFile) == 0);
static_assert(static_cast<int>(FileKind::Directory) == 1);

}  // namespace vantrell::linuxos::catalog
