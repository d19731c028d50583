#include "linux/catalog/DocumentFates.h"

#include <algorithm>

#include "linux/catalog/EntryKind.h"
#include "linux/catalog/Names.h"

namespace vantrell::linuxos::catalog {

namespace {

static_assert(static_cast<int>(Fate::HandsOver) == 1, "the statements know the number");
static_assert(static_cast<int>(Fate::Follows) == 0 && static_cast<int>(Fate::Gone) == 2);

// fate: NULL while it is open, else a `Fate`; 3 for a document whose object another one has
// taken. `to...` is the object that the document stands for afterwards, and its home.
constexpr const char* kTable = R"sql(
CREATE TEMP TABLE IF NOT EXISTS candidates(
  documentID INTEGER PRIMARY KEY, fileID INTEGER, generation INTEGER, homeParent INTEGER,
  homeName BLOB, wasAlive INTEGER, fate INTEGER, toFileID INTEGER, toGeneration INTEGER,
  toParent INTEGER, toName BLOB);
CREATE INDEX IF NOT EXISTS temp.candidatesByTaken ON candidates(toFileID) WHERE fate = 1;
DELETE FROM temp.candidates;
)sql";

// CROSS JOIN keeps the order: the differences are few, the documents may be many.
constexpr const char* kCollect = R"sql(
INSERT OR IGNORE INTO temp.candidates
  SELECT d.documentID, d.fileID, d.generation, d.homeParent, d.homeName, 1, NULL, 0, 0, 0, x''
  FROM temp.differences x CROSS JOIN main.documents d
    ON d.homeParent = x.parent AND d.homeName = x.name AND d.isAlive = 1
  WHERE x.oldFileID = d.fileID;
INSERT OR IGNORE INTO temp.candidates
  SELECT d.documentID, d.fileID, d.generation, d.homeParent, d.homeName, 0, NULL, 0, 0, 0, x''
  FROM temp.differences x CROSS JOIN main.documents d
    ON d.fileID = x.newFileID AND d.generation = x.newGeneration AND d.fileID <> 0
  WHERE x.newFileID <> 0 AND d.isAlive = 0;
)sql";

// Everybody lets go first, because no two documents may stand for one object at any moment.
constexpr const char* kApply = R"sql(
UPDATE temp.candidates AS c SET fate = 3 WHERE fate <> 1 AND EXISTS (
  SELECT 1 FROM temp.candidates t
  WHERE t.fate = 1 AND t.toFileID = c.fileID AND t.toGeneration = c.generation);
UPDATE main.documents SET isAlive = 0
  WHERE documentID IN (SELECT documentID FROM temp.candidates);
UPDATE main.documents SET fileID = 0, generation = 0, owesAttributes = 0
  WHERE documentID IN (SELECT documentID FROM temp.candidates WHERE fate IN (1, 3));
UPDATE main.documents AS d SET isAlive = 1, fileID = c.toFileID, generation = c.toGeneration,
    homeParent = c.toParent, homeName = c.toName,
    owesAttributes = (c.fate = 1 OR d.owesAttributes)
  FROM temp.candidates c WHERE c.documentID = d.documentID AND c.fate IN (0, 1);
DELETE FROM main.kept
  WHERE documentID IN (SELECT documentID FROM temp.candidates WHERE fate = 3);
)sql";

constexpr const char* kCounts =
    "SELECT coalesce(sum(fate = 1), 0), coalesce(sum(fate = 0 AND wasAlive = 0), 0), "
    "coalesce(sum(fate IN (2, 3) AND wasAlive = 1), 0) FROM temp.candidates";

Result<bool> answersARow(Statement& statement) {
  const auto row = statement.step();
  if (!row) return std::unexpected(row.error());
  statement.reset();
  return *row;
}

bool isSetAsideHome(const Home& home) { return home.isOutOfView() || isSetAsideName(home.name); }

}  // namespace

Result<DocumentCounts> DocumentFates::decide(const StandsAt& standsAt) {
  if (auto collected = collect(standsAt); !collected) return std::unexpected(collected.error());
  if (auto decided = decideThoseInView(); !decided) return std::unexpected(decided.error());
  if (auto decided = decideThoseOutOfView(); !decided) return std::unexpected(decided.error());
  return apply();
}

Result<void> DocumentFates::collect(const StandsAt& standsAt) {
  if (auto made = _database.execute(kTable); !made) return made;
  if (auto collected = _database.execute(kCollect); !collected) return collected;
  const auto hidden = _documents.documentsOutOfView();
  if (!hidden) return std::unexpected(hidden.error());
  for (const Document& document : *hidden) {
    if (standsAt(document.home.name, document.object)) continue;
    if (auto added = _addCandidate.with(document.documentID).run(); !added) return added;
  }
  return {};
}

// Whether an object whose own document goes on with another one is free for a third one is only
// known when all of the former are decided; so those whose files are still there come first.
Result<void> DocumentFates::decideThoseInView() {
  for (DocumentID last;;) {
    const auto next = nextCandidate(last);
    if (!next) return std::unexpected(next.error());
    if (!*next) return {};
    last = (*next)->documentID;
    if (auto decided = decideOne(**next, false); !decided) return decided;
  }
}

Result<void> DocumentFates::decideThoseOutOfView() {
  for (DocumentID last;;) {
    const auto next = nextCandidate(last);
    if (!next) return std::unexpected(next.error());
    if (!*next) return {};
    last = (*next)->documentID;
    if (auto decided = decideOne(**next, true); !decided) return decided;
  }
}

