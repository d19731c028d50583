#pragma once

#include <functional>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <vector>

#include "linux/filesystem/ObjectStatus.h"

namespace vantrell::linuxos {

/// One entry of a folder.
struct WalkEntry {
  std::string_view name;  ///< ends in NUL
  int osError = 0;        ///< errno value of a look that failed: the rest says nothing then
  ObjectStatus status;
  std::int64_t nextPosition = 0;  ///< where the folder is read on after this entry
  bool isPackage = false;         ///< left to the preparer
  DocumentID documentID;          ///< left to the preparer
};

/// The folder that the walk is in.
struct WalkFolder {
  std::shared_ptr<const FileDescriptor> descriptor;  // shared with the entries given from it
  ObjectStatus status;
  std::string_view path;
};

/// What of a tree is walked.
struct WalkOptions {
  bool skipsHidden = false;    ///< names that begin with "."
  bool entersFolders = false;  ///< goes below subfolders, never onto another volume
  bool entersPackages = false;
};

/// Everything below a folder, each entry before what lies below it, each folder in the order in
/// which the disk gives it. Works at any depth: it keeps a few folders open and a piece of each,
/// and finds its way back to the others; nothing is put on the stack.
///
/// Threads: use each from one thread at a time.
class TreeWalk {
 public:
  /// Completes the entries of a folder that have just been read, before any of them is given.
  using Preparer = std::function<void(const WalkFolder&, std::span<WalkEntry>)>;
  /// Told of what cannot be read; false ends the walk.
  using ErrorHandler = std::function<bool(const std::string& path, int osError)>;

  /// `folder` is opened for reading and stands at `path`.
  TreeWalk(FileDescriptor folder, std::string path, WalkOptions options, Preparer preparer,
           ErrorHandler errorHandler);

  /// The next entry, good until the next call; null at the end.
  const WalkEntry* next();
  /// The folder of the entry given last.
  WalkFolder folder() const;

 private:
  struct Level {
    std::shared_ptr<const FileDescriptor> descriptor;  // null while it is closed to save it
    ObjectStatus status;
    std::size_t pathLength = 0;
    std::int64_t position = 0;  // behind the entry given last
    std::vector<char> names;    // the bytes that the entries' names are views of
    std::vector<WalkEntry> entries;
    std::size_t given = 0;
  };

  bool readMore(Level& level);
  void takeEntries(Level& level, std::size_t size);
  bool shouldEnter(const WalkEntry& entry) const;
  void enter(const WalkEntry& entry);
  void push(FileDescriptor descriptor, const ObjectStatus& status);
  void leave();
  bool reopen(Level& level, const FileDescriptor* below);
  void report(std::string_view name, int osError);
  WalkFolder folderOf(const Level& level) const;

  std::string _path;  // of the innermost folder; each level knows how much of it is its own
  WalkOptions _options;
  Preparer _preparer;
  ErrorHandler _errorHandler;
  std::vector<Level> _levels;
  std::vector<char> _buffer;             // what one call of the kernel's gives
  const WalkEntry* _entering = nullptr;  // the entry given last, when it is to be gone below
  DeviceID _device;
  bool _stopped = false;
};

}  // namespace vantrell::linuxos
