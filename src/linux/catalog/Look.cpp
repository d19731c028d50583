#include "linux/catalog/Look.h"

#include <fcntl.h>

#include <algorithm>
#include <cerrno>

#include "linux/catalog/AttributeDebts.h"
#include "linux/catalog/Generations.h"
#include "linux/catalog/KeptAttributes.h"
#include "linux/catalog/Paths.h"
#include "platform/foundation/PosixNames.h"

namespace vantrell::linuxos::catalog {

namespace {

constexpr std::size_t kReportedFolders = 100;

bool isSameObject(const Entry* before, const Entry* after) {
  return before != nullptr && after != nullptr && before->object() == after->object() &&
         before->kind.without(EntryKind::kRecent) == after->kind.without(EntryKind::kRecent);
}

}  // namespace

Look::Look(Store& store, const LookTarget& target, LookScope scope)
    : _store(store), _target(target), _scope(scope) {}

Result<LookReport> Look::run() {
  const auto start = std::chrono::steady_clock::now();
  auto transaction = Transaction::begin(*_store.database);
  if (!transaction) return std::unexpected(transaction.error());
  const auto noEntries = _store.entries.isEmpty();
  const auto noDocuments = _store.documents.isEmpty();
  if (!noEntries) return std::unexpected(noEntries.error());
  if (!noDocuments) return std::unexpected(noDocuments.error());
  _hasDocuments = !*noDocuments;
  _isFirst = *noEntries && !_hasDocuments;
  using Step = Result<void> (Look::*)();
  for (const Step step :
       {&Look::openRoots, &Look::lookBelowRoots, &Look::forgetStaleRoots, &Look::removeDoublePlaces,
        &Look::removeLeftFolders, &Look::decideDocuments}) {
    if (auto done = (this->*step)(); !done) return std::unexpected(done.error());
  }
  if (auto done = finish(start); !done) return std::unexpected(done.error());
  if (auto done = transaction->commit(); !done) return std::unexpected(done.error());
  _report.duration = std::chrono::duration_cast<std::chrono::microseconds>(
      std::chrono::steady_clock::now() - start);
  return _report;
}

Result<void> Look::openRoots() {
  // Indexes make a first look slower and every other one possible.
  if (!_isFirst) {
    if (auto made = createIndexes(*_store.database); !made) return made;
  }
  if (auto begun = _store.differences.begin(); !begun) return begun;
  auto former = _store.entries.roots();
  if (!former) return std::unexpected(former.error());
  _formerRoots = std::move(*former);
  for (const std::string& path : _target.roots) {
    if (auto opened = openRoot(path); !opened) return opened;
  }
  return {};
}

Result<void> Look::openRoot(const std::string& path) {
  auto descriptor = openWithoutLinks(AT_FDCWD, path, O_RDONLY | O_DIRECTORY);
  DeviceID device;
  auto self = descriptor ? lookAtDescriptor(descriptor->get(), &device)
                         : OsResult<Entry>(std::unexpected(descriptor.error()));
  if (!self) {
    noteUnreadable(path, self.error());
    const auto known = std::ranges::find(_formerRoots, path, &RootRecord::path);
    if (known != _formerRoots.end()) _roots.push_back(*known);
    return {};
  }
  if (_device == DeviceID{}) _device = device;
  if (device != _device) {
    _target.log(LogLevel::Error, "\"" + path + "\" is left out: it lies on another volume than \"" +
                                     _target.roots.front() + "\"");
    return {};
  }
  self->generation = generationOf(descriptor->get(), "").value_or(0);
  const auto record = _store.entries.folder(self->fileID);
  if (!record) return std::unexpected(record.error());
  if (*record && (*record)->generation != self->generation) {
    if (auto done = forgetRecycled(self->fileID); !done) return done;
  }
  _roots.push_back({path, self->object()});
  _opened.push_back({std::move(*descriptor), std::move(*self), path});
  return {};
}

Result<void> Look::forgetStaleRoots() {
  for (const RootRecord& former : _formerRoots) {
    const bool isKept = std::ranges::any_of(_roots, [&](const RootRecord& root) {
      return root.path == former.path && root.object == former.object;
    });
    if (isKept) continue;
    if (auto removed = _store.entries.removeRoot(former.path); !removed) return removed;
    Entry folder;
    folder.fileID = former.object.fileID;
    folder.generation = former.object.generation;
    folder.kind = EntryKind::of(FileKind::Directory);
    auto recorded = _store.differences.record(FileID{}, former.path, &folder, nullptr);
    if (!recorded) return recorded;
  }
  for (const RootRecord& root : _roots) {
    const auto known = std::ranges::find(_formerRoots, root.path, &RootRecord::path);
    if (known != _formerRoots.end() && known->object == root.object) continue;
    if (auto put = _store.entries.putRoot(root); !put) return put;
  }
  return {};
}

Result<void> Look::lookBelowRoots() {
  const FolderRules rules{_target.types, _device};
  const TreeLookHooks hooks{
      [this](FileID folder) { return forgetRecycled(folder); },
      [this](const std::string& path, int osError) { noteUnreadable(path, osError); },
      [this](FileID folder) {
        return std::ranges::any_of(
            _roots, [&](const RootRecord& root) { return root.object.fileID == folder; });
      }};
  for (OpenFolder& root : _opened) {
    TreeLook tree(_store.entries, rules, *this, hooks, _scope == LookScope::ChangedFolders);
    if (auto looked = tree.lookBelow(std::move(root)); !looked) return looked;
    _report.entriesSeen += tree.entriesSeen();
  }
  return {};
}

Result<void> Look::apply(const FolderInHand& folder, std::span<const Difference> differences) {
  for (const Difference& difference : differences) {
    if (auto applied = applyOne(folder, difference); !applied) return applied;
  }
  return {};
}

Result<void> Look::applyOne(const FolderInHand& folder, const Difference& difference) {
  const Entry* const after = difference.after;
  const std::string& name = after != nullptr ? after->name : difference.before->name;
  const auto written = after != nullptr ? _store.entries.put(folder.fileID, *after)
                                        : _store.entries.remove(folder.fileID, name);
  if (!written) return written;
  if (_isFirst) {
    if (difference.kind == DifferenceKind::Appeared) ++_report.created;
    return {};
  }
  if (difference.kind == DifferenceKind::Changed) ++_report.changed;
  if (!isSameObject(difference.before, after)) {
    auto recorded = _store.differences.record(folder.fileID, name, difference.before, after);
    if (!recorded) return recorded;
  }
  const bool mayBeDocument =
      after != nullptr && after->kind.isDocument() && difference.kind != DifferenceKind::Confirmed;
  return mayBeDocument && _hasDocuments ? keepAttributes(folder, *after) : Result<void>();
}

Result<void> Look::keepAttributes(const FolderInHand& folder, const Entry& entry) {
  const auto document = _store.documents.documentOfObject(entry.object());
  if (!document) return std::unexpected(document.error());
  // What has not reached the file yet is worth more than what the file has.
  if (!*document || (*document)->owesAttributes) return {};
  const auto attributes = readKeptAttributes(folder.descriptor, entry.name);
  if (!attributes) return {};
  return _store.documents.keepAttributes((*document)->documentID, *attributes);
}

Result<void> Look::forgetRecycled(FileID folder) {
  auto removed = _store.differences.removeEntriesOfFolder(folder, true);
  return removed ? _store.entries.removeFolder(folder) : removed;
}

// A folder that was moved while the tree was read may have been met at both places.
Result<void> Look::removeDoublePlaces() {
  if (_isFirst) return {};
  for (std::int64_t last = 0;;) {
    const auto appeared = _store.differences.nextAppearedFolder(last);
    if (!appeared) return std::unexpected(appeared.error());
    if (!*appeared) return {};
    last = (*appeared)->number;
    const auto places = _store.entries.placesOfFileID((*appeared)->object.fileID);
    if (!places) return std::unexpected(places.error());
    if (places->size() < 2) continue;
    for (const PlacedEntry& place : *places) {
      const auto path = pathOf(_store.entries, _roots, place.parent, place.entry.name);
      if (!path) return std::unexpected(path.error());
      if (*path && standsAt(**path, (*appeared)->object)) continue;
      auto removed = _store.entries.remove(place.parent, place.entry.name);
      if (!removed) return removed;
      auto recorded =
          _store.differences.record(place.parent, place.entry.name, &place.entry, nullptr);
      if (!recorded) return recorded;
    }
  }
}

// Folders that are nowhere any more take along what was in them. The differences written here
// are met by the same loop, so that it goes down to the last folder.
Result<void> Look::removeLeftFolders() {
  if (_isFirst) return {};
  for (std::int64_t last = 0;;) {
    const auto left = _store.differences.nextLeftFolder(last);
    if (!left) return std::unexpected(left.error());
    if (!*left) return {};
    last = (*left)->number;
    const ObjectID& folder = (*left)->object;
    const auto placed = isPlaced(folder);
    if (!placed) return std::unexpected(placed.error());
    const auto record = _store.entries.folder(folder.fileID);
    if (!record) return std::unexpected(record.error());
    // The number may be another folder's by now, which has been looked at already.
    if (*placed || !*record || (*record)->generation != folder.generation) continue;
    auto removed = _store.differences.removeEntriesOfFolder(folder.fileID, false);
    if (removed) removed = _store.entries.removeFolder(folder.fileID);
    if (!removed) return removed;
  }
}

Result<bool> Look::isPlaced(const ObjectID& folder) {
  if (std::ranges::find(_roots, folder, &RootRecord::object) != _roots.end()) return true;
  const auto places = _store.entries.placesOfFileID(folder.fileID);
  if (!places) return std::unexpected(places.error());
  return std::ranges::any_of(
      *places, [&](const PlacedEntry& place) { return place.entry.object() == folder; });
}

Result<void> Look::decideDocuments() {
  if (!_hasDocuments) return {};
  const auto counts = _store.fates.decide(&standsAt);
  if (!counts) return std::unexpected(counts.error());
  _report.documentsHandedOver = counts->handedOver;
  _report.documentsReturned = counts->returned;
  _report.documentsGone = counts->gone;
  return payAttributeDebts(_store, _roots, {_target.types, _device}, _target.log);
}

Result<void> Look::finish(std::chrono::steady_clock::time_point start) {
  if (_isFirst) {
    if (auto made = createIndexes(*_store.database); !made) return made;
  } else {
    const auto counts = _store.differences.counts();
    if (!counts) return std::unexpected(counts.error());
    _report.created = counts->created;
    _report.gone = counts->gone;
    _report.moved = counts->moved;
    _report.replaced = counts->replaced;
  }
  if (_scope != LookScope::Everything) return {};
  const auto took = std::chrono::duration_cast<std::chrono::microseconds>(
      std::chrono::steady_clock::now() - start);
  return _store.state.noteLook(nowNanoseconds(), took, _report.unreadableFolderCount);
}

void Look::noteUnreadable(const std::string& path, int osError) {
  ++_report.unreadableFolderCount;
  if (_report.unreadableFolders.size() < kReportedFolders) {
    _report.unreadableFolders.push_back(path);
  }
  // Looks in between would say the same again and again.
  const LogLevel level = _scope == LookScope::Everything ? LogLevel::Error : LogLevel::Debug;
  _target.log(level, "can't read the folder \"" + path + "\", what was known of it is kept; " +
                         posixErrorDescription(osError));
}

}  // namespace vantrell::linuxos::catalog
