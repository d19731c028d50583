#pragma once

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <variant>
#include <vector>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndDate.h"
#include "platform/foundation/FndNumber.h"
#include "platform/foundation/Mutex.h"

namespace vantrell {

/// A property of a file that a URL object remembers once it has been read.
enum class FndURLResourceKey : std::uint8_t {
  ParentDirectoryURL,
  Name,
  LocalizedName,
  TypeIdentifier,
  FileSize,
  CreationDate,
  ContentModificationDate,
  IsReadable,
  IsWritable,
  IsDirectory,             ///< a directory, package or not; a link to one is none
  IsPackage,               ///< a directory that people see as one document
  FileResourceIdentifier,  ///< the file ID, a number
  DocumentIdentifier,      ///< the document ID, a number; absent while none is known
  ContentVersion,          ///< data that changes whenever the content does
};

/// The name of a key as log lines show it: "FndURLNameKey".
std::string_view resourceKeyName(FndURLResourceKey key);

/// Where something is. A handle to a shared object: copies share the resource values that have
/// been read through any of them, and an object never forgets a value by itself.
///
/// Paths are bytes as the file system has them. `fileURLWithPath` folds repeated and trailing
/// slashes and "." components; ".." stays, because it cannot be folded without asking the disk:
/// who takes paths from people makes them canonical first (`FileSystem::canonicalURL`).
///
/// Threads: all members may be called from any thread.
class FndURL {
 public:
  using ResourceValue = std::variant<std::string, FndNumber, FndDate, bool, FndData, FndURL>;

  /// `path` should be absolute; a relative one counts from "/".
  static FndURL fileURLWithPath(std::string_view path);
  /// Reads "file:///a%20b" or a URL of another scheme; none without a scheme, and for an escaped
  /// NUL in a path.
  static std::optional<FndURL> URLWithString(std::string_view text);

  bool isFileURL() const { return !_object->path.empty(); }
  /// Absolute, without trailing slash; empty for another scheme.
  const std::string& path() const { return _object->path; }
  /// True when a component is "..": where the path leads is then known to the disk alone.
  bool hasParentReference() const { return _object->hasParentReference; }
  /// The path with "." and ".." folded by its text alone.
  std::string standardizedPath() const;
  /// "/" for the root. The view lives as long as the URL object.
  std::string_view lastPathComponent() const;
  /// "/", then each component.
  std::vector<std::string> pathComponents() const;
  /// `component` may hold several components, and none of them is looked at.
  FndURL URLByAppendingPathComponent(std::string_view component) const;
  /// The root's parent is the root.
  FndURL URLByDeletingLastPathComponent() const;
  /// The whole URL, percent-escaped: "file:///a%20b".
  std::string description() const;

  /// What was remembered under `key`, else none. Never asks the disk.
  std::optional<ResourceValue> cachedResourceValue(FndURLResourceKey key) const;
  /// Remembers `value` for all who share this object.
  void setCachedResourceValue(FndURLResourceKey key, ResourceValue value) const;

  /// Equal when both name the same place, byte for byte.
  friend bool operator==(const FndURL& a, const FndURL& b);
  /// Ordered by path, bytewise, so that URLs can be keys.
  friend bool operator<(const FndURL& a, const FndURL& b);

 private:
  // Stands here so that a path costs no call: it is asked for once for each item and each root.
  struct Object {
    std::string path;  // of a file URL
    std::string text;  // of any other, the whole of it
    bool hasParentReference = false;
    Mutex mutex;
    std::vector<std::pair<FndURLResourceKey, ResourceValue>> values VANTRELL_GUARDED_BY(mutex);
  };
  explicit FndURL(std::shared_ptr<Object> object) : _object(std::move(object)) {}

  std::shared_ptr<Object> _object;
};

/// `bytes` with whatever is not well-formed UTF-8, and every control character, written as
/// "\xNN": what a terminal or a log line may show of a name.
std::string displayText(std::string_view bytes);

}  // namespace vantrell
