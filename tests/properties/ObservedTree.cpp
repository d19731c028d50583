#include "ObservedTree.h"

#include <dirent.h>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/sysmacros.h>
#include <sys/xattr.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <memory>
#include <span>

namespace vantrell::properties {
namespace {

constexpr std::string_view kAttributePrefix = "user.";

[[noreturn]] void giveUp(const std::string& what, const std::string& path) {
  std::fprintf(stderr, "the test itself is wrong: %s: %s\n", what.c_str(), shown(path).c_str());
  std::abort();
}

std::vector<std::string> namesIn(const std::string& folder) {
  std::unique_ptr<DIR, int (*)(DIR*)> stream(::opendir(folder.c_str()), &::closedir);
  if (!stream) giveUp("cannot list", folder);
  std::vector<std::string> names;
  while (const dirent* entry = ::readdir(stream.get())) {
    const std::string name = entry->d_name;
    if (name != "." && name != "..") names.push_back(name);
  }
  std::sort(names.begin(), names.end());
  return names;
}

FileKind kindOfMode(std::uint16_t mode) {
  switch (mode & S_IFMT) {
    case S_IFDIR:
      return FileKind::Directory;
    case S_IFLNK:
      return FileKind::SymbolicLink;
    case S_IFIFO:
      return FileKind::Fifo;
    case S_IFSOCK:
      return FileKind::Socket;
    case S_IFCHR:
      return FileKind::CharacterDevice;
    case S_IFBLK:
      return FileKind::BlockDevice;
    default:
      return FileKind::RegularFile;
  }
}

std::int64_t nanoseconds(const statx_timestamp& time) {
  return time.tv_sec * 1'000'000'000 + time.tv_nsec;
}

std::string nameOf(const std::string& path) { return path.substr(path.rfind('/') + 1); }

}  // namespace

bool isPackageName(std::string_view name) { return name.ends_with(".tessera"); }

linuxos::SeenObject seeObject(const std::string& path) {
  struct statx status = {};
  if (::statx(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS, &status) != 0) {
    giveUp("cannot see", path);
  }
  linuxos::SeenObject object;
  object.path = path;
  object.kind = kindOfMode(status.stx_mode);
  object.isPackage = object.kind == FileKind::Directory && isPackageName(nameOf(path));
  object.fileID = FileID{status.stx_ino};
  object.device =
      DeviceID{static_cast<std::uint32_t>(makedev(status.stx_dev_major, status.stx_dev_minor))};
  object.size = status.stx_size;
  object.modifiedNanoseconds = nanoseconds(status.stx_mtime);
  object.changedNanoseconds = nanoseconds(status.stx_ctime);
  return object;
}

Attributes readAttributes(const std::string& path) {
  std::array<char, 4096> names{};
  const ssize_t length = ::llistxattr(path.c_str(), names.data(), names.size());
  Attributes attributes;
  for (ssize_t at = 0; at < length;) {
    const std::string name = names.data() + at;
    at += static_cast<ssize_t>(name.size()) + 1;
    if (!name.starts_with(kAttributePrefix)) continue;
    std::array<char, 4096> value{};
    const ssize_t size = ::lgetxattr(path.c_str(), name.c_str(), value.data(), value.size());
    if (size < 0) giveUp("cannot read an attribute", path);
    attributes.emplace(name.substr(kAttributePrefix.size()),
                       std::string(value.data(), static_cast<std::size_t>(size)));
  }
  return attributes;
}

std::string shown(std::string_view path) {
  std::string text;
  for (const char character : path) {
    const auto byte = static_cast<unsigned char>(character);
    if (byte >= 0x20 && byte < 0x7f) {
      text += character;
    } else {
      std::array<char, 8> escape{};
      std::snprintf(escape.data(), escape.size(), "\\x%02x", byte);
      text += escape.data();
    }
  }
  return text;
}

bool ObjectRegistry::made(const std::string& path) {
  const linuxos::SeenObject object = seeObject(path);
  const bool reused =
      !_objects.insert_or_assign(object.fileID.value, ObjectNumber{++_newest}).second;
  if (object.kind == FileKind::Directory) {
    for (const std::string& name : namesIn(path)) made(path + "/" + name);
  }
  return reused;
}

ObjectNumber ObjectRegistry::objectOf(std::uint64_t fileNumber) const {
  const auto found = _objects.find(fileNumber);
  if (found == _objects.end()) giveUp("unknown object", std::to_string(fileNumber));
  return found->second;
}

struct ObservedTree::Folder {
  std::string path;
  ObjectNumber object;
  Standing standing;
  bool isRoot;
};

ObservedTree ObservedTree::observe(const ObjectRegistry& registry, const std::string& root,
                                   const std::string& outside) {
  ObservedTree tree;
  tree._root = registry.objectOf(seeObject(root).fileID.value);
  tree.walk(registry, {root, tree._root, Standing::Shown, true});
  tree.walk(registry, {outside, registry.objectOf(seeObject(outside).fileID.value),
                       Standing::OutsideRoots, true});
  return tree;
}

namespace {

/// A library's trash is the one hidden thing that is shown.
bool isTrash(const std::string& folderPath, bool folderIsRoot, const std::string& name,
             FileKind kind) {
  return name == ".Trash" && kind == FileKind::Directory &&
         (folderIsRoot || nameOf(folderPath) == "Documents");
}

}  // namespace

void ObservedTree::walk(const ObjectRegistry& registry, const Folder& folder) {
  for (const std::string& name : namesIn(folder.path)) {
    Place place;
    place.seen = seeObject(folder.path + "/" + name);
    place.object = registry.objectOf(place.seen.fileID.value);
    place.home = Home{folder.object, name};
    place.attributes = readAttributes(place.path());
    place.standing = folder.standing;
    const bool hidden =
        name.starts_with(".") && !(folder.standing == Standing::Shown &&
                                   isTrash(folder.path, folder.isRoot, name, place.seen.kind));
    if (hidden && folder.standing != Standing::OutsideRoots) place.standing = Standing::Hidden;
    const Folder below{place.path(), place.object,
                       place.seen.isPackage && place.standing == Standing::Shown
                           ? Standing::InsidePackage
                           : place.standing,
                       false};
    const bool isDirectory = place.seen.kind == FileKind::Directory;
    add(std::move(place));
    if (isDirectory) walk(registry, below);
  }
}

void ObservedTree::add(Place place) {
  const std::size_t index = _places.size();
  _byHome.emplace(place.home, index);
  _byObject.emplace(place.object, index);
  _byFileID.emplace(place.seen.fileID.value, place.object);
  _places.push_back(std::move(place));
}

const Place* ObservedTree::at(const Home& home) const {
  const auto found = _byHome.find(home);
  return found == _byHome.end() ? nullptr : &_places[found->second];
}

std::vector<const Place*> ObservedTree::placesOf(ObjectNumber object) const {
  std::vector<const Place*> places;
  const auto [first, last] = _byObject.equal_range(object);
  for (auto it = first; it != last; ++it) places.push_back(&_places[it->second]);
  return places;
}

ObjectNumber ObservedTree::objectWithFileID(FileID fileID) const {
  const auto found = _byFileID.find(fileID.value);
  return found == _byFileID.end() ? ObjectNumber{} : found->second;
}

}  // namespace vantrell::properties
