#pragma once

#include <sys/stat.h>

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "linux/FileDescriptor.h"
#include "linux/catalog/Comparison.h"
#include "linux/filesystem/Places.h"
#include "platform/foundation/Identifiers.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos::catalog {

/// What decides which entries of a folder are catalogued, and as what.
struct FolderRules {
  const TypeRegistry& types;
  DeviceID device;            ///< entries on other volumes are left out
  bool mayHoldTrash = false;  ///< its ".Trash" is catalogued
  bool isInsidePackage = false;
};

/// Reads one folder: the entries that are catalogued, in pieces of bounded size.
///
/// Threads: use each from one thread at a time.
/// Lifetime: borrows the descriptor and the type registry.
class FolderReader {
 public:
  /// `folder` is open for reading and stands at its beginning.
  FolderReader(int folder, const FolderRules& rules);

  /// The next entries, at least `limit` of them unless the folder ends; none at its end. Sorted
  /// by name within one piece. Names that vanish meanwhile are left out.
  OsResult<std::vector<Entry>> next(std::size_t limit);

  /// Looks at one name, as if it had been read; none when nothing that is catalogued stands there.
  OsResult<std::optional<Entry>> lookAt(const std::string& name) const;

 private:
  bool isCatalogued(std::string_view name) const;

  int _folder;
  FolderRules _rules;
  std::vector<char> _buffer;  // what one call of the kernel's gives
};

/// The folder itself, by an open descriptor (O_PATH will do), without its generation.
OsResult<Entry> lookAtDescriptor(int descriptor, DeviceID* device);

/// The nanoseconds since 1970 on the clock that file systems stamp changes with.
std::int64_t nowNanoseconds();

}  // namespace vantrell::linuxos::catalog
