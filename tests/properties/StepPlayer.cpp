#include "StepPlayer.h"

#include <fcntl.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <numeric>

#include "StepPlayerNames.h"

namespace vantrell::properties {

std::string folderOf(const std::string& path) { return path.substr(0, path.rfind('/')); }

bool exists(const std::string& path) {
  return ::faccessat(AT_FDCWD, path.c_str(), F_OK, AT_SYMLINK_NOFOLLOW) == 0;
}

std::string asideName(const Place& place, std::uint32_t number) {
  const std::string& name = place.home.name;
  if (place.seen.isPackage) return "~" + name;
  return number % 7 == 6 ? "#" + name + "#" : name + chosen(kBackupEndings, number);
}

std::string temporaryName(const Place& place, std::uint32_t number) {
  const std::string& name = place.home.name;
  if (number % 3 == 0 || place.seen.isPackage) return (number % 2 == 0 ? "." : "~") + name;
  return name + (number % 3 == 1 ? ".tmp" : "~");
}

struct StepPlayer::Action {
  void (StepPlayer::*play)();
  std::uint32_t weight;
};

const std::vector<StepPlayer::Action>& StepPlayer::actions() {
  static const std::vector<Action> kActions = {
      {&StepPlayer::createFile, 6},
      {&StepPlayer::createFolder, 3},
      {&StepPlayer::createPackage, 3},
      {&StepPlayer::createOther, 1},
      {&StepPlayer::remove, 3},
      {&StepPlayer::removeAndReuseNumber, 3},
      {&StepPlayer::copy, 3},
      {&StepPlayer::copyWithAttributes, 3},
      {&StepPlayer::hardLink, 3},
      {&StepPlayer::rename, 6},
      {&StepPlayer::moveToFolder, 4},
      {&StepPlayer::renameOver, 5},
      {&StepPlayer::exchange, 4},
      {&StepPlayer::rotate, 1},
      {&StepPlayer::hide, 4},
      {&StepPlayer::show, 8},
      {&StepPlayer::trash, 2},
      {&StepPlayer::moveOut, 2},
      {&StepPlayer::moveIn, 6},
      {&StepPlayer::moveInOver, 2},
      {&StepPlayer::moveFolder, 3},
      {&StepPlayer::recaseFolderAsPackage, 1},
      {&StepPlayer::writeInPlace, 3},
      {&StepPlayer::saveThroughTemporary, 6},
      {&StepPlayer::saveThroughUnnamed, 3},
      {&StepPlayer::saveWithBackup, 5},
      {&StepPlayer::saveWithBackupDeleted, 5},
      {&StepPlayer::saveByExchange, 4},
      {&StepPlayer::saveByExchangeKeepingOld, 4},
      {&StepPlayer::saveByUnlinkAndCreate, 5},
      {&StepPlayer::saveOneNameOfHardLink, 2},
      {&StepPlayer::replaceByNonDocument, 2},
      {&StepPlayer::setKeptAttribute, 5},
      {&StepPlayer::setOtherAttribute, 1},
      {&StepPlayer::removeAttribute, 1},
  };
  return kActions;
}

Step StepPlayer::draw(std::mt19937_64& random) {
  static const std::uint32_t kTotal =
      std::accumulate(actions().begin(), actions().end(), 0U,
                      [](std::uint32_t sum, const Action& action) { return sum + action.weight; });
  auto number = static_cast<std::uint32_t>(random() % kTotal);
  std::uint32_t action = 0;
  while (number >= actions()[action].weight) number -= actions()[action++].weight;
  return Step{action, static_cast<std::uint32_t>(random()), static_cast<std::uint32_t>(random()),
              static_cast<std::uint32_t>(random())};
}

Step StepPlayer::drawOneOf(std::initializer_list<void (StepPlayer::*)()> choices,
                           std::mt19937_64& random) {
  Step step = draw(random);
  const auto wanted = *(choices.begin() + random() % choices.size());
  const auto found = std::ranges::find(actions(), wanted, &Action::play);
  step.action = static_cast<std::uint32_t>(found - actions().begin());
  return step;
}

Step StepPlayer::drawCreation(std::mt19937_64& random) {
  return drawOneOf({&StepPlayer::createFile, &StepPlayer::createFile, &StepPlayer::createFile,
                    &StepPlayer::createFolder, &StepPlayer::createPackage},
                   random);
}

Step StepPlayer::drawDeparture(std::mt19937_64& random) {
  return drawOneOf({&StepPlayer::hide, &StepPlayer::moveOut}, random);
}

Step StepPlayer::drawReturn(std::mt19937_64& random) {
  return drawOneOf({&StepPlayer::show, &StepPlayer::moveIn}, random);
}

void StepPlayer::play(const Step& step, bool takesAttributes) {
  _takesAttributes = takesAttributes;
  _step = step;
  _tree = _storage.observe();
  (this->*actions()[step.action % actions().size()].play)();
}

std::string StepPlayer::content() { return "content " + std::to_string(++_contents); }

const Place* StepPlayer::document(std::uint32_t number) const {
  std::vector<const Place*> found;
  for (const Place& place : _tree.places()) {
    if (place.isDocument()) found.push_back(&place);
  }
  return found.empty() ? nullptr : found[number % found.size()];
}

const Place* StepPlayer::plainFolder(std::uint32_t number) const {
  std::vector<const Place*> found;
  for (const Place& place : _tree.places()) {
    const bool inStorage = place.standing == Standing::Shown || place.standing == Standing::Hidden;
    if (place.isFolder() && inStorage && place.home.name != ".Trash") found.push_back(&place);
  }
  return found.empty() ? nullptr : found[number % found.size()];
}

const Place* StepPlayer::thingOutside(std::uint32_t number) const {
  std::vector<const Place*> found;
  for (const Place& place : _tree.places()) {
    const bool isTop = folderOf(place.path()) == _storage.outside();
    if (isTop) found.push_back(&place);
  }
  return found.empty() ? nullptr : found[number % found.size()];
}

std::string StepPlayer::anyFolder(std::uint32_t number) const {
  // The root often; a package or a hidden folder as often as there is one.
  std::vector<std::string> found = {_storage.root(), _storage.root(), _storage.root()};
  for (const Place& place : _tree.places()) {
    const bool isDirectory = place.seen.kind == FileKind::Directory;
    if (isDirectory && place.standing != Standing::OutsideRoots) found.push_back(place.path());
  }
  return found[number % found.size()];
}

std::string StepPlayer::freePath(const std::string& folder, const std::string& name) const {
  std::string path = folder + "/" + name;
  return exists(path) ? std::string() : path;
}

void StepPlayer::createLike(const Place& original, const std::string& path) {
  if (original.seen.isPackage) {
    _storage.createPackage(path);
  } else {
    _storage.createFile(path, content());
  }
}

void StepPlayer::removeThing(const std::string& path) {
  if (exists(path)) _storage.remove(path);
}

/// A folder that is not empty cannot be renamed over: programs exchange it and remove the old.
bool StepPlayer::putOver(const std::string& from, const Place& target) {
  if (!target.seen.isPackage) return _storage.moveOver(from, target.path());
  if (!_storage.exchange(from, target.path())) return false;
  _storage.remove(from);
  return true;
}

void StepPlayer::createFile() {
  const std::string path = freePath(anyFolder(_step.one), chosen(kFileNames, _step.two));
  if (!path.empty()) _storage.createFile(path, content());
}

void StepPlayer::createFolder() {
  const std::string path = freePath(anyFolder(_step.one), chosen(kFolderNames, _step.two));
  if (!path.empty()) _storage.createFolder(path);
}

void StepPlayer::createPackage() {
  const std::string path = freePath(anyFolder(_step.one), chosen(kPackageNames, _step.two));
  if (!path.empty()) _storage.createPackage(path);
}

void StepPlayer::createOther() {
  const std::string path = freePath(anyFolder(_step.one), chosen(kFileNames, _step.two));
  if (path.empty()) return;
  if (_step.three % 2 == 0) {
    _storage.createLink(path, "a");
  } else {
    _storage.createFifo(path);
  }
}

void StepPlayer::remove() {
  const Place* place = document(_step.one);
  if (_step.two % 4 == 0) place = plainFolder(_step.one);
  if (place != nullptr) _storage.remove(place->path());
}

void StepPlayer::removeAndReuseNumber() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const Place gone = *place;
  _storage.remove(gone.path());
  const std::string path = freePath(folderOf(gone.path()), chosen(kFileNames, _step.two));
  if (!path.empty()) createLike(gone, path);
}

