#pragma once

#include <sys/stat.h>

#include <cerrno>
#include <filesystem>
#include <map>
#include <mutex>
#include <optional>
#include <stdexcept>
#include <string>
#include <utility>
#include <vector>

#include "linux/catalog/FileIndex.h"

namespace vantrell::fakes {

/// An index that keeps everything in memory: a document's ID goes with its file ID, and paths are
/// found by walking the root. It knows of no safe saves and no hard links.
///
/// Threads: all members may be called from any thread.
class FakeFileIndex : public linuxos::FileIndex {
 public:
  explicit FakeFileIndex(std::string root) : _root(std::move(root)) {}

  /// What `entryCountOfFolder` answers from now on.
  void setEntryCount(FileID folder, std::uint64_t count) { _entryCounts[folder] = count; }
  /// Makes every batch of document IDs fail until it is taken back.
  void setBatchError(std::optional<int> osError) { _batchError = osError; }

  struct Batch {
    FileID folder;
    std::vector<linuxos::SeenObject> documents;
  };
  const std::vector<Batch>& batches() const { return _batches; }
  const std::vector<linuxos::SeenObject>& seenObjects() const { return _seen; }

  struct NotedAttribute {
    FileID fileID;
    std::string name;
    std::optional<FndData> value;
  };
  const std::vector<NotedAttribute>& notedAttributes() const { return _attributes; }

  Result<std::string> pathForFileID(FileID fileID) override {
    if (inodeOf(_root) == fileID.value) return _root;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(_root)) {
      if (inodeOf(entry.path().string()) == fileID.value) return entry.path().string();
    }
    return std::unexpected(FndError::posix(ENOENT));
  }

  std::optional<std::uint64_t> entryCountOfFolder(FileID folder) override {
    const auto found = _entryCounts.find(folder);
    if (found == _entryCounts.end()) return std::nullopt;
    return found->second;
  }

  DocumentID documentIDOfObject(const linuxos::SeenObject& object) override {
    const std::lock_guard lock(_mutex);
    const auto found = _documents.find(object.fileID);
    return found == _documents.end() ? DocumentID{} : found->second;
  }

  Result<std::vector<DocumentID>> documentIDsOfObjects(
      FileID folder, std::span<const linuxos::SeenObject> documents) override {
    const std::lock_guard lock(_mutex);
    _batches.push_back({folder, {documents.begin(), documents.end()}});
    if (_batchError) return std::unexpected(FndError::posix(*_batchError));
    std::vector<DocumentID> ids;
    for (const linuxos::SeenObject& document : documents) {
      if (inodeOf(document.path) != document.fileID.value) {  // gone meanwhile
        ids.push_back(DocumentID{});
        continue;
      }
      if (document.kind != FileKind::RegularFile && !document.isPackage) {
        throw std::logic_error("asked for the document ID of no document: " + document.path);
      }
      const auto [entry, isNew] = _documents.try_emplace(document.fileID, DocumentID{_nextID});
      if (isNew) ++_nextID;
      ids.push_back(entry->second);
    }
    return ids;
  }

  Result<FileID> fileIDOfDocument(DocumentID documentID) override {
    const std::lock_guard lock(_mutex);
    for (const auto& [fileID, known] : _documents) {
      if (known == documentID) return fileID;
    }
    return std::unexpected(FndError::posix(ENOENT));
  }

  void noteSeen(const linuxos::SeenObject& object) override {
    const std::lock_guard lock(_mutex);
    _seen.push_back(object);
  }

  void noteAttribute(FileID fileID, std::string_view name,
                     std::optional<FndDataView> value) override {
    const std::lock_guard lock(_mutex);
    NotedAttribute& noted = _attributes.emplace_back(fileID, std::string(name), std::nullopt);
    if (value) noted.value.emplace(value->begin(), value->end());
  }

 private:
  static std::uint64_t inodeOf(const std::string& path) {
    struct stat status;
    return ::lstat(path.c_str(), &status) == 0 ? status.st_ino : 0;
  }

  const std::string _root;
  std::mutex _mutex;
  std::map<FileID, DocumentID> _documents;
  std::map<FileID, std::uint64_t> _entryCounts;
  std::vector<Batch> _batches;
  std::vector<linuxos::SeenObject> _seen;
  std::vector<NotedAttribute> _attributes;
  std::optional<int> _batchError;
  std::uint32_t _nextID = 100;
};

}  // namespace vantrell::fakes
