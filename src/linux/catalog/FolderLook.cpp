#include "linux/catalog/FolderLook.h"

#include <algorithm>
#include <optional>

#include "linux/catalog/Generations.h"

namespace vantrell::linuxos::catalog {

namespace {

// A folder of up to so many entries is sorted and compared as a whole; a larger one in pieces of
// that size, which takes longer and the same memory whatever the folder holds.
constexpr std::size_t kPiece = 8192;

}  // namespace

FolderLook::FolderLook(EntryTable& entries, const FolderInHand& folder, const FolderRules& rules,
                       DifferenceSink& sink)
    : _entries(entries), _folder(folder), _reader(folder.descriptor, rules), _sink(sink) {}

Result<FolderOutcome> FolderLook::lookAtAll() {
  auto seen = _reader.next(kPiece);
  if (!seen) return FolderOutcome{seen.error()};
  return seen->size() < kPiece ? compareWhole(*seen) : compareInPieces(std::move(*seen));
}

Result<FolderOutcome> FolderLook::lookAtName(const std::string& name) {
  auto seen = _reader.lookAt(name);
  if (!seen) return FolderOutcome{seen.error()};
  const auto catalogued = _entries.entry(_folder.fileID, name);
  if (!catalogued) return std::unexpected(catalogued.error());
  const auto before = *catalogued ? std::span(&**catalogued, 1) : std::span<const Entry>();
  const auto after = *seen ? std::span(&**seen, 1) : std::span<Entry>();
  if (auto compared = compare(before, after); !compared) {
    return std::unexpected(compared.error());
  }
  return FolderOutcome{0, after.size()};
}

// The catalogued names come in pages, because there may be many more of them than there are now.
Result<FolderOutcome> FolderLook::compareWhole(std::vector<Entry>& seen) {
  std::string after;
  auto start = seen.begin();
  for (bool isLast = false; !isLast;) {
    const auto page = _entries.entriesOfFolder(_folder.fileID, after, kPiece);
    if (!page) return std::unexpected(page.error());
    isLast = page->size() < kPiece;
    auto end = seen.end();
    if (!isLast) {
      after = page->back().name;
      end = std::ranges::upper_bound(start, seen.end(), after, {}, &Entry::name);
    }
    if (auto compared = compare(*page, std::span(start, end)); !compared) {
      return std::unexpected(compared.error());
    }
    start = end;
  }
  return FolderOutcome{0, seen.size()};
}

Result<FolderOutcome> FolderLook::compareInPieces(std::vector<Entry> piece) {
  FolderOutcome outcome;
  while (!piece.empty()) {
    outcome.entryCount += piece.size();
    if (auto compared = comparePiece(piece); !compared) return std::unexpected(compared.error());
    auto next = _reader.next(kPiece);
    if (!next) return FolderOutcome{next.error()};
    piece = std::move(*next);
  }
  // Which catalogued names were not among the pieces is not remembered; the disk knows.
  const auto catalogued = _entries.countOfFolder(_folder.fileID);
  if (!catalogued) return std::unexpected(catalogued.error());
  return *catalogued == outcome.entryCount ? outcome : askForEachCatalogued();
}

Result<void> FolderLook::comparePiece(std::vector<Entry>& piece) {
  std::vector<Entry> catalogued;
  for (const Entry& seen : piece) {
    auto entry = _entries.entry(_folder.fileID, seen.name);
    if (!entry) return std::unexpected(entry.error());
    if (*entry) catalogued.push_back(std::move(**entry));
  }
  return compare(catalogued, piece);
}

Result<FolderOutcome> FolderLook::askForEachCatalogued() {
  FolderOutcome outcome;
  std::string after;
  for (;;) {
    const auto page = _entries.entriesOfFolder(_folder.fileID, after, kPiece);
    if (!page) return std::unexpected(page.error());
    std::vector<Entry> seen;
    for (const Entry& catalogued : *page) {
      auto entry = _reader.lookAt(catalogued.name);
      if (!entry) return FolderOutcome{entry.error()};
      if (*entry) seen.push_back(std::move(**entry));
    }
    outcome.entryCount += seen.size();
    if (auto compared = compare(*page, seen); !compared) {
      return std::unexpected(compared.error());
    }
    if (page->size() < kPiece) return outcome;
    after = page->back().name;
  }
}

Result<void> FolderLook::compare(std::span<const Entry> catalogued, std::span<Entry> seen) {
  const auto generation = [this](const Entry& entry) {
    return generationOf(_folder.descriptor, entry.name.c_str());
  };
  const auto differences = compareEntries(catalogued, seen, generation);
  if (differences.empty()) return {};
  return _sink.apply(_folder, differences);
}

}  // namespace vantrell::linuxos::catalog
