#pragma once

#include <functional>
#include <string>
#include <vector>

#include "linux/FileDescriptor.h"
#include "linux/catalog/EntryTable.h"
#include "linux/catalog/FolderLook.h"

namespace vantrell::linuxos::catalog {

/// A folder that is open and known to be the object that it was taken for.
struct OpenFolder {
  FileDescriptor descriptor;
  Entry self;        ///< its stamps from before it is read
  std::string path;  ///< absolute
};

/// What the look at a tree asks for and tells.
struct TreeLookHooks {
  /// A folder that has the number of another one that was catalogued and is gone.
  std::function<Result<void>(FileID)> forgetRecycled;
  /// A folder, by its path, that could not be read; its errno value.
  std::function<void(const std::string&, int)> unreadable;
  /// True for folders that are looked at on their own, wherever they lie.
  std::function<bool(FileID)> isRoot;
};

/// Looks at every folder below a root, one after the other, at any depth: it holds a few
/// descriptors and a few names of each level, and nothing of the folders it has left.
///
/// Errors: POSIX, the database's and the sink's.
/// Threads: as the database. Lifetime: borrows everything that it is given.
class TreeLook {
 public:
  /// With `onlyChanged` the names in a folder whose own ctime is as recorded are not read again:
  /// none can have come, gone or been given another object.
  TreeLook(EntryTable& entries, const FolderRules& rules, DifferenceSink& sink, TreeLookHooks hooks,
           bool onlyChanged);

  Result<void> lookBelow(OpenFolder root);

  std::uint64_t entriesSeen() const { return _entriesSeen; }

 private:
  struct Level {
    FileDescriptor descriptor;  // none while it is closed to save it
    FileID fileID;
    std::size_t pathLength = 0;
    bool isInsidePackage = false;
    std::vector<Entry> subfolders;  // a page of them
    std::size_t next = 0;
    std::string after;  // the name that the page ends with
    bool isLastPage = false;
  };

  Result<void> enter(FileDescriptor descriptor, Entry self, bool isRoot);
  Result<bool> look(int descriptor, const Entry& self, const FolderRules& rules);
  Result<bool> needsLook(const Entry& self);
  Result<const Entry*> nextSubfolder(Level& level);
  Result<void> descend(const Entry& subfolder);
  void leave();
  void saveDescriptors();

  EntryTable& _entries;
  FolderRules _rules;
  DifferenceSink& _sink;
  TreeLookHooks _hooks;
  bool _onlyChanged;
  std::uint64_t _entriesSeen = 0;
  std::vector<Level> _levels;
  std::string _path;  // of the innermost level
};

}  // namespace vantrell::linuxos::catalog
