#include "linux/catalog/KnownFolder.h"

#include <algorithm>
#include <functional>

namespace vantrell::linuxos::catalog {

namespace {

// 48 bytes each.
constexpr std::uint64_t kMostEntries = 16'384;

}  // namespace

Result<std::optional<KnownFolder>> KnownFolderReader::read(FileID folder) {
  const auto row = _count.with(folder).step();
  if (!row) return std::unexpected(row.error());
  const bool isWanted = *row && _count.bits(0) <= kMostEntries;
  _count.reset();
  if (!isWanted) return std::nullopt;
  KnownFolder known(folder);
  const auto read = readEntries(known);
  _entries.reset();
  _documents.reset();
  if (!read) return std::unexpected(read.error());
  std::ranges::sort(known._entries, {},
                    [](const KnownEntry& entry) { return entry.object.fileID; });
  return known;
}

// Both come by name, so that one pass over both brings them together. A living document stands
// for the object that is catalogued at its home; every look sees to that.
Result<void> KnownFolderReader::readEntries(KnownFolder& folder) {
  auto document = _documents.with(folder.fileID()).step();
  for (_entries.with(folder.fileID());;) {
    const auto row = _entries.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return {};
    const std::string_view name = _entries.bytes(0);
    while (document && *document && _documents.bytes(0) < name) document = _documents.step();
    if (!document) return std::unexpected(document.error());
    const FileID fileID = _entries.fileID(1);
    const bool isHome = *document && _documents.bytes(0) == name && _documents.fileID(1) == fileID;
    const EntryKind kind{static_cast<std::uint32_t>(_entries.integer(3))};
    if (!kind.isDocument() || kind.isRecent()) continue;
    folder._entries.push_back({std::hash<std::string_view>()(name),
                               {fileID, _entries.bits(2)},
                               _entries.integer(4),
                               isHome ? _documents.documentID(2) : DocumentID{}});
  }
}

const KnownEntry* KnownFolder::find(std::string_view name, FileID fileID,
                                    std::int64_t changedNanoseconds) const {
  const auto byFileID = [](const KnownEntry& entry) { return entry.object.fileID; };
  auto found = std::ranges::lower_bound(_entries, fileID, {}, byFileID);
  const std::uint64_t hash = std::hash<std::string_view>()(name);
  for (; found != _entries.end() && found->object.fileID == fileID; ++found) {
    if (found->nameHash == hash && found->changedNanoseconds == changedNanoseconds) return &*found;
  }
  return nullptr;
}

}  // namespace vantrell::linuxos::catalog
