#include "linux/catalog/EntryTable.h"

namespace vantrell::linuxos::catalog {

namespace {

Entry entryOf(const Statement& row) {
  Entry entry;
  entry.name = row.bytes(0);
  entry.fileID = row.fileID(1);
  entry.generation = row.bits(2);
  entry.kind = EntryKind{static_cast<std::uint32_t>(row.integer(3))};
  entry.size = row.bits(4);
  entry.modifiedNanoseconds = row.integer(5);
  entry.changedNanoseconds = row.integer(6);
  return entry;
}

}  // namespace

Result<bool> EntryTable::isEmpty() {
  const auto any = _database.integer("SELECT EXISTS (SELECT 1 FROM entries)");
  if (!any) return std::unexpected(any.error());
  return *any == 0;
}

Result<std::vector<Entry>> EntryTable::read(Statement& statement) {
  std::vector<Entry> entries;
  for (;;) {
    const auto row = statement.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return entries;
    entries.push_back(entryOf(statement));
  }
}

Result<std::vector<Entry>> EntryTable::entriesOfFolder(FileID parent, std::string_view after,
                                                       std::size_t limit) {
  return read(_entries.with(parent, after, std::uint64_t{limit}));
}

Result<std::vector<Entry>> EntryTable::subfolders(FileID parent, std::string_view after,
                                                  std::size_t limit) {
  return read(_subfolders.with(parent, after, std::uint64_t{limit}));
}

Result<std::uint64_t> EntryTable::countOfFolder(FileID parent) {
  const auto row = _count.with(parent).step();
  if (!row) return std::unexpected(row.error());
  const std::uint64_t count = _count.bits(0);
  _count.reset();
  return count;
}

Result<std::optional<Entry>> EntryTable::entry(FileID parent, std::string_view name) {
  auto found = read(_entry.with(parent, name));
  if (!found) return std::unexpected(found.error());
  if (found->empty()) return std::nullopt;
  return std::move(found->front());
}

Result<std::vector<PlacedEntry>> EntryTable::placesOfFileID(FileID fileID) {
  std::vector<PlacedEntry> places;
  _places.with(fileID);
  for (;;) {
    const auto row = _places.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return places;
    places.push_back({_places.fileID(7), entryOf(_places)});
  }
}

Result<void> EntryTable::put(FileID parent, const Entry& entry) {
  return _put
      .with(parent, entry.name, entry.fileID, entry.generation, entry.kind.bits, entry.size,
            entry.modifiedNanoseconds, entry.changedNanoseconds)
      .run();
}

Result<void> EntryTable::remove(FileID parent, std::string_view name) {
  return _remove.with(parent, name).run();
}

Result<std::optional<FolderRecord>> EntryTable::folder(FileID fileID) {
  const auto row = _folder.with(fileID).step();
  if (!row) return std::unexpected(row.error());
  if (!*row) return std::nullopt;
  const FolderRecord record{_folder.bits(0), _folder.integer(1), _folder.bits(2)};
  _folder.reset();
  return record;
}

Result<void> EntryTable::putFolder(FileID fileID, const FolderRecord& record) {
  return _putFolder.with(fileID, record.generation, record.changedNanoseconds, record.entryCount)
      .run();
}

Result<void> EntryTable::removeFolder(FileID fileID) { return _removeFolder.with(fileID).run(); }

Result<std::vector<RootRecord>> EntryTable::roots() {
  std::vector<RootRecord> roots;
  _roots.with();
  for (;;) {
    const auto row = _roots.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return roots;
    roots.push_back({std::string(_roots.bytes(0)), {_roots.fileID(1), _roots.bits(2)}});
  }
}

Result<void> EntryTable::putRoot(const RootRecord& root) {
  return _putRoot.with(root.path, root.object.fileID, root.object.generation).run();
}

Result<void> EntryTable::removeRoot(const std::string& path) {
  return _removeRoot.with(path).run();
}

}  // namespace vantrell::linuxos::catalog
