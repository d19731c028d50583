#include "linux/catalog/Catalog.h"

#include <sys/stat.h>

#include <cerrno>
#include <filesystem>
#include <utility>

#include "linux/PosixError.h"
#include "linux/catalog/DocumentLookup.h"
#include "linux/catalog/Look.h"
#include "linux/catalog/PathLookup.h"
#include "linux/catalog/Paths.h"
#include "linux/catalog/Schema.h"
#include "linux/catalog/Store.h"
#include "linux/catalog/View.h"
#include "platform/foundation/Mutex.h"

namespace vantrell::linuxos {

using catalog::DocumentLookup;
using catalog::Look;
using catalog::LookScope;
using catalog::PathLookup;
using catalog::Store;
using catalog::View;

namespace {

constexpr const char* kDatabaseName = "/vantrell.db";
constexpr const char* kNumbersName = "/document-ids";

Result<void> makeStateFolder(const std::string& folder) {
  std::error_code failure;
  const bool isNew = std::filesystem::create_directories(folder, failure);
  // It holds the names of all documents, which are nobody else's business.
  if (isNew && !failure) {
    std::filesystem::permissions(folder, std::filesystem::perms::owner_all, failure);
  }
  if (!failure) return {};
  return std::unexpected(catalog::stateUnavailable(
      "can't make the state folder \"" + folder + "\": " + failure.message() +
      ". Choose another one, or make it and give it to this user."));
}

}  // namespace

/// Everything that a catalog holds, under its lock.
class Catalog::State {
 public:
  explicit State(CatalogOptions given) : _options(std::move(given)) {
    if (!_options.log) _options.log = [](LogLevel, const std::string&) {};
    _view.lookAgain = [this]() -> Result<void> {
      const auto report = runLook(LookScope::ChangedFolders);
      if (!report) return std::unexpected(report.error());
      return {};
    };
  }

  ~State() {
    // Whoever saw damage leaves the check to the next start.
    if (!_store || _store->database->sawDamage()) return;
    const auto stopped = stopCleanly();
    if (!stopped) report("can't close the catalog in good order", stopped.error());
  }

  Result<void> openStore() {
    auto opened = catalog::openDatabase(databasePath(), _options.log);
    if (!opened) return std::unexpected(opened.error());
    _store =
        std::make_unique<Store>(std::move(opened->database), _options.stateFolder + kNumbersName,
                                storageRoot(), _options.log);
    _paths.emplace(*_store, _view);
    _documents.emplace(*_store, _view);
    return restoreView();
  }

  Result<LookReport> look() {
    auto report = runLook(LookScope::Everything);
    if (report || !_store->database->sawDamage()) return report;
    // Better to know nothing and to learn it again than to be of no use until somebody comes.
    closeStore();
    auto aside = catalog::setAsideDamaged(databasePath(), _options.log);
    if (!aside) return std::unexpected(aside.error());
    if (auto opened = openStore(); !opened) return std::unexpected(opened.error());
    return runLook(LookScope::Everything);
  }

  Result<CatalogStatistics> statistics();

  Mutex mutex;
  Store& store() { return *_store; }
  PathLookup& paths() { return *_paths; }
  DocumentLookup& documents() { return *_documents; }
  void report(const std::string& what, const FndError& error) const {
    _options.log(LogLevel::Error, what + "; " + error.description());
  }

 private:
  std::string databasePath() const { return _options.stateFolder + kDatabaseName; }
  std::string storageRoot() const {
    return _options.roots.empty() ? std::string() : _options.roots.front();
  }

  Result<void> stopCleanly() {
    auto transaction = catalog::Transaction::begin(*_store->database);
    if (!transaction) return std::unexpected(transaction.error());
    if (auto released = _store->numbers.release(); !released) return released;
    if (auto noted = _store->state.noteCleanStop(); !noted) return noted;
    return transaction->commit();
  }

  void closeStore() {
    _documents.reset();
    _paths.reset();
    _store.reset();
  }

  /// Before the first look of this process, what the last one has left behind is answered from.
  Result<void> restoreView() {
    auto roots = _store->entries.roots();
    if (!roots) return std::unexpected(roots.error());
    _view.roots = std::move(*roots);
    const auto root = catalog::objectStandingAt(storageRoot());
    if (root) _view.device = root->device;
    return {};
  }

  Result<LookReport> runLook(LookScope scope) {
    Look look(*_store, {_options.roots, _options.types, _options.log}, scope);
    auto report = look.run();
    _documents->forget();
    if (!report) return report;
    _view.roots = look.roots();
    if (look.device() != DeviceID{}) _view.device = look.device();
    return report;
  }

