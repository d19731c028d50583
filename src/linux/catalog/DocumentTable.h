#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "linux/catalog/Comparison.h"
#include "linux/catalog/Database.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// Where a document stood when it was last known to: a folder and a name; or, for an object out
/// of view, no folder (0) and the whole path.
struct Home {
  FileID parent;
  std::string name;

  static Home outOfView(std::string path) { return {FileID{}, std::move(path)}; }
  bool isOutOfView() const { return parent == FileID{}; }
};

/// One document that was ever given an ID.
struct Document {
  DocumentID documentID;
  ObjectID object;  ///< of file ID 0 when nothing can ever stand for it again
  Home home;
  bool isAlive = false;
  /// Its file has not got the attributes yet that came along from the file before.
  bool owesAttributes = false;
};

/// One attribute, with its name as the extension knows it.
struct Attribute {
  std::string name;
  FndData value;
  bool operator==(const Attribute&) const = default;
};

/// The documents in the database, and the attributes that they take along.
///
/// Errors of all members: POSIX, the database's, translated.
/// Threads: as its database. Lifetime: borrows the database.
class DocumentTable {
 public:
  explicit DocumentTable(Database& database) : _database(database) {}

  /// True when no ID was ever given.
  Result<bool> isEmpty();
  Result<std::optional<Document>> document(DocumentID documentID);
  /// The one document, alive or not, that the object stands or stood for.
  Result<std::optional<Document>> documentOfObject(const ObjectID& object);
  /// The living documents whose home is in the folder, by name.
  Result<std::vector<Document>> documentsOfFolder(FileID folder);
  Result<std::vector<Document>> documentsOutOfView();
  Result<std::vector<Document>> documentsThatOweAttributes();
  /// Adds a document, or replaces the row of its ID.
  Result<void> put(const Document& document);

  Result<std::vector<Attribute>> keptAttributes(DocumentID documentID);
  /// Replaces all of them.
  Result<void> keepAttributes(DocumentID documentID, const std::vector<Attribute>& attributes);
  /// Replaces, or forgets, one attribute of the living document that a file stands for.
  Result<void> noteAttribute(FileID fileID, std::string_view name,
                             std::optional<FndDataView> value);

 private:
  Result<std::vector<Document>> read(Statement& statement);
  Result<std::optional<Document>> readOne(Statement& statement);

  Database& _database;
  Statement _byID{_database,
                  "SELECT documentID, fileID, generation, homeParent, homeName, isAlive, "
                  "owesAttributes FROM documents WHERE documentID = ?1"};
  Statement _byObject{_database,
                      "SELECT documentID, fileID, generation, homeParent, homeName, isAlive, "
                      "owesAttributes FROM documents "
                      "WHERE fileID = ?1 AND generation = ?2 AND fileID <> 0"};
  Statement _byFolder{_database,
                      "SELECT documentID, fileID, generation, homeParent, homeName, isAlive, "
                      "owesAttributes FROM documents "
                      "WHERE homeParent = ?1 AND isAlive = 1 ORDER BY homeName"};
  Statement _owing{_database,
                   "SELECT documentID, fileID, generation, homeParent, homeName, isAlive, "
                   "owesAttributes FROM documents WHERE owesAttributes = 1 AND isAlive = 1"};
  Statement _put{_database,
                 "INSERT OR REPLACE INTO documents(documentID, fileID, generation, homeParent, "
                 "homeName, isAlive, owesAttributes) VALUES (?1, ?2, ?3, ?4, ?5, ?6, ?7)"};
  Statement _kept{_database, "SELECT name, value FROM kept WHERE documentID = ?1 ORDER BY name"};
  Statement _forgetAll{_database, "DELETE FROM kept WHERE documentID = ?1"};
  Statement _forgetOfFile{_database,
                          "DELETE FROM kept WHERE name = ?2 AND documentID IN "
                          "(SELECT documentID FROM documents WHERE fileID = ?1 AND fileID <> 0 "
                          "AND isAlive = 1)"};
  Statement _keepOfFile{_database,
                        "INSERT OR REPLACE INTO kept SELECT documentID, ?2, ?3 FROM documents "
                        "WHERE fileID = ?1 AND fileID <> 0 AND isAlive = 1"};
  Statement _keep{_database, "INSERT OR REPLACE INTO kept VALUES (?1, ?2, ?3)"};
};

}  // namespace vantrell::linuxos::catalog
