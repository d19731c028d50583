#pragma once

#include <string>
#include <string_view>
#include <vector>

#include "ObservedTree.h"

namespace vantrell::properties {

/// A storage root, a folder beside it and a state folder, all new, and what users and programs
/// do in them. Each verb does it on the disk, keeps the registry of objects up to date, and adds
/// a line to the trace. A verb that the file system refuses does nothing.
///
/// Threads: use from one thread. Lifetime: removes its folders in the end.
class TestStorage {
 public:
  /// Makes the storage and the folder beside it below `parent`, the state folder below
  /// `stateParent`.
  TestStorage(const std::string& parent, const std::string& stateParent);
  explicit TestStorage(const std::string& parent) : TestStorage(parent, parent) {}
  ~TestStorage();
  TestStorage(const TestStorage&) = delete;
  TestStorage& operator=(const TestStorage&) = delete;

  /// The default folder for temporary things.
  static std::string defaultParent();

  const std::string& root() const { return _root; }
  const std::string& outside() const { return _outside; }
  const std::string& state() const { return _state; }
  ObservedTree observe() const { return ObservedTree::observe(_registry, _root, _outside); }
  const std::vector<std::string>& trace() const { return _trace; }
  /// How many new objects got the file number of one that was gone.
  int reusedFileNumbers() const { return _reusedFileNumbers; }
  void note(std::string line) { _trace.push_back(std::move(line)); }

  void createFile(const std::string& path, std::string_view content);
  void createFolder(const std::string& path);
  /// A folder with two files and a folder in it.
  void createPackage(const std::string& path);
  void createLink(const std::string& path, const std::string& target);
  void createFifo(const std::string& path);
  void append(const std::string& path, std::string_view content);
  /// As `rename`; false when something stands at `to` already.
  bool moveToFreeName(const std::string& from, const std::string& to);
  /// As `rename`: what stands at `to` is gone.
  bool moveOver(const std::string& from, const std::string& to);
  bool exchange(const std::string& one, const std::string& other);
  bool hardLink(const std::string& from, const std::string& to);
  /// A file without a name, linked to `path` once it is written.
  void createUnnamedThenLink(const std::string& path, std::string_view content);
  void remove(const std::string& path);
  /// A new object with the same content, file or package.
  void copy(const std::string& from, const std::string& to, bool withAttributes);
  void setAttribute(const std::string& path, const std::string& name, std::string_view value);
  void removeAttribute(const std::string& path, const std::string& name);

 private:
  void made(const std::string& path);
  void write(const std::string& path, std::string_view content, int flags);
  std::string relative(const std::string& path) const;

  std::string _base;
  std::string _stateBase;
  std::string _root;
  std::string _outside;
  std::string _state;
  ObjectRegistry _registry;
  std::vector<std::string> _trace;
  int _reusedFileNumbers = 0;
};

}  // namespace vantrell::properties
