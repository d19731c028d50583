#include "linux/catalog/KnownFolder.h"

#include <algorithm>
#include <functional>

namespace vantrell::linuxos::catalog {

namespace {

// 48 bytes each.
constexpr std::uint64_t kMostEntries = 16'384;
constexpr std::size_t kPage = 4096;

}  // namespace

Result<std::optional<KnownFolder>> KnownFolder::read(EntryTable& entries, DocumentTable& documents,
                                                     FileID folder) {
  const auto record = entries.folder(folder);
  if (!record) return std::unexpected(record.error());
  if (!*record || (*record)->entryCount > kMostEntries) return std::nullopt;
  const auto known = documents.documentsOfFolder(folder);
  if (!known) return std::unexpected(known.error());
  KnownFolder result(folder);
  if (auto read = result.readEntries(entries, *known); !read) {
    return std::unexpected(read.error());
  }
  return result;
}

// Both come by name, so that one pass over both brings them together.
Result<void> KnownFolder::readEntries(EntryTable& entries, const std::vector<Document>& documents) {
  auto document = documents.begin();
  std::string after;
  for (bool isLast = false; !isLast;) {
    const auto page = entries.entriesOfFolder(_fileID, after, kPage);
    if (!page) return std::unexpected(page.error());
    isLast = page->size() < kPage;
    for (const Entry& entry : *page) {
      while (document != documents.end() && document->home.name < entry.name) ++document;
      const bool isHome = document != documents.end() && document->home.name == entry.name &&
                          document->object == entry.object();
      if (!entry.kind.isDocument() || entry.kind.isRecent()) continue;
      _entries.push_back({std::hash<std::string_view>()(entry.name), entry.object(),
                          entry.changedNanoseconds, isHome ? document->documentID : DocumentID{}});
    }
    if (!page->empty()) after = page->back().name;
  }
  std::ranges::sort(_entries, {}, [](const KnownEntry& entry) { return entry.object.fileID; });
  return {};
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
