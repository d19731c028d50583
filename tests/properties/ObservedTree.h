#pragma once

#include <compare>
#include <cstdint>
#include <map>
#include <string>
#include <string_view>
#include <unordered_map>
#include <utility>
#include <vector>

#include "linux/catalog/FileIndex.h"

namespace vantrell::properties {

/// One object that a test made. The file system's own numbers come back for other objects; these
/// do not, which is how the test knows what the catalog has to find out. 0 is none.
struct ObjectNumber {
  std::uint32_t value = 0;
  auto operator<=>(const ObjectNumber&) const = default;
};

/// The folder and the name that something stands under. The folder counts, not its path: a
/// home moves with its folder.
struct Home {
  ObjectNumber folder;
  std::string name;
  auto operator<=>(const Home&) const = default;
};

/// Whether a listing may show what stands at a place.
enum class Standing : std::uint8_t { Shown, InsidePackage, Hidden, OutsideRoots };

using Attributes = std::map<std::string, std::string>;

/// One name of one object.
struct Place {
  Home home;
  ObjectNumber object;
  Standing standing = Standing::Shown;
  linuxos::SeenObject seen;
  Attributes attributes;  ///< those of the user namespace, without its prefix

  const std::string& path() const { return seen.path; }
  bool isFolder() const { return seen.kind == FileKind::Directory && !seen.isPackage; }
  bool isDocumentKind() const { return seen.isPackage || seen.kind == FileKind::RegularFile; }
  /// True for what has to have a document ID when it is asked for one.
  bool isDocument() const { return standing == Standing::Shown && isDocumentKind(); }
};

/// Which of the test's objects has a file number now.
///
/// Threads: use from one thread. Lifetime: as long as the folder that it describes.
class ObjectRegistry {
 public:
  /// Says that the object at `path`, and everything below it, has just been made. True when
  /// its file number had been another object's.
  bool made(const std::string& path);
  /// The object with that number; ends the test for one that was never said to be made.
  ObjectNumber objectOf(std::uint64_t fileNumber) const;

 private:
  std::unordered_map<std::uint64_t, ObjectNumber> _objects;
  std::uint32_t _newest = 0;
};

/// What the disk holds at one moment, found without the catalog's help.
///
/// Threads: a value. Lifetime: its own; it does not follow the disk.
class ObservedTree {
 public:
  /// Walks the storage root and a folder beside it that is not recorded.
  static ObservedTree observe(const ObjectRegistry& registry, const std::string& root,
                              const std::string& outside);

  const std::vector<Place>& places() const { return _places; }
  /// What stands there; null for nothing.
  const Place* at(const Home& home) const;
  std::vector<const Place*> placesOf(ObjectNumber object) const;
  /// The object with that file number now; none (0) when nothing has it.
  ObjectNumber objectWithFileID(FileID fileID) const;
  ObjectNumber root() const { return _root; }

 private:
  struct Folder;
  void walk(const ObjectRegistry& registry, const Folder& folder);
  void add(Place place);

  std::vector<Place> _places;
  std::map<Home, std::size_t> _byHome;
  std::multimap<ObjectNumber, std::size_t> _byObject;
  std::unordered_map<std::uint64_t, ObjectNumber> _byFileID;
  ObjectNumber _root;
};

/// `statx` of that path as the catalog's callers fill it in. Ends the test when it is not there.
linuxos::SeenObject seeObject(const std::string& path);

/// The attributes of the user namespace, without its prefix.
Attributes readAttributes(const std::string& path);

/// The path with what is not plain text shown as "\xNN", for messages.
std::string shown(std::string_view path);

/// True for folder names that make a package.
bool isPackageName(std::string_view name);

}  // namespace vantrell::properties