  CatalogOptions _options;
  View _view;
  std::unique_ptr<Store> _store;
  std::optional<PathLookup> _paths;
  std::optional<DocumentLookup> _documents;
};

Result<CatalogStatistics> Catalog::State::statistics() {
  CatalogStatistics statistics;
  const std::pair<const char*, std::uint64_t*> counts[] = {
      {"SELECT count(*) FROM entries", &statistics.entries},
      {"SELECT count(*) FROM folders", &statistics.folders},
      {"SELECT count(*) FROM documents WHERE isAlive = 1", &statistics.documents}};
  for (const auto& [sql, count] : counts) {
    const auto number = _store->database->integer(sql);
    if (!number) return std::unexpected(number.error());
    *count = static_cast<std::uint64_t>(*number);
  }
  const auto highest = _store->database->integer("SELECT max(documentID) FROM documents");
  if (!highest) return std::unexpected(highest.error());
  const auto last = _store->state.lastLook();
  if (!last) return std::unexpected(last.error());
  for (const char* suffix : {"", "-wal"}) {
    struct stat status {};
    if (::stat((databasePath() + suffix).c_str(), &status) == 0) {
      statistics.databaseBytes += static_cast<std::uint64_t>(status.st_size);
    }
  }
  statistics.schemaVersion = catalog::kSchemaVersion;
  statistics.highestDocumentID = DocumentID{static_cast<std::uint32_t>(*highest)};
  statistics.lastLook =
      std::chrono::system_clock::time_point(std::chrono::nanoseconds(last->timeNanoseconds));
  statistics.lastLookDuration = last->duration;
  statistics.unreadableFolders = last->unreadableFolders;
  return statistics;
}

Catalog::Catalog(std::unique_ptr<State> state) : _state(std::move(state)) {}
Catalog::~Catalog() = default;

Result<std::unique_ptr<Catalog>> Catalog::open(CatalogOptions options) {
  if (auto made = makeStateFolder(options.stateFolder); !made) {
    return std::unexpected(made.error());
  }
  auto state = std::make_unique<State>(std::move(options));
  if (auto opened = state->openStore(); !opened) return std::unexpected(opened.error());
  return std::unique_ptr<Catalog>(new Catalog(std::move(state)));
}

Result<LookReport> Catalog::look() {
  const MutexLock lock(_state->mutex);
  return _state->look();
}

Result<CatalogStatistics> Catalog::statistics() {
  const MutexLock lock(_state->mutex);
  return _state->statistics();
}

Result<std::string> Catalog::pathForFileID(FileID fileID) {
  const MutexLock lock(_state->mutex);
  return _state->paths().pathForFileID(fileID);
}

std::optional<std::uint64_t> Catalog::entryCountOfFolder(FileID folder) {
  const MutexLock lock(_state->mutex);
  const auto record = _state->store().entries.folder(folder);
  if (!record) _state->report("can't count the entries of a folder", record.error());
  if (!record || !*record) return std::nullopt;
  return (*record)->entryCount;
}

DocumentID Catalog::documentIDOfObject(const SeenObject& object) {
  const MutexLock lock(_state->mutex);
  const auto documentID = _state->documents().existingIDOf(object);
  if (!documentID) _state->report("can't look up a document ID", documentID.error());
  return documentID.value_or(DocumentID{});
}

Result<std::vector<DocumentID>> Catalog::documentIDsOfObjects(
    FileID folder, std::span<const SeenObject> documents) {
  const MutexLock lock(_state->mutex);
  return _state->documents().idsOf(folder, documents);
}

Result<FileID> Catalog::fileIDOfDocument(DocumentID documentID) {
  const MutexLock lock(_state->mutex);
  return _state->paths().fileIDOfDocument(documentID);
}

void Catalog::noteSeen(const SeenObject& object) {
  const MutexLock lock(_state->mutex);
  const auto noted = _state->paths().noteSeen(object);
  if (!noted) _state->report("can't remember where a file was seen", noted.error());
}

void Catalog::noteAttribute(FileID fileID, std::string_view name,
                            std::optional<FndDataView> value) {
  if (!isKeptAcrossSafeSave(name)) return;
  const MutexLock lock(_state->mutex);
  const auto noted = _state->store().documents.noteAttribute(fileID, name, value);
  if (!noted) _state->report("can't remember an attribute", noted.error());
}

}  // namespace vantrell::linuxos
