#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <string>
#include <vector>

#include "linux/catalog/Database.h"
#include "linux/catalog/DocumentRules.h"
#include "linux/catalog/DocumentTable.h"
#include "platform/foundation/FndError.h"

namespace vantrell::linuxos::catalog {

/// What a look did to the documents.
struct DocumentCounts {
  std::uint64_t handedOver = 0;
  std::uint64_t returned = 0;
  std::uint64_t gone = 0;
};

/// Lets the documents follow what a look has found, by the table in docs/guarantees.md. It works
/// in the look's transaction, on the entries as they are now and the `Differences` that say what
/// they were; what it decides waits in a temporary table until everything is decided, so that no
/// decision sees half of the others.
///
/// Errors: POSIX, the database's, translated.
/// Threads: as its database. Lifetime: borrows the database and the documents.
class DocumentFates {
 public:
  /// Says whether the object still stands at the path of its home out of view.
  using StandsAt = std::function<bool(const std::string& path, const ObjectID& object)>;

  DocumentFates(Database& database, DocumentTable& documents)
      : _database(database), _documents(documents) {}

  Result<DocumentCounts> decide(const StandsAt& standsAt);

 private:
  /// A document whose home does not hold its file any more, or one that has come back.
  struct Candidate {
    Document document;
    Fate fate = Fate::Gone;
  };
  struct Place {
    Home home;
    bool isNew = false;
    bool isSetAside = false;
  };

  Result<void> collect(const StandsAt& standsAt);
  Result<void> decideThoseInView();
  Result<void> decideThoseOutOfView();
  Result<void> decideOne(const Document& document, bool isOutOfViewTurn);
  Result<DocumentCounts> apply();

  Result<std::optional<Document>> nextCandidate(DocumentID after);
  Result<std::vector<Place>> placesOf(const ObjectID& object);
  static Whereabouts whereaboutsOf(const std::vector<Place>& places);
  /// The document-kind object at the home; none for nothing, or something that is no document.
  Result<std::optional<ObjectID>> objectAt(const Home& home);
  Result<Occupant> occupantOf(const ObjectID& object);
  Result<bool> isClaimed(const ObjectID& object);
  Result<bool> hadOrdinaryName(const ObjectID& object);
  Result<bool> isTaken(const ObjectID& object);
  Result<void> setFate(DocumentID documentID, Fate fate, const ObjectID& object, const Home& home);
  static const Home& bestHome(const std::vector<Place>& places);

  Database& _database;
  DocumentTable& _documents;
  Statement _addCandidate{_database,
                          "INSERT OR IGNORE INTO temp.candidates "
                          "SELECT documentID, fileID, generation, homeParent, homeName, "
                          "isAlive, NULL, 0, 0, 0, x'' FROM documents "
                          "WHERE documentID = ?1"};
  Statement _nextCandidate{_database,
                           "SELECT documentID, fileID, generation, homeParent, homeName, wasAlive "
                           "FROM temp.candidates WHERE documentID > ?1 AND fate IS NULL "
                           "ORDER BY documentID LIMIT 1"};
  Statement _setFate{_database,
                     "UPDATE temp.candidates SET fate = ?2, toFileID = ?3, toGeneration = ?4, "
                     "toParent = ?5, toName = ?6 WHERE documentID = ?1"};
  Statement _places{
      _database,
      "SELECT parent, name, EXISTS (SELECT 1 FROM temp.differences d WHERE d.parent = e.parent "
      "AND d.name = e.name AND d.newFileID = e.fileID "
      "AND (d.oldFileID <> d.newFileID OR d.oldGeneration <> d.newGeneration)) "
      "FROM main.entries e WHERE fileID = ?1 AND generation = ?2 AND " VANTRELL_SQL_IS_DOCUMENT
      " ORDER BY parent, name"};
  Statement _objectAt{
      _database,
      "SELECT fileID, generation FROM main.entries WHERE parent = ?1 AND name = ?2 "
      "AND " VANTRELL_SQL_IS_DOCUMENT
      " AND NOT EXISTS (SELECT 1 FROM temp.differences d WHERE d.parent = ?1 AND d.name = ?2 "
      "AND d.isRecycled = 1)"};
  Statement _formerNames{
      _database,
      "SELECT name FROM temp.differences WHERE oldFileID = ?1 AND oldGeneration = ?2 "
      "UNION ALL SELECT name FROM main.entries e WHERE fileID = ?1 AND generation = ?2 "
      "AND NOT EXISTS (SELECT 1 FROM temp.differences d WHERE d.parent = e.parent "
      "AND d.name = e.name AND d.newFileID = ?1)"};
  Statement _isTaken{_database,
                     "SELECT 1 FROM temp.candidates WHERE toFileID = ?1 AND toGeneration = ?2 "
                     "AND fate = 1"};
  Statement _isCandidate{_database, "SELECT 1 FROM temp.candidates WHERE documentID = ?1"};
  Statement _handsOver{_database,
                       "SELECT 1 FROM temp.candidates WHERE documentID = ?1 AND fate = 1"};
};

}  // namespace vantrell::linuxos::catalog