Result<void> DocumentFates::decideOne(const Document& document, bool isOutOfViewTurn) {
  const auto places = placesOf(document.object);
  if (!places) return std::unexpected(places.error());
  const Whereabouts whereabouts = whereaboutsOf(*places);
  if ((whereabouts == Whereabouts::OutOfView) != isOutOfViewTurn) return {};
  const auto object = objectAt(document.home);
  if (!object) return std::unexpected(object.error());
  const bool isAtHome = *object && **object == document.object;
  if (isAtHome) return setFate(document.documentID, Fate::Follows, document.object, document.home);
  Occupant occupant = Occupant::None;
  // One that was gone has lost its home; it can only come back where its own object is.
  if (*object && document.isAlive) {
    const auto found = occupantOf(**object);
    if (!found) return std::unexpected(found.error());
    occupant = *found;
  }
  const Fate fate = fateOf(whereabouts, occupant);
  if (fate == Fate::HandsOver) {
    return setFate(document.documentID, fate, **object, document.home);
  }
  const Home& home = fate == Fate::Follows ? bestHome(*places) : document.home;
  return setFate(document.documentID, fate, document.object, home);
}

Result<DocumentCounts> DocumentFates::apply() {
  if (auto applied = _database.execute(kApply); !applied) return std::unexpected(applied.error());
  Statement counts(_database, kCounts);
  const auto row = counts.with().step();
  if (!row) return std::unexpected(row.error());
  return DocumentCounts{counts.bits(0), counts.bits(1), counts.bits(2)};
}

Result<std::optional<Document>> DocumentFates::nextCandidate(DocumentID after) {
  const auto row = _nextCandidate.with(after).step();
  if (!row) return std::unexpected(row.error());
  if (!*row) return std::nullopt;
  Document document{_nextCandidate.documentID(0),
                    {_nextCandidate.fileID(1), _nextCandidate.bits(2)},
                    {_nextCandidate.fileID(3), std::string(_nextCandidate.bytes(4))},
                    _nextCandidate.integer(5) != 0};
  _nextCandidate.reset();
  return document;
}

Result<std::vector<DocumentFates::Place>> DocumentFates::placesOf(const ObjectID& object) {
  std::vector<Place> places;
  _places.with(object.fileID, object.generation);
  for (;;) {
    const auto row = _places.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return places;
    Home home{_places.fileID(0), std::string(_places.bytes(1))};
    const bool isSetAside = isSetAsideName(home.name);
    places.push_back({std::move(home), _places.integer(2) != 0, isSetAside});
  }
}

Whereabouts DocumentFates::whereaboutsOf(const std::vector<Place>& places) {
  if (places.empty()) return Whereabouts::OutOfView;
  const auto isRename = [](const Place& place) { return place.isNew && !place.isSetAside; };
  if (std::ranges::any_of(places, isRename)) return Whereabouts::Renamed;
  return std::ranges::all_of(places, &Place::isNew) ? Whereabouts::MovedAside
                                                    : Whereabouts::KeptElsewhere;
}

const Home& DocumentFates::bestHome(const std::vector<Place>& places) {
  const auto rank = [](const Place& place) {
    return (place.isSetAside ? 2 : 0) + (place.isNew ? 0 : 1);
  };
  return std::ranges::min_element(places, {}, rank)->home;
}

Result<std::optional<ObjectID>> DocumentFates::objectAt(const Home& home) {
  if (home.isOutOfView()) return std::nullopt;
  const auto row = _objectAt.with(home.parent, home.name).step();
  if (!row) return std::unexpected(row.error());
  if (!*row) return std::nullopt;
  const ObjectID object{_objectAt.fileID(0), _objectAt.bits(1)};
  _objectAt.reset();
  return object;
}

Result<Occupant> DocumentFates::occupantOf(const ObjectID& object) {
  const auto claimed = isClaimed(object);
  if (!claimed) return std::unexpected(claimed.error());
  if (*claimed) return Occupant::Claimed;
  const auto known = hadOrdinaryName(object);
  if (!known) return std::unexpected(known.error());
  return *known ? Occupant::Unclaimed : Occupant::Fresh;
}

Result<bool> DocumentFates::isClaimed(const ObjectID& object) {
  const auto taken = isTaken(object);
  if (!taken || *taken) return taken;
  const auto own = _documents.documentOfObject(object);
  if (!own) return std::unexpected(own.error());
  if (!*own) return false;
  const Document& owner = **own;
  const auto handsOver = answersARow(_handsOver.with(owner.documentID));
  if (!handsOver) return std::unexpected(handsOver.error());
  if (*handsOver) return false;  // it goes on with another object, and leaves this one
  if (!isSetAsideHome(owner.home)) return true;
  // An ID that was told under a temporary name counts for nothing once the name is left.
  if (!owner.isAlive) return false;
  const auto left = answersARow(_isCandidate.with(owner.documentID));
  if (!left) return std::unexpected(left.error());
  return !*left;
}

Result<bool> DocumentFates::hadOrdinaryName(const ObjectID& object) {
  _formerNames.with(object.fileID, object.generation);
  for (;;) {
    const auto row = _formerNames.step();
    if (!row) return std::unexpected(row.error());
    if (!*row) return false;
    if (isSetAsideName(_formerNames.bytes(0))) continue;
    _formerNames.reset();
    return true;
  }
}

Result<bool> DocumentFates::isTaken(const ObjectID& object) {
  return answersARow(_isTaken.with(object.fileID, object.generation));
}

Result<void> DocumentFates::setFate(DocumentID documentID, Fate fate, const ObjectID& object,
                                    const Home& home) {
  return _setFate
      .with(documentID, static_cast<int>(fate), object.fileID, object.generation, home.parent,
            home.name)
      .run();
}

}  // namespace vantrell::linuxos::catalog
