#include "linux/catalog/TreeLook.h"

#include <fcntl.h>
#include <unistd.h>

#include <cerrno>

#include "linux/catalog/Names.h"

namespace vantrell::linuxos::catalog {

namespace {

constexpr std::size_t kSubfolderPage = 64;
constexpr std::size_t kOpenLevels = 64;
constexpr int kReadFolder = O_RDONLY | O_DIRECTORY | O_NOFOLLOW | O_CLOEXEC;

/// Nothing, or no folder, by that name any more: what was read a moment ago is old already.
bool isMovedAway(int osError) {
  return osError == ENOENT || osError == ENOTDIR || osError == ELOOP;
}

}  // namespace

TreeLook::TreeLook(EntryTable& entries, const FolderRules& rules, DifferenceSink& sink,
                   TreeLookHooks hooks, bool onlyChanged)
    : _entries(entries),
      _rules(rules),
      _sink(sink),
      _hooks(std::move(hooks)),
      _onlyChanged(onlyChanged) {}

Result<void> TreeLook::lookBelow(OpenFolder root) {
  _path = root.path;
  _levels.clear();
  if (auto entered = enter(std::move(root.descriptor), root.self, true); !entered) return entered;
  while (!_levels.empty()) {
    const auto subfolder = nextSubfolder(_levels.back());
    if (!subfolder) return std::unexpected(subfolder.error());
    if (*subfolder == nullptr) {
      leave();
    } else if (auto descended = descend(**subfolder); !descended) {
      return descended;
    }
  }
  return {};
}

Result<void> TreeLook::descend(const Entry& subfolder) {
  if (_hooks.isRoot(subfolder.fileID)) return {};
  // A folder with a number that another folder had: its names are not the other one's, whether
  // it can be read or not.
  const auto record = _entries.folder(subfolder.fileID);
  if (!record) return std::unexpected(record.error());
  if (*record && (*record)->generation != subfolder.generation) {
    if (auto done = _hooks.forgetRecycled(subfolder.fileID); !done) return done;
  }
  const Level& level = _levels.back();
  FileDescriptor descriptor(::openat(level.descriptor.get(), subfolder.name.c_str(), kReadFolder));
  const int osError = errno;
  if (!descriptor) {
    if (!isMovedAway(osError)) _hooks.unreadable(_path + "/" + subfolder.name, osError);
    return {};
  }
  DeviceID device;
  auto self = lookAtDescriptor(descriptor.get(), &device);
  if (!self || self->fileID != subfolder.fileID || device != _rules.device) return {};
  self->name = subfolder.name;
  self->generation = subfolder.generation;
  self->kind.bits |= subfolder.kind.bits & (EntryKind::kPackage | EntryKind::kInsidePackage);
  _path += "/" + subfolder.name;
  return enter(std::move(descriptor), std::move(*self), false);
}

Result<void> TreeLook::enter(FileDescriptor descriptor, Entry self, bool isRoot) {
  FolderRules rules = _rules;
  rules.isInsidePackage = self.kind.isPackage() || self.kind.isInsidePackage();
  rules.mayHoldTrash = isRoot || self.name == kDocumentsFolderName;
  const auto isRead = look(descriptor.get(), self, rules);
  if (!isRead) return std::unexpected(isRead.error());
  // What lies below a folder that could not be read stays as it was known.
  Level level{
      std::move(descriptor), self.fileID, _path.size(), rules.isInsidePackage, {}, 0, {}, !*isRead};
  _levels.push_back(std::move(level));
  saveDescriptors();
  return {};
}

Result<bool> TreeLook::needsLook(const Entry& self) {
  if (!_onlyChanged) return true;
  const auto record = _entries.folder(self.fileID);
  if (!record) return std::unexpected(record.error());
  return !*record || (*record)->generation != self.generation ||
         (*record)->changedNanoseconds != self.changedNanoseconds;
}

Result<bool> TreeLook::look(int descriptor, const Entry& self, const FolderRules& rules) {
  const auto needed = needsLook(self);
  if (!needed || !*needed) return needed ? Result<bool>(true) : needed;
  FolderLook folder(_entries, {descriptor, self.fileID}, rules, _sink);
  const auto outcome = folder.lookAtAll();
  if (!outcome) return std::unexpected(outcome.error());
  const bool isGone = isMovedAway(outcome->osError);
  if (outcome->osError != 0 && !isGone) _hooks.unreadable(_path, outcome->osError);
  if (outcome->osError != 0) return false;
  _entriesSeen += outcome->entryCount;
  const std::int64_t changed = self.kind.isRecent() ? 0 : self.changedNanoseconds;
  const FolderRecord record{self.generation, changed, outcome->entryCount};
  if (auto put = _entries.putFolder(self.fileID, record); !put) {
    return std::unexpected(put.error());
  }
  return true;
}

Result<const Entry*> TreeLook::nextSubfolder(Level& level) {
  if (level.next == level.subfolders.size()) {
    if (level.isLastPage || !level.descriptor) return nullptr;
    auto page = _entries.subfolders(level.fileID, level.after, kSubfolderPage);
    if (!page) return std::unexpected(page.error());
    level.subfolders = std::move(*page);
    level.next = 0;
    level.isLastPage = level.subfolders.size() < kSubfolderPage;
    if (level.subfolders.empty()) return nullptr;
    level.after = level.subfolders.back().name;
  }
  return &level.subfolders[level.next++];
}

// Deep trees would need more descriptors than a process may have: only the innermost levels stay
// open, and the way back up is through "..", believed only when it leads to the same folder.
void TreeLook::saveDescriptors() {
  if (_levels.size() > kOpenLevels) {
    _levels[_levels.size() - kOpenLevels - 1].descriptor = FileDescriptor();
  }
}

void TreeLook::leave() {
  const Level left = std::move(_levels.back());
  _levels.pop_back();
  if (_levels.empty()) return;
  Level& level = _levels.back();
  _path.resize(level.pathLength);
  if (level.descriptor) return;
  FileDescriptor above(::openat(left.descriptor.get(), "..", O_PATH | O_DIRECTORY | O_CLOEXEC));
  DeviceID device;
  const auto self = above ? lookAtDescriptor(above.get(), &device) : OsResult<Entry>(Entry{});
  if (self && self->fileID == level.fileID && device == _rules.device) {
    level.descriptor = std::move(above);
    return;
  }
  auto again = openWithoutLinks(AT_FDCWD, _path, O_PATH | O_DIRECTORY | O_NOFOLLOW);
  const auto found = again ? lookAtDescriptor(again->get(), &device) : OsResult<Entry>(Entry{});
  const bool isSame = found && found->fileID == level.fileID && device == _rules.device;
  if (isSame) {
    level.descriptor = std::move(*again);
  } else {
    _hooks.unreadable(_path, ESTALE);
    level.next = level.subfolders.size();
  }
}

}  // namespace vantrell::linuxos::catalog
