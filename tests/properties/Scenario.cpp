#include "Scenario.h"

#include <sys/xattr.h>
#include <unistd.h>

#include <algorithm>
#include <bit>
#include <random>

#include "JudgedStorage.h"
#include "StepPlayerNames.h"

namespace vantrell::properties {
namespace {

/// A judged storage, with what the events need to know.
class Session {
 public:
  explicit Session(const Stage& stage)
      : _takesAttributes(stage.takesAttributes),
        _judged(stage.parent, stage.stateParent),
        _player(_judged.storage) {}

  void play(const Event& event);
  bool failed() { return _isOpen && !_judged.judge().complaints().empty(); }
  void finish() {
    if (!_isSettled) look();
  }
  ScenarioResult result() {
    return {_judged.judge().complaints(), _judged.storage.trace(), _judged.judge().counts(),
            _judged.storage.reusedFileNumbers()};
  }

 private:
  void ensureOpen();
  void look();
  void ask(const Step& step);
  void askInFolder(ObjectNumber folder, std::uint32_t choice);
  void askHidden(const Step& step);
  void noteAttribute(const Step& step);
  void askFor(FileID folder, const std::vector<Place>& places);

  bool _takesAttributes;
  JudgedStorage _judged;
  StepPlayer _player;
  bool _isOpen = false;
  /// True while the disk is as the catalog saw it last.
  bool _isSettled = false;
};

void Session::play(const Event& event) {
  if (event.kind != Event::Kind::Create) ensureOpen();
  if (failed()) return;
  switch (event.kind) {
    case Event::Kind::Create:
    case Event::Kind::Act:
      _player.play(event.step, _takesAttributes);
      _isSettled = false;
      return;
    case Event::Kind::Look:
      return look();
    case Event::Kind::ReopenAndLook:
      _judged.reopen();
      return look();
    case Event::Kind::Ask:
      return ask(event.step);
    case Event::Kind::AskHidden:
      return askHidden(event.step);
    case Event::Kind::NoteAttribute:
      return noteAttribute(event.step);
  }
}

void Session::ensureOpen() {
  if (!_isOpen) look();
}

void Session::look() {
  _judged.look();
  _isOpen = true;
  _isSettled = true;
}

void Session::askFor(FileID folder, const std::vector<Place>& places) {
  std::vector<linuxos::SeenObject> objects;
  std::string line = "ask for";
  for (const Place& place : places) {
    objects.push_back(place.seen);
    line += " " + shown(place.path().substr(_judged.storage.root().size() + 1));
  }
  const auto documentIDs = _judged.catalog().documentIDsOfObjects(folder, objects);
  if (!documentIDs)
    return _judged.judge().complain(line + ": " + documentIDs.error().description());
  for (const DocumentID documentID : *documentIDs) line += " #" + std::to_string(documentID.value);
  _judged.storage.note(line);
  _judged.judge().told(places, *documentIDs);
}

void Session::ask(const Step& step) {
  if (!_isSettled) return;
  const ObservedTree& tree = _judged.judge().lastSeen();
  std::vector<ObjectNumber> folders = {tree.root()};
  for (const Place& place : tree.places()) {
    if (place.isFolder() && place.standing == Standing::Shown) folders.push_back(place.object);
  }
  if (step.three % 3 != 0) folders = {folders[step.one % folders.size()]};
  for (const ObjectNumber folder : folders) askInFolder(folder, step.two);
}

void Session::askInFolder(ObjectNumber folder, std::uint32_t choice) {
  const ObservedTree& tree = _judged.judge().lastSeen();
  std::vector<Place> places;
  for (const Place& place : tree.places()) {
    if (place.home.folder != folder || !place.isDocument()) continue;
    // Some of a folder's documents: the others are asked for later, or never.
    choice = std::rotr(choice, 3);
    if (choice % 4 != 0) places.push_back(place);
  }
  const FileID folderID = folder == tree.root() ? seeObject(_judged.storage.root()).fileID
                                                : tree.placesOf(folder).front()->seen.fileID;
  if (!places.empty()) askFor(folderID, places);
}

void Session::askHidden(const Step& step) {
  if (!_isSettled) return;
  std::vector<Place> places;
  for (const Place& place : _judged.judge().lastSeen().places()) {
    if (place.standing == Standing::Hidden && place.isDocumentKind()) places.push_back(place);
  }
  if (places.empty()) return;
  const Place& place = places[step.one % places.size()];
  // One that has a name in view as well is asked for there.
  const auto names = _judged.judge().lastSeen().placesOf(place.object);
  if (std::ranges::any_of(names, [](const Place* name) { return name->isDocument(); })) return;
  askFor(seeObject(folderOf(place.path())).fileID, {place});
}

void Session::noteAttribute(const Step& step) {
  if (!_isSettled || !_takesAttributes) return;
  std::vector<Place> places;
  for (const Place& place : _judged.judge().lastSeen().places()) {
    if (place.isDocument()) places.push_back(place);
  }
  if (places.empty()) return;
  const Place& place = places[step.one % places.size()];
  const std::string name = chosen(kKeptAttributes, step.two);
  const std::string value = "noted " + std::to_string(step.three % 1000);
  _judged.storage.setAttribute(place.path(), name, value);
  const FndDataView bytes(reinterpret_cast<const std::uint8_t*>(value.data()), value.size());
  _judged.catalog().noteAttribute(place.seen.fileID, name, bytes);
  _judged.judge().attributesNoted(place.object, readAttributes(place.path()));
  _isSettled = false;  // its times are other ones now
}

}  // namespace

Stage stageIn(const std::string& parent) {
  const TestStorage storage(parent);
  const bool takes = ::lsetxattr(storage.root().c_str(), "user.test", "1", 1, 0) == 0;
  const std::string memory = "/dev/shm";
  return {parent, ::access(memory.c_str(), W_OK) == 0 ? memory : parent, takes};
}

Scenario drawScenario(std::uint64_t seed) {
  std::mt19937_64 random(seed);
  const auto anyStep = [&random] {
    return Step{0, static_cast<std::uint32_t>(random()), static_cast<std::uint32_t>(random()),
                static_cast<std::uint32_t>(random())};
  };
  Scenario scenario;
  for (auto count = 4 + random() % 10; count > 0; --count) {
    scenario.push_back({Event::Kind::Create, StepPlayer::drawCreation(random)});
  }
  for (auto rounds = 2 + random() % 5; rounds > 0; --rounds) {
    for (auto count = 1 + random() % 3; count > 0; --count) {
      scenario.push_back(
          {random() % 5 == 0 ? Event::Kind::AskHidden : Event::Kind::Ask, anyStep()});
    }
    if (random() % 4 == 0) scenario.push_back({Event::Kind::NoteAttribute, anyStep()});
    // What goes out of view often comes back, and is the same.
    if (random() % 2 == 0) {
      const Step step =
          random() % 2 == 0 ? StepPlayer::drawDeparture(random) : StepPlayer::drawReturn(random);
      scenario.push_back({Event::Kind::Act, step});
    }
    // Mostly few changes between two looks, where the table is clear; now and then many.
    const auto changes = random() % 8 == 0 ? 12 : 1 + random() % 4;
    for (auto count = changes; count > 0; --count) {
      scenario.push_back({Event::Kind::Act, StepPlayer::draw(random)});
    }
    const bool reopens = random() % 2 == 0;
    scenario.push_back({reopens ? Event::Kind::ReopenAndLook : Event::Kind::Look, {}});
  }
  return scenario;
}

ScenarioResult play(const Scenario& scenario, const Stage& stage) {
  Session session(stage);
  for (const Event& event : scenario) {
    session.play(event);
    if (session.failed()) return session.result();
  }
  session.finish();
  return session.result();
}

Scenario shrink(Scenario scenario, const std::function<bool(const Scenario&)>& fails) {
  for (std::size_t length = scenario.size() / 2; length > 0; length /= 2) {
    for (std::size_t start = 0; start + length <= scenario.size();) {
      Scenario shorter = scenario;
      const auto first = shorter.begin() + static_cast<std::ptrdiff_t>(start);
      shorter.erase(first, first + static_cast<std::ptrdiff_t>(length));
      if (fails(shorter)) {
        scenario = std::move(shorter);
      } else {
        start += length;
      }
    }
  }
  return scenario;
}

}  // namespace vantrell::properties
