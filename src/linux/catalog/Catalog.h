#pragma once

#include <chrono>
#include <cstdint>
#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "linux/catalog/FileIndex.h"
#include "platform/foundation/FndError.h"
#include "platform/log/LogSink.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::linuxos {

/// Where a catalog keeps its state, and what it looks at.
struct CatalogOptions {
  /// Made when it is missing.
  std::string stateFolder;
  /// Canonical paths; the first is the storage root. Roots on another volume than the storage
  /// root's are left out, with an error line.
  std::vector<std::string> roots;
  /// Tells packages from folders; borrowed for as long as the catalog lives.
  const TypeRegistry& types;
  /// Takes finished lines; called from whichever thread uses the catalog. May be empty.
  std::function<void(LogLevel, const std::string&)> log;
};

/// What one look at the disk found to be different from the catalog.
struct LookReport {
  std::uint64_t entriesSeen = 0;
  std::uint64_t created = 0;   ///< names with an object that was not catalogued
  std::uint64_t gone = 0;      ///< names of objects that are nowhere any more
  std::uint64_t moved = 0;     ///< names of objects that were catalogued under another name
  std::uint64_t changed = 0;   ///< same name, same object, other content or attributes
  std::uint64_t replaced = 0;  ///< names that were there and now stand for another object

  std::uint64_t documentsHandedOver = 0;
  std::uint64_t documentsReturned = 0;
  std::uint64_t documentsGone = 0;

  std::uint64_t unreadableFolderCount = 0;
  /// The paths of the first of them, missing roots among them; what was known of them is kept.
  std::vector<std::string> unreadableFolders;

  std::chrono::microseconds duration{0};
};

/// What a person who looks after the system wants to know of its catalog.
struct CatalogStatistics {
  std::uint64_t entries = 0;
  std::uint64_t folders = 0;
  std::uint64_t documents = 0;  ///< those that a file stands for now
  std::uint64_t databaseBytes = 0;
  std::uint32_t schemaVersion = 0;
  DocumentID highestDocumentID;
  std::chrono::system_clock::time_point lastLook{};  ///< the epoch when there was none
  std::chrono::microseconds lastLookDuration{0};
  std::uint64_t unreadableFolders = 0;  ///< at the last look
};

/// Every entry below the roots, and the documents among them, in one database.
///
/// The catalog holds what the last look saw. A look compares folder by folder and writes the
/// differences in one transaction; the documents follow their files by the table in
/// docs/guarantees.md. Between looks, questions that the disk answers differently make it look
/// again at the folders that changed, before they are answered.
///
/// Not catalogued: names that begin with "." and what lies below them (but for a folder ".Trash"
/// directly in a root or in a folder named "Documents"), and what lies on another volume.
///
/// Threads: all members may be called from any thread; they take turns.
/// Lifetime: borrows the type registry. Destroying it marks the database as cleanly closed.
class Catalog final : public FileIndex {
 public:
  /// Opens or makes the database. A damaged one is set aside and a new one begun, with an error
  /// line. Errors: StateUnavailable, with what to do, when the state folder cannot be used or the
  /// database is another program's or a newer version's; POSIX.
  static Result<std::unique_ptr<Catalog>> open(CatalogOptions options);

  ~Catalog() override;

  /// Compares everything below the roots with the catalog and writes down what differs. What
  /// cannot be read is kept as it was known. Errors: POSIX (the database's, translated); the
  /// catalog is then what it was before.
  Result<LookReport> look();

  Result<CatalogStatistics> statistics();

  Result<std::string> pathForFileID(FileID fileID) override;
  std::optional<std::uint64_t> entryCountOfFolder(FileID folder) override;
  DocumentID documentIDOfObject(const SeenObject& object) override;
  /// As `FileIndex` says; 0 for an object that is gone by now or lies on another volume.
  Result<std::vector<DocumentID>> documentIDsOfObjects(
      FileID folder, std::span<const SeenObject> documents) override;
  Result<FileID> fileIDOfDocument(DocumentID documentID) override;
  void noteSeen(const SeenObject& object) override;
  void noteAttribute(FileID fileID, std::string_view name,
                     std::optional<FndDataView> value) override;

 private:
  class State;
  explicit Catalog(std::unique_ptr<State> state);

  std::unique_ptr<State> _state;
};

}  // namespace vantrell::linuxos
