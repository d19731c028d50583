#include "IdentityJudge.h"

#include <algorithm>
#include <cerrno>

namespace vantrell::properties {
namespace {

constexpr ObjectNumber kGone{};

std::string describe(DocumentID documentID) {
  return "document " + std::to_string(documentID.value);
}

std::string describe(ObjectNumber object, const ObservedTree& tree) {
  if (object == kGone) return "nothing";
  std::string text = "object " + std::to_string(object.value) + " (";
  for (const Place* place : tree.placesOf(object)) text += shown(place->path()) + " ";
  return text + ")";
}

bool hasAny(const Attributes& attributes, const std::string& name) {
  return attributes.find(name) != attributes.end();
}

}  // namespace

void JudgeCounts::add(const JudgeCounts& other) {
  looks += other.looks;
  documentsToldAnID += other.documentsToldAnID;
  certain += other.certain;
  uncertain += other.uncertain;
  handedOver += other.handedOver;
  moved += other.moved;
  gone += other.gone;
  cameBack += other.cameBack;
  attributesCarried += other.attributesCarried;
}

/// What became of one document.
struct IdentityJudge::Verdict {
  TrackedDocument before;
  ObjectNumber now;
  std::set<Home> homes;
  bool certain = false;

  bool isHandOver() const { return before.alive && now != kGone && now != before.object; }
};

void IdentityJudge::lookDone(linuxos::FileIndex& index, const ObservedTree& looked,
                             ObservedTree settled) {
  ++_counts.looks;
  const HandOverTable table(_lastSeen, looked, _documents);
  std::vector<Verdict> verdicts;
  for (const TrackedDocument& document : _documents) {
    verdicts.push_back(judgeDocument(index, table, settled, document));
    count(verdicts.back());
  }
  judgeAttributes(verdicts, looked, settled);
  follow(verdicts, settled);
  judgeDocumentPlaces(index, settled);
  judgePaths(index, settled);
  judgeFolderCounts(index, settled);
  _lastSeen = std::move(settled);
}

IdentityJudge::Verdict IdentityJudge::judgeDocument(linuxos::FileIndex& index,
                                                    const HandOverTable& table,
                                                    const ObservedTree& settled,
                                                    const TrackedDocument& document) {
  const Expectation expectation = table.expectationFor(document);
  Verdict verdict{document, kGone, document.homes, expectation.allowed.size() == 1};
  const auto fileID = index.fileIDOfDocument(document.documentID);
  if (fileID) {
    verdict.now = settled.objectWithFileID(*fileID);
    if (verdict.now == kGone) {
      complain(describe(document.documentID) + " is said to be file " +
               std::to_string(fileID->value) + ", which is not there");
    }
  } else if (!fileID.error().isPosix(ENOENT)) {
    complain(describe(document.documentID) + ": " + fileID.error().description());
  }
  if (verdict.now != kGone) verdict.homes = table.homesAfter(document, verdict.now);
  if (expectation.allowed.contains(verdict.now)) return verdict;
  std::string complaint = describe(document.documentID) + ", which was " +
                          (document.alive ? "" : "gone and had been ") +
                          describe(document.object, _lastSeen) + ", is now " +
                          describe(verdict.now, settled) + " but the table (" + expectation.row +
                          ") allows only:";
  for (const ObjectNumber allowed : expectation.allowed) {
    complaint += " " + describe(allowed, settled);
  }
  complain(complaint);
  return verdict;
}

void IdentityJudge::count(const Verdict& verdict) {
  ++(verdict.certain ? _counts.certain : _counts.uncertain);
  if (verdict.isHandOver()) ++_counts.handedOver;
  if (verdict.before.alive && verdict.now == kGone) ++_counts.gone;
  if (!verdict.before.alive && verdict.now != kGone) ++_counts.cameBack;
  if (verdict.now == verdict.before.object && verdict.homes != verdict.before.homes) {
    ++_counts.moved;
  }
}

void IdentityJudge::follow(const std::vector<Verdict>& verdicts, const ObservedTree& settled) {
  std::map<ObjectNumber, DocumentID> living;
  for (const Verdict& verdict : verdicts) {
    if (verdict.now == kGone) continue;
    const auto [other, isFirst] = living.emplace(verdict.now, verdict.before.documentID);
    if (!isFirst) {
      complain(describe(other->second) + " and " + describe(verdict.before.documentID) +
               " are both " + describe(verdict.now, settled));
    }
  }
  for (std::size_t at = 0; at < _documents.size(); ++at) {
    TrackedDocument& document = _documents[at];
    document.alive = verdicts[at].now != kGone;
    document.homes = verdicts[at].homes;
    if (document.alive) {
      document.object = verdicts[at].now;
      document.kept = settled.placesOf(document.object).front()->attributes;
    } else if (living.contains(document.object)) {
      document.object = kGone;  // its object is another document from now on
    }
  }
}

void IdentityJudge::judgeDocumentPlaces(linuxos::FileIndex& index, const ObservedTree& settled) {
  for (const Place& place : settled.places()) {
    if (!place.isDocument()) continue;
    const TrackedDocument* owner = ownerOf(place.object);
    const DocumentID expected = owner == nullptr ? DocumentID{} : owner->documentID;
    const DocumentID answer = index.documentIDOfObject(place.seen);
    if (answer == expected) continue;
    complain(shown(place.path()) + " is said to be " + describe(answer) + ", not " +
             describe(expected));
  }
}

void IdentityJudge::judgePaths(linuxos::FileIndex& index, const ObservedTree& settled) {
  for (const Place& place : settled.places()) {
    const auto path = index.pathForFileID(place.seen.fileID);
    const auto names = settled.placesOf(place.object);
    const bool isRight = path && std::ranges::any_of(names, [&](const Place* name) {
                           return name->path() == *path && name->standing != Standing::OutsideRoots;
                         });
    const bool inCatalog = std::ranges::any_of(
        names, [](const Place* name) { return name->standing == Standing::Shown; });
    if (isRight || (!path && !inCatalog && path.error().isPosix(ENOENT))) continue;
    complain("the path of " + describe(place.object, settled) + " is said to be " +
             (path ? shown(*path) : path.error().description()));
  }
}

void IdentityJudge::judgeFolderCounts(linuxos::FileIndex& index, const ObservedTree& settled) {
  std::map<ObjectNumber, std::uint64_t> counts;
  for (const Place& place : settled.places()) {
    if (place.standing == Standing::Shown) ++counts[place.home.folder];
  }
  for (const Place& place : settled.places()) {
    if (!place.isFolder()) continue;
    const auto count = index.entryCountOfFolder(place.seen.fileID);
    const std::uint64_t expected = counts[place.object];
    if (place.standing == Standing::Shown && count != expected) {
      complain(shown(place.path()) + " is said to hold " +
               (count ? std::to_string(*count) : "nothing known") + ", not " +
               std::to_string(expected) + " entries");
    }
    const bool mustBeUnknown =
        place.standing == Standing::Hidden || place.standing == Standing::OutsideRoots;
    if (mustBeUnknown && count) complain(shown(place.path()) + " is counted, but out of view");
  }
}

void IdentityJudge::judgeAttributes(const std::vector<Verdict>& verdicts,
                                    const ObservedTree& looked, const ObservedTree& settled) {
  std::map<ObjectNumber, const Verdict*> handOvers;
  for (const Verdict& verdict : verdicts) {
    if (verdict.isHandOver()) handOvers.emplace(verdict.now, &verdict);
  }
  for (std::size_t at = 0; at < settled.places().size(); ++at) {
    const Place& place = settled.places()[at];
    const auto handOver = handOvers.find(place.object);
    if (handOver != handOvers.end()) {
      judgeCarried(*handOver->second, looked, place);
    } else if (place.attributes != looked.places()[at].attributes) {
      complain("a look changed the attributes of " + shown(place.path()));
    }
  }
}

void IdentityJudge::judgeCarried(const Verdict& verdict, const ObservedTree& looked,
                                 const Place& settled) {
  const Attributes& had = looked.at(settled.home)->attributes;
  const auto formerPlaces = looked.placesOf(verdict.before.object);
  // While the old object is there, what it carries now is as good as what it carried before.
  const Attributes stillThere =
      formerPlaces.empty() ? Attributes{} : formerPlaces.front()->attributes;
  for (const auto& [name, value] : had) {
    if (!hasAny(settled.attributes, name) || settled.attributes.at(name) != value) {
      complain("a look changed " + name + " of " + shown(settled.path()));
    }
  }
  for (const auto& [name, value] : verdict.before.kept) {
    if (!linuxos::isKeptAcrossSafeSave(name) || hasAny(had, name)) continue;
    const bool wasRemoved = !formerPlaces.empty() && !hasAny(stillThere, name);
    if (!hasAny(settled.attributes, name) && !wasRemoved) {
      complain(describe(verdict.before.documentID) + " lost " + name + " on its way to " +
               shown(settled.path()));
    }
  }
  for (const auto& [name, value] : settled.attributes) {
    if (hasAny(had, name)) continue;
    ++_counts.attributesCarried;
    const auto kept = verdict.before.kept.find(name);
    const auto current = stillThere.find(name);
    const bool isKept = kept != verdict.before.kept.end() && kept->second == value;
    const bool isCurrent = current != stillThere.end() && current->second == value;
    if (!linuxos::isKeptAcrossSafeSave(name) || !(isKept || isCurrent)) {
      complain(shown(settled.path()) + " was given " + name + " = " + shown(value));
    }
  }
}

TrackedDocument* IdentityJudge::ownerOf(ObjectNumber object) {
  for (TrackedDocument& document : _documents) {
    if (document.object == object && document.alive) return &document;
  }
  return nullptr;
}

void IdentityJudge::told(const std::vector<Place>& places,
                         const std::vector<DocumentID>& documentIDs) {
  if (places.size() != documentIDs.size()) return complain("a question was answered in part");
  for (std::size_t at = 0; at < places.size(); ++at) {
    const Place& place = places[at];
    const DocumentID documentID = documentIDs[at];
    ++_counts.documentsToldAnID;
    const auto known = std::ranges::find(_documents, place.object, &TrackedDocument::object);
    if (documentID == DocumentID{}) {
      complain(shown(place.path()) + " got no ID");
    } else if (known != _documents.end()) {
      if (known->documentID != documentID) {
        complain(shown(place.path()) + " is " + describe(known->documentID) + " but was told " +
                 describe(documentID));
      }
      if (!known->alive) known->homes = {place.home};
      known->alive = true;
      known->kept = place.attributes;
    } else if (!_toldEver.insert(documentID).second) {
      complain(shown(place.path()) + " was told " + describe(documentID) +
               ", which had been another's");
    } else {
      _documents.push_back({documentID, place.object, true, {place.home}, place.attributes});
    }
  }
}

void IdentityJudge::attributesNoted(ObjectNumber object, const Attributes& attributes) {
  if (TrackedDocument* document = ownerOf(object)) document->kept = attributes;
}

}  // namespace vantrell::properties
