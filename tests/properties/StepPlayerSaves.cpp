// The steps that cross the border of the storage, the ways in which programs save, and what they
// attach to files.
#include <array>

#include "StepPlayer.h"
#include "StepPlayerNames.h"

namespace vantrell::properties {

void StepPlayer::moveOut() {
  const Place* place = _step.two % 3 == 0 ? plainFolder(_step.one) : document(_step.one);
  if (place == nullptr) return;
  _storage.moveToFreeName(place->path(), _storage.outside() + "/" + place->home.name);
}

void StepPlayer::moveIn() {
  const Place* place = thingOutside(_step.one);
  if (place == nullptr) return;
  _storage.moveToFreeName(place->path(), anyFolder(_step.two) + "/" + place->home.name);
}

void StepPlayer::moveInOver() {
  const Place* target = document(_step.two);
  if (target == nullptr) return;
  const std::string from = _storage.outside() + "/" + target->home.name;
  if (!exists(from)) createLike(*target, from);
  if (target->seen.isPackage == seeObject(from).isPackage) putOver(from, *target);
}

void StepPlayer::moveFolder() {
  const Place* place = plainFolder(_step.one);
  if (place == nullptr) return;
  const std::string to = _step.three % 2 == 0 ? folderOf(place->path()) : anyFolder(_step.two);
  const std::string name =
      _step.three % 2 == 0 ? chosen(kFolderNames, _step.two) : place->home.name;
  _storage.moveToFreeName(place->path(), to + "/" + name);
}

void StepPlayer::recaseFolderAsPackage() {
  const Place* folder = plainFolder(_step.one);
  if (folder != nullptr && _step.two % 2 == 0) {
    _storage.moveToFreeName(folder->path(), folder->path() + ".tessera");
    return;
  }
  const Place* package = document(_step.one);
  if (package == nullptr || !package->seen.isPackage) return;
  const std::string path = package->path();
  _storage.moveToFreeName(path, path.substr(0, path.rfind('.')));
}

void StepPlayer::writeInPlace() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  if (!place->seen.isPackage) {
    _storage.append(place->path(), content());
  } else if (exists(place->path() + "/index")) {
    _storage.append(place->path() + "/index", content());
  }
}

void StepPlayer::saveThroughTemporary() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string path = freePath(folderOf(place->path()), temporaryName(*place, _step.two));
  if (path.empty()) return;
  createLike(*place, path);
  // A save that the next look finds half done.
  if (_step.three % 6 != 0) putOver(path, *place);
}

void StepPlayer::saveThroughUnnamed() {
  const Place* place = document(_step.one);
  if (place == nullptr || place->seen.isPackage) return;
  const std::string path = freePath(folderOf(place->path()), temporaryName(*place, _step.two));
  if (path.empty()) return;
  _storage.createUnnamedThenLink(path, content());
  putOver(path, *place);
}

void StepPlayer::saveWithBackup() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string backup = folderOf(place->path()) + "/" + asideName(*place, _step.two);
  if (place->seen.isPackage) removeThing(backup);
  if (!_storage.moveOver(place->path(), backup)) return;
  if (_step.three % 6 != 0) createLike(*place, place->path());
}

void StepPlayer::saveWithBackupDeleted() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string backup = freePath(folderOf(place->path()), asideName(*place, _step.two));
  if (backup.empty() || !_storage.moveToFreeName(place->path(), backup)) return;
  createLike(*place, place->path());
  _storage.remove(backup);
}

void StepPlayer::saveByExchange() { exchangeWithTemporary(true); }

void StepPlayer::saveByExchangeKeepingOld() { exchangeWithTemporary(false); }

void StepPlayer::exchangeWithTemporary(bool removeOld) {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const std::string path = folderOf(place->path()) + "/" + temporaryName(*place, _step.two);
  // What an earlier save left under that name serves as well: it was known before.
  if (!exists(path)) createLike(*place, path);
  if (seeObject(path).kind != place->seen.kind) return;
  if (_storage.exchange(path, place->path()) && removeOld) _storage.remove(path);
}

void StepPlayer::saveByUnlinkAndCreate() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  const Place gone = *place;
  _storage.remove(gone.path());
  createLike(gone, gone.path());
}

void StepPlayer::saveOneNameOfHardLink() {
  for (const Place& place : _tree.places()) {
    const auto names = _tree.placesOf(place.object).size();
    if (names < 2 || place.seen.kind != FileKind::RegularFile) continue;
    const std::string path = freePath(folderOf(place.path()), temporaryName(place, _step.two));
    if (path.empty()) continue;
    createLike(place, path);
    _storage.moveOver(path, place.path());
    return;
  }
}

void StepPlayer::replaceByNonDocument() {
  const Place* place = document(_step.one);
  if (place == nullptr || place->seen.isPackage) return;
  const std::string path = place->path();
  if (isPackageName(place->home.name)) return;
  if (_step.two % 2 == 0) {
    _storage.remove(path);
  } else if (!_storage.moveToFreeName(path, folderOf(path) + "/" + chosen(kFileNames, _step.two))) {
    return;
  }
  if (_step.three % 3 == 0) {
    _storage.createFolder(path);
  } else if (_step.three % 3 == 1) {
    _storage.createLink(path, "b");
  } else {
    _storage.createFifo(path);
  }
}

void StepPlayer::setKeptAttribute() {
  const Place* place = document(_step.one);
  if (place == nullptr || !_takesAttributes) return;
  _storage.setAttribute(place->path(), chosen(kKeptAttributes, _step.two), content());
}

void StepPlayer::setOtherAttribute() {
  const Place* place = document(_step.one);
  if (place == nullptr || !_takesAttributes) return;
  _storage.setAttribute(place->path(), "org.example.other", content());
}

void StepPlayer::removeAttribute() {
  const Place* place = document(_step.one);
  if (place == nullptr) return;
  _storage.removeAttribute(place->path(), chosen(kKeptAttributes, _step.two));
}

}  // namespace vantrell::properties