void StepPlayer::copyAs(bool withAttributes) {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string name =
      place->seen.isPackage ? chosen(kPackageNames, _step.three) : chosen(kFileNames, _step.three);
  const std::string folder =
      _step.two % 2 == 0 ? folderOf(place->path()) : anyFolder(_step.two / 2);
  if ((folder + "/").starts_with(place->path() + "/")) return;
  const std::string path = freePath(folder, name);
  if (!path.empty()) _storage.copy(place->path(), path, withAttributes);
}

void StepPlayer::copy() { copyAs(false); }

void StepPlayer::copyWithAttributes() { copyAs(true); }

void StepPlayer::hardLink() {
  const Place* place = document(_step.one);
  if (place == nullptr || place->seen.isPackage) return;
  const std::string path = freePath(anyFolder(_step.two), chosen(kFileNames, _step.three));
  if (!path.empty()) _storage.hardLink(place->path(), path);
}

void StepPlayer::rename() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string name =
      place->seen.isPackage ? chosen(kPackageNames, _step.two) : chosen(kFileNames, _step.two);
  _storage.moveToFreeName(place->path(), folderOf(place->path()) + "/" + name);
}

void StepPlayer::moveToFolder() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  _storage.moveToFreeName(place->path(), anyFolder(_step.two) + "/" + place->home.name);
}

