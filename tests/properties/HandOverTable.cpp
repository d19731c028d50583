#include "HandOverTable.h"

#include <algorithm>
#include <array>
#include <cctype>

namespace vantrell::properties {
namespace {

constexpr ObjectNumber kGone{};

/// What is inside a package is known, though nobody is shown it.
bool isCatalogued(const Place& place) {
  return place.standing == Standing::Shown || place.standing == Standing::InsidePackage;
}

}  // namespace

bool isSetAsideName(std::string_view name) {
  static constexpr std::array<std::string_view, 7> kEndings = {".bak",  ".orig", ".old", ".tmp",
                                                               ".temp", ".sav",  "~"};
  if (name.starts_with(".") || name.starts_with("~")) return true;
  if (name.size() > 1 && name.starts_with("#") && name.ends_with("#")) return true;
  std::string lower(name);
  std::ranges::transform(lower, lower.begin(),
                         [](unsigned char byte) { return static_cast<char>(std::tolower(byte)); });
  return std::ranges::any_of(kEndings, [&](auto ending) { return lower.ends_with(ending); });
}

Expectation HandOverTable::expectationFor(const TrackedDocument& document) const {
  Expectation expectation;
  if (document.object == kGone) {
    expectation.row = "gone for good";
    expectation.allowed = {kGone};
  } else if (!document.alive) {
    expectation.row = "was gone; ";
    expectItsObject(document, expectation);
  } else {
    for (const Home& home : document.homes) expectAtHome(document, home, expectation);
  }
  return expectation;
}

void HandOverTable::expectAtHome(const TrackedDocument& document, const Home& home,
                                 Expectation& expectation) const {
  const Place* lived = _before.at(home);
  if (lived != nullptr && lived->standing != Standing::Shown) {
    return expectOutOfView(document, home, expectation);
  }
  const Claim claim = claimOn(document, home, expectation.row);
  if (claim == Claim::No) return expectItsObject(document, expectation);
  const ObjectNumber arrived = _after.at(home)->object;
  expectation.allowed.insert(arrived);
  // Two documents may have a right to one object, when it has two names.
  const bool contested = claimOfOthers(document, arrived) != Claim::No;
  if (claim == Claim::May || contested) expectItsObject(document, expectation);
}

void HandOverTable::expectItsObject(const TrackedDocument& document,
                                    Expectation& expectation) const {
  const Claim others = claimOfOthers(document, document.object);
  const bool inView = !placesInView(document.object).empty();
  expectation.row += inView ? "its object is in view; " : "its object is not in view; ";
  if (inView && others != Claim::Must) expectation.allowed.insert(document.object);
  if (!inView || others != Claim::No) expectation.allowed.insert(kGone);
  if (others == Claim::No || !document.alive) return;
  // The table does not say whether a temporary file's own document, once the saved one has
  // taken the file, ends or goes on with what was left at its place.
  expectation.row += "another document claims its object; ";
  for (const Home& home : document.homes) {
    const Place* here = _after.at(home);
    if (here != nullptr && here->isDocument()) expectation.allowed.insert(here->object);
  }
}

void HandOverTable::expectOutOfView(const TrackedDocument& document, const Home& home,
                                    Expectation& expectation) const {
  expectation.row += "it lived out of view; ";
  if (!placesInView(document.object).empty()) return expectItsObject(document, expectation);
  const Place* here = _after.at(home);
  const bool stays = here != nullptr && here->object == document.object;
  if (stays) expectation.allowed.insert(document.object);
  if (stays && here->path() == _before.at(home)->path()) return;
  // Nobody looks there: the document may be found again, saved or lost.
  if (here != nullptr && here->isDocumentKind()) expectation.allowed.insert(here->object);
  if (!_after.placesOf(document.object).empty()) expectation.allowed.insert(document.object);
  expectation.allowed.insert(kGone);
}

HandOverTable::Claim HandOverTable::claimOn(const TrackedDocument& document, const Home& home,
                                            std::string& row) const {
  const Place* here = _after.at(home);
  if (here == nullptr || !here->isDocument()) {
    row += "row 2, 3 or 11; ";
    return Claim::No;
  }
  if (here->object == document.object) {
    row += "row 1; ";
    return Claim::No;
  }
  return placesInView(document.object).empty() ? claimWithItsObjectGone(*here, row)
                                               : claimWithItsObjectInView(document, *here, row);
}

HandOverTable::Claim HandOverTable::claimWithItsObjectInView(const TrackedDocument& document,
                                                             const Place& arrived,
                                                             std::string& row) const {
  bool keepsOldName = false;
  for (const Place* place : placesInView(document.object)) {
    if (wasCataloguedAt(place->home, document.object)) {
      keepsOldName = true;
    } else if (!isSetAsideName(place->home.name)) {
      row += "row 6 or 7; ";
      return Claim::No;
    }
  }
  const Claim fresh = isFresh(arrived.object);
  row += fresh == Claim::No ? "row 16; " : keepsOldName ? "row 10; " : "row 5 or 9; ";
  const TrackedDocument* owner = ownerOf(arrived.object);
  // A file with a name of its own beside the home that it came to has a right to its own ID.
  if (owner != nullptr && stillAtItsHome(*owner)) return std::min(fresh, Claim::May);
  return fresh;
}

HandOverTable::Claim HandOverTable::claimWithItsObjectGone(const Place& arrived,
                                                           std::string& row) const {
  const TrackedDocument* owner = ownerOf(arrived.object);
  const Claim freed = owner == nullptr ? Claim::Must : leavesItsObject(*owner);
  if (freed != Claim::No) {
    row += "row 4; ";
    return freed;
  }
  const Claim setAside = gotItsIDUnderSetAsideName(*owner);
  row += setAside == Claim::No ? "row 8; " : "row 8a; ";
  return stillAtItsHome(*owner) ? std::min(setAside, Claim::May) : setAside;
}

HandOverTable::Claim HandOverTable::claimOfOthers(const TrackedDocument& document,
                                                  ObjectNumber object) const {
  Claim strongest = Claim::No;
  std::string ignored;
  for (const TrackedDocument& other : _documents) {
    if (other.documentID == document.documentID || !other.alive) continue;
    for (const Home& home : other.homes) {
      const Place* here = _after.at(home);
      if (here == nullptr || here->object != object) continue;
      const bool certain = other.homes.size() == 1;
      const Claim claim = claimOn(other, home, ignored);
      strongest = std::max(strongest, certain ? claim : std::min(claim, Claim::May));
    }
  }
  return strongest;
}

HandOverTable::Claim HandOverTable::leavesItsObject(const TrackedDocument& document) const {
  if (!document.alive || placesInView(document.object).empty()) return Claim::No;
  Claim strongest = Claim::No, weakest = Claim::Must;
  std::string ignored;
  for (const Home& home : document.homes) {
    const Claim claim = claimOn(document, home, ignored);
    strongest = std::max(strongest, claim);
    weakest = std::min(weakest, claim);
  }
  return weakest == strongest ? strongest : Claim::May;
}

const TrackedDocument* HandOverTable::ownerOf(ObjectNumber object) const {
  for (const TrackedDocument& document : _documents) {
    if (document.object == object) return &document;
  }
  return nullptr;
}

HandOverTable::Claim HandOverTable::gotItsIDUnderSetAsideName(
    const TrackedDocument& document) const {
  bool all = true, any = false;
  for (const Home& home : document.homes) {
    const Place* lived = _before.at(home);
    const bool hidden = lived != nullptr && lived->standing == Standing::Hidden;
    const bool setAside = isSetAsideName(home.name);
    all = all && setAside;
    // In a hidden folder a file may be called anything.
    any = any || setAside || hidden;
  }
  if (!any) return Claim::No;
  return all ? Claim::Must : Claim::May;
}

HandOverTable::Claim HandOverTable::isFresh(ObjectNumber object) const {
  for (const Place* place : _before.placesOf(object)) {
    if (isCatalogued(*place) && !isSetAsideName(place->home.name)) return Claim::No;
  }
  const TrackedDocument* owner = ownerOf(object);
  return owner == nullptr ? Claim::Must : gotItsIDUnderSetAsideName(*owner);
}

bool HandOverTable::stillAtItsHome(const TrackedDocument& document) const {
  return std::ranges::any_of(document.homes, [&](const Home& home) {
    const Place* here = _after.at(home);
    return here != nullptr && here->object == document.object;
  });
}

std::vector<const Place*> HandOverTable::placesInView(ObjectNumber object) const {
  std::vector<const Place*> places = _after.placesOf(object);
  std::erase_if(places, [](const Place* place) { return !place->isDocument(); });
  return places;
}

bool HandOverTable::wasCataloguedAt(const Home& home, ObjectNumber object) const {
  const Place* place = _before.at(home);
  return place != nullptr && place->object == object && isCatalogued(*place);
}

std::set<Home> HandOverTable::homesAfter(const TrackedDocument& document,
                                         ObjectNumber object) const {
  const std::vector<const Place*> inView = placesInView(object);
  const auto mayLiveAt = [&inView](const Place& place) {
    return inView.empty() ? place.standing != Standing::OutsideRoots : place.isDocument();
  };
  std::set<Home> homes;
  bool certain = true;
  for (const Home& home : document.homes) {
    const Place* here = _after.at(home);
    if (here != nullptr && here->object == object && mayLiveAt(*here)) {
      homes.insert(home);
    } else {
      certain = false;
    }
  }
  if (certain && !homes.empty()) return homes;
  for (const Place* place : _after.placesOf(object)) {
    if (mayLiveAt(*place)) homes.insert(place->home);
  }
  return homes;
}

}  // namespace vantrell::properties
