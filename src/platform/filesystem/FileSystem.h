#pragma once

#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string_view>

#include "platform/filesystem/OpenFile.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// What a directory enumeration leaves out; combined as bits.
enum DirectoryEnumerationOptions : std::uint8_t {
  kSkipsSubdirectoryDescendants = 1,
  kSkipsPackageDescendants = 2,
  kSkipsHiddenFiles = 4,
};

/// Asked when an entry cannot be read; true continues the enumeration.
using DirectoryErrorHandler = std::function<bool(const FndURL&, const FndError&)>;

/// The entries below one folder, in the order of the disk. An entry comes before what lies below
/// it. Memory stays flat: it grows with the depth, not with the number of entries.
///
/// Threads: use each from one thread at a time.
class DirectoryEnumerator {
 public:
  virtual ~DirectoryEnumerator() = default;
  /// The next entry with the prefetched values in its cache; none at the end, or once the error
  /// handler has answered false.
  virtual std::optional<FndURL> next() = 0;
};

/// The status of an object.
struct FileStatus {
  FileID fileID;
  /// For a folder: the number of its entries that are listed, plus 2, on every file system.
  std::uint64_t linkCount;
};

/// Files and folders by their place. Paths come in canonical form (`canonicalURL`): a component
/// that has become a symbolic link in the meantime is an error (ELOOP), never a way out.
///
/// Errors of all members: POSIX, but reads of what is not there answer the foundation's
/// FileReadNoSuchFile (260) where said so.
/// Threads: all members may be called from any thread.
class FileSystem {
 public:
  virtual ~FileSystem() = default;

  /// Reads the values of `keys` afresh into the URL's cache. A key that has no value for this
  /// object is left out. Errors: 260 when nothing is there, else POSIX.
  virtual Result<void> readResourceValues(const FndURL& url,
                                          std::span<const FndURLResourceKey> keys) = 0;

  virtual Result<std::unique_ptr<OpenFile>> open(const FndURL& url, OpenMode mode) = 0;

  /// Follows a link at the end of the path.
  virtual Result<FileStatus> status(const FndURL& url) = 0;

  /// Errors (of the folder itself): 260, POSIX. Errors below it go to `errorHandler`.
  virtual Result<std::unique_ptr<DirectoryEnumerator>> enumerateDirectory(
      const FndURL& folder, std::span<const FndURLResourceKey> prefetchedKeys, std::uint8_t options,
      DirectoryErrorHandler errorHandler) = 0;

  /// Creates the folder and those above it that are missing; one that exists is no failure.
  virtual Result<void> createDirectory(const FndURL& url) = 0;

  /// The bytes of all files below a directory, links not followed.
  virtual Result<std::uint64_t> recursiveSizeOfDirectory(const FndURL& url) = 0;

  /// The same place without "..", and without links in the folders that lead to it; a link at
  /// the end stays. What does not exist at the end may be missing, its folder may not.
  virtual Result<FndURL> canonicalURL(const FndURL& url) = 0;
};

/// Extended attributes by place. Names are exact; an adapter adds what a system wants in front.
/// A link at the end of the path is not followed. Errors: POSIX; ENODATA for no such attribute.
///
/// Threads: all members may be called from any thread.
class ExtendedAttributes {
 public:
  virtual ~ExtendedAttributes() = default;
  /// The size of the attribute's value in bytes.
  virtual Result<std::size_t> sizeOfAttribute(const FndURL& url, std::string_view name) = 0;
  /// Copies the value into `buffer` and says how many bytes it has. ERANGE when it has grown.
  virtual Result<std::size_t> copyAttribute(const FndURL& url, std::string_view name,
                                            std::span<std::uint8_t> buffer) = 0;
};

}  // namespace vantrell