void StepPlayer::renameOver() {
  const Place* from = document(_step.one);
  const Place* to = document(_step.two);
  if (from == nullptr || to == nullptr || from->object == to->object) return;
  if (from->seen.isPackage == to->seen.isPackage) putOver(from->path(), *to);
}

void StepPlayer::exchange() {
  const Place* one = document(_step.one);
  const Place* other = document(_step.two);
  if (_step.three % 8 == 0) one = plainFolder(_step.one);
  if (_step.three % 16 == 0) other = plainFolder(_step.two);
  if (one != nullptr && other != nullptr) _storage.exchange(one->path(), other->path());
}

void StepPlayer::rotate() {
  const Place* one = document(_step.one);
  const Place* two = document(_step.two);
  const Place* three = document(_step.three);
  if (one == nullptr || two == nullptr || three == nullptr) return;
  if (_storage.exchange(one->path(), two->path())) {
    _storage.exchange(two->path(), three->path());
  }
}

void StepPlayer::hide() {
  const Place* place = _step.two % 4 == 0 ? plainFolder(_step.one) : document(_step.one);
  if (place == nullptr || place->standing != Standing::Shown) return;
  _storage.moveToFreeName(place->path(), folderOf(place->path()) + "/." + place->home.name);
}

void StepPlayer::show() {
  std::vector<const Place*> hidden;
  for (const Place& place : _tree.places()) {
    if (place.standing == Standing::Hidden && place.home.name.starts_with(".")) {
      hidden.push_back(&place);
    }
  }
  if (hidden.empty()) return;
  const Place& place = *hidden[_step.one % hidden.size()];
  const std::string to = folderOf(place.path()) + "/" + place.home.name.substr(1);
  const bool isFile = place.seen.kind == FileKind::RegularFile;
  if (isFile && _step.two % 3 == 0) {
    _storage.moveOver(place.path(), to);
  } else {
    _storage.moveToFreeName(place.path(), to);
  }
}

void StepPlayer::trash() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string bin = _storage.root() + "/.Trash";
  if (!exists(bin)) _storage.createFolder(bin);
  if (place->path().starts_with(bin)) {
    _storage.moveToFreeName(place->path(), anyFolder(_step.two) + "/" + place->home.name);
  } else {
    _storage.moveToFreeName(place->path(), bin + "/" + place->home.name);
  }
}

}  // namespace vantrell::properties
