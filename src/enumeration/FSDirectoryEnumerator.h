#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <vector>

#include "platform/filesystem/FileSystem.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// Lists the entries below one or more root folders as one sequence, from an offset and up to a
/// limit. Hidden files and the contents of packages are never listed.
///
/// Threads: use each from one thread at a time.
struct FSDirectoryEnumerator {
  /// Takes one entry. True keeps going; the answer is looked at when a root is at its end, so
  /// that false lets the root in work be finished. An error ends the call at once.
  using Handler = std::function<Result<bool>(const FndURL&)>;
  /// Options of `DirectoryEnumerationOptions` for one root, or none for the usual ones.
  using OptionsForRoot = std::function<std::optional<std::uint8_t>(const FndURL&)>;

  std::vector<FndURL> urls;  ///< the roots, listed in this order
  bool recursively = false;  ///< entries below subfolders too
  std::uint64_t offset = 0;  ///< entries passed over first, counted over all roots together
  std::uint64_t limit = 0;   ///< most entries handed to the handler
  DirectoryErrorHandler errorHandler;
  OptionsForRoot directoryEnumerationOptionsFor;  ///< may be empty

  /// Hands the entries to `handler` and returns how many were counted, passed over or handed
  /// out; 0 without roots or with limit 0. A root that cannot be opened is logged and left out.
  /// Errors: the handler's.
  Result<std::uint64_t> enumerate(const Handler& handler) const;
};

/// Logs the entry that cannot be read, and goes on.
bool standardDirectoryErrorHandler(const FndURL& url, const FndError& error);

}  // namespace vantrell
