#pragma once

#include <string>
#include <string_view>

namespace vantrell {

inline constexpr std::string_view kFolderTypeIdentifier = "inode/directory";
inline constexpr std::string_view kSymbolicLinkTypeIdentifier = "inode/symlink";
/// Every package's type conforms to this one, and not to the folder type.
inline constexpr std::string_view kPackageTypeIdentifier = "application/x-vantrell-package";
/// What a file is when nothing is known about it.
inline constexpr std::string_view kDataTypeIdentifier = "application/octet-stream";

/// What a file-system object is made as, before anybody asks what it contains.
enum class FileKind : std::uint8_t {
  RegularFile,
  Directory,
  SymbolicLink,
  Fifo,
  Socket,
  CharacterDevice,
  BlockDevice,
};

/// Names kinds of content: MIME types, with the packages' own.
///
/// Threads: all members may be called from any thread; they answer from memory.
class TypeRegistry {
 public:
  virtual ~TypeRegistry() = default;

  /// The type of an object of that name and kind, by its name alone. A directory is a package
  /// when its extension is a declared one, else a folder.
  virtual std::string typeIdentifierForName(std::string_view name, FileKind kind) const = 0;

  /// True when `type` is `supertype`, or comes under it. Aliases count as what they stand for.
  virtual bool typeConformsTo(std::string_view type, std::string_view supertype) const = 0;

  /// A description for people; the type itself when there is none.
  virtual std::string descriptionOfType(std::string_view type) const = 0;
};

}  // namespace vantrell
