#pragma once

#include <set>
#include <string>
#include <string_view>
#include <vector>

#include "ObservedTree.h"

namespace vantrell::properties {

/// What the test knows of one document that was told an ID.
struct TrackedDocument {
  DocumentID documentID;
  /// The object that is the document, or was when it went. None for one that can never come
  /// back, because its object has become another document.
  ObjectNumber object;
  bool alive = true;
  /// Where it lives, or lived. More than one where hard links leave the choice to the catalog.
  std::set<Home> homes;
  /// The attributes of its object when the catalog last looked at it.
  Attributes kept;
};

/// Which objects may be a document after a look; no object (0) for a document that is gone.
struct Expectation {
  std::set<ObjectNumber> allowed;
  std::string row;  ///< the rows of the table that were found to fit, for messages
};

/// The table of safe saves of docs/guarantees.md, told from the outside: what two looks at the
/// disk must make of one document, whatever happened in between. Where the table leaves a
/// choice, more than one outcome is allowed.
///
/// Threads: use from one thread. Lifetime: borrows all it is made with.
class HandOverTable {
 public:
  HandOverTable(const ObservedTree& before, const ObservedTree& after,
                const std::vector<TrackedDocument>& documents)
      : _before(before), _after(after), _documents(documents) {}

  Expectation expectationFor(const TrackedDocument& document) const;
  /// The homes that a document may have now that it is known to be `object`.
  std::set<Home> homesAfter(const TrackedDocument& document, ObjectNumber object) const;

 private:
  /// Whether a document takes over the object that now stands at its home.
  enum class Claim { No, May, Must };

  void expectAtHome(const TrackedDocument& document, const Home& home,
                    Expectation& expectation) const;
  void expectItsObject(const TrackedDocument& document, Expectation& expectation) const;
  void expectOutOfView(const TrackedDocument& document, const Home& home,
                       Expectation& expectation) const;
  Claim claimOn(const TrackedDocument& document, const Home& home, std::string& row) const;
  Claim claimWithItsObjectInView(const TrackedDocument& document, const Place& arrived,
                                 std::string& row) const;
  Claim claimWithItsObjectGone(const Place& arrived, std::string& row) const;
  Claim claimOfOthers(const TrackedDocument& document, ObjectNumber object) const;
  /// Whether rows 5, 9 or 10 take the document away from its object.
  Claim leavesItsObject(const TrackedDocument& document) const;

  const TrackedDocument* ownerOf(ObjectNumber object) const;
  Claim gotItsIDUnderSetAsideName(const TrackedDocument& document) const;
  Claim isFresh(ObjectNumber object) const;
  bool stillAtItsHome(const TrackedDocument& document) const;
  std::vector<const Place*> placesInView(ObjectNumber object) const;
  bool wasCataloguedAt(const Home& home, ObjectNumber object) const;

  const ObservedTree& _before;
  const ObservedTree& _after;
  const std::vector<TrackedDocument>& _documents;
};

/// True for names that programs give to backups and to files they are still writing.
bool isSetAsideName(std::string_view name);

}  // namespace vantrell::properties
