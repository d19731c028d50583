#pragma once

#include <string>
#include <vector>

#include "linux/types/GlobTable.h"
#include "linux/types/MimeFiles.h"
#include "linux/types/PackageTypes.h"
#include "linux/types/StringMap.h"
#include "platform/foundation/Mutex.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// Where types are read from, the most important folders first.
struct TypeFolders {
  /// XDG data folders: "mime" and "vantrell/package-types" below each are read.
  std::vector<std::string> dataFolders;
  /// More folders with package declarations, less important than those.
  std::vector<std::string> packageTypeFolders;
};

/// The types of the installed shared MIME databases, by name alone, and the declared packages.
/// Without a database files are plain data; folders, packages and links are told apart all the
/// same.
///
/// Everything is read when it is made, but descriptions: each is read when it is first asked for.
///
/// Threads: all members may be called from any thread.
class SharedMimeTypes : public TypeRegistry {
 public:
  explicit SharedMimeTypes(const TypeFolders& folders);

  std::string typeIdentifierForName(std::string_view name, FileKind kind) const override;
  bool typeConformsTo(std::string_view type, std::string_view supertype) const override;
  std::string descriptionOfType(std::string_view type) const override;

  /// The folders in which a database was found.
  const std::vector<std::string>& databaseFolders() const { return _databaseFolders; }

 private:
  std::string_view canonicalType(std::string_view type) const;
  std::string readDescription(std::string_view type) const;

  std::vector<std::string> _databaseFolders;
  MimeDatabase _database;  // without its globs, which the table holds
  GlobTable _globs;
  PackageTypes _packages;
  mutable Mutex _mutex;
  mutable StringMap<std::string> _descriptions VANTRELL_GUARDED_BY(_mutex);
};

}  // namespace vantrell::linuxos
