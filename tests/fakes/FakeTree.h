#pragma once

#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/foundation/FndDate.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/Identifiers.h"
#include "platform/types/TypeRegistry.h"
#include "tests/fakes/FakeFaults.h"

namespace vantrell {

/// One object of the fake disk. Names belong to the folders that hold it: an object may have
/// several.
struct FakeNode {
  FileID fileID;
  FileKind kind = FileKind::RegularFile;
  DeviceID device;
  unsigned mode = 0700;  ///< the owner's bits, and the caller is the owner
  FndData content;
  std::string linkTarget;
  FndDate created = FndDate::fromUnixTime(1'700'000'000);
  FndDate modified = FndDate::fromUnixTime(1'700'000'000);
  DocumentID documentID;
  std::map<std::string, FndData, std::less<>> attributes;
  std::vector<std::pair<std::string, std::shared_ptr<FakeNode>>> entries;  ///< in disk order

  bool isReadable() const { return (mode & 0400) != 0; }
  bool isWritable() const { return (mode & 0200) != 0; }
  bool isSearchable() const { return (mode & 0100) != 0; }
};

/// A disk in memory: the state behind the fake file system, attributes, volumes and documents.
/// The caller is an ordinary user who owns everything on it.
///
/// The verbs for tests throw std::logic_error when they make no sense; the queries for fakes
/// answer errno values.
///
/// Threads: any; `mutex` is held around each look and each change.
class FakeTree {
 public:
  using Node = std::shared_ptr<FakeNode>;  // shared: hard links, and files that are open
  enum class FinalLink { Stay, Follow };

  static constexpr DeviceID kDevice{42};

  FakeTree();

  // What tests do. Folders on the way are made.
  void makeFolder(std::string_view path);
  void writeFile(std::string_view path, std::string_view content = "");
  void makeLink(std::string_view path, std::string_view target);
  void makeSpecial(std::string_view path, FileKind kind);
  void makeHardLink(std::string_view existing, std::string_view path);
  void move(std::string_view from, std::string_view to);
  void remove(std::string_view path);
  /// A save that puts a new object in the place of the file, as careful applications do: the
  /// document ID goes over, and the attributes that are kept.
  void saveByReplacing(std::string_view path, std::string_view content);
  void setMode(std::string_view path, unsigned mode);
  /// What is at and below `path` lies on that volume from now on.
  void mount(std::string_view path, DeviceID device);
  void setAttribute(std::string_view path, std::string_view name, FndData value);
  std::optional<FndData> attribute(std::string_view path, std::string_view name);
  FileID fileID(std::string_view path);
  DocumentID documentID(std::string_view path);

  /// No object has a value for this key any more.
  void withholdResource(FndURLResourceKey key);
  /// The object at that path has this value, whatever it is.
  void setResource(std::string_view path, FndURLResourceKey key, FndURL::ResourceValue value);
  void setLinkCount(std::string_view path, std::uint64_t count);
  /// How many bytes of attributes, names included, an object can carry.
  void setAttributeCapacity(std::size_t bytes);

  FakeFaults faults;

  // What the other fakes ask. Errors: POSIX.
  Result<Node> find(std::string_view path, FinalLink finalLink = FinalLink::Stay);
  /// The path without links in its folders and without "..".
  Result<std::string> realPath(std::string_view path);
  Result<std::string> pathOf(DeviceID device, FileID fileID);
  Node nodeOfDocument(DocumentID documentID);
  Node create(Node folder, std::string_view name, FileKind kind);
  DocumentID allocateDocumentID(FakeNode& node);
  std::size_t attributeCapacity() const { return _attributeCapacity; }
  bool isWithheld(FndURLResourceKey key) const { return _withheld.contains(key); }
  std::optional<FndURL::ResourceValue> givenResource(const std::string& path,
                                                     FndURLResourceKey key) const;
  std::optional<std::uint64_t> givenLinkCount(const std::string& path) const;

  std::recursive_mutex mutex;

 private:
  Node need(std::string_view path);
  Node makeAt(std::string_view path, FileKind kind);
  Node takeOut(std::string_view path);

  Node _root;
  std::uint64_t _nextFileID = 2;
  std::uint32_t _nextDocumentID = 1;
  std::size_t _attributeCapacity = 4000;
  std::set<FndURLResourceKey> _withheld;
  std::map<std::pair<std::string, FndURLResourceKey>, FndURL::ResourceValue> _given;
  std::map<std::string, std::uint64_t> _linkCounts;
};

/// "/a/b/c" as "/a/b" and "c".
std::pair<std::string, std::string> splitFakePath(std::string_view path);

/// The entry of that name, or null.
FakeTree::Node entryOf(const FakeNode& folder, std::string_view name);

}  // namespace vantrell
