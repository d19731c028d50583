#pragma once

#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// One object as `statx` has just shown it, and the canonical path it was seen at.
struct SeenObject {
  std::string path;
  FileKind kind = FileKind::RegularFile;
  bool isPackage = false;
  FileID fileID;
  DeviceID device;
  std::uint64_t size = 0;
  std::int64_t modifiedNanoseconds = 0;  ///< since 1970
  std::int64_t changedNanoseconds = 0;   ///< ctime, since 1970
};

/// What the file system and volume services ask of the catalog and the documents table.
///
/// Threads: all members may be called from any thread.
class FileIndex {
 public:
  virtual ~FileIndex() = default;

  /// The path of the object of that number, checked on the disk. Errors: POSIX; ENOENT when
  /// nothing known has it.
  virtual Result<std::string> pathForFileID(FileID fileID) = 0;

  /// How many entries of the folder are catalogued; none for a folder that is not.
  virtual std::optional<std::uint64_t> entryCountOfFolder(FileID folder) = 0;

  /// The ID of the document that the object stands for; 0 when it has none. Never allocates.
  virtual DocumentID documentIDOfObject(const SeenObject& object) = 0;

  /// The IDs of these documents, in order; new ones, made durable in one step, for those that
  /// have none. All must lie in the folder `folder`. Errors: POSIX (the database's, translated).
  virtual Result<std::vector<DocumentID>> documentIDsOfObjects(
      FileID folder, std::span<const SeenObject> documents) = 0;

  /// The file that stands for the document now. Errors: POSIX; ENOENT when it is gone or unknown.
  virtual Result<FileID> fileIDOfDocument(DocumentID documentID) = 0;

  /// Remembers where an object that is not catalogued (hidden, or inside a package) was seen,
  /// so that the file ID just handed out for it can be resolved.
  virtual void noteSeen(const SeenObject& object) = 0;

  /// Says that an attribute of the object was set, or removed (no value), through this process.
  virtual void noteAttribute(FileID fileID, std::string_view name,
                             std::optional<FndDataView> value) = 0;
};

/// True for the attributes that a document keeps when its file is replaced: names (without the
/// "user." prefix) that end in "#PS", and the tags.
inline bool isKeptAcrossSafeSave(std::string_view attributeName) {
  return attributeName.ends_with("#PS") || attributeName == "com.quillon.metadata:_kMDItemUserTags";
}

}  // namespace vantrell::linuxos
