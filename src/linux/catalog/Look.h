#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

#include "linux/catalog/Catalog.h"
#include "linux/catalog/FolderLook.h"
#include "linux/catalog/Store.h"
#include "linux/catalog/TreeLook.h"

namespace vantrell::linuxos::catalog {

/// What a look looks at.
struct LookTarget {
  const std::vector<std::string>& roots;
  const TypeRegistry& types;
  const LogLine& log;
};

/// How much of it.
enum class LookScope : std::uint8_t {
  Everything,     ///< every entry
  ChangedFolders  ///< the folders that lost, got or renamed an entry since they were read
};

/// One look at the disk: compares, writes the differences, and lets the documents follow, all in
/// one transaction.
///
/// Errors: POSIX, the database's; nothing has changed then.
/// Threads: as the store. Lifetime: borrows everything; use each once.
class Look : private DifferenceSink {
 public:
  Look(Store& store, const LookTarget& target, LookScope scope);

  Result<LookReport> run();
  /// The roots as they stood during the look, in the order of the target's; missing ones as they
  /// were known before.
  const std::vector<RootRecord>& roots() const { return _roots; }
  DeviceID device() const { return _device; }

 private:
  Result<void> apply(const FolderInHand& folder, std::span<const Difference> differences) override;
  Result<void> applyOne(const FolderInHand& folder, const Difference& difference);
  Result<void> keepAttributes(const FolderInHand& folder, const Entry& entry);

  Result<void> openRoots();
  Result<void> openRoot(const std::string& path);
  Result<void> forgetStaleRoots();
  Result<void> lookBelowRoots();
  Result<void> forgetRecycled(FileID folder);
  Result<void> removeDoublePlaces();
  Result<void> removeLeftFolders();
  Result<bool> isPlaced(const ObjectID& folder);
  Result<void> decideDocuments();
  Result<void> finish(std::chrono::steady_clock::time_point start);
  void noteUnreadable(const std::string& path, int osError);

  Store& _store;
  LookTarget _target;
  LookScope _scope;
  LookReport _report;
  std::vector<RootRecord> _roots;
  std::vector<RootRecord> _formerRoots;
  std::vector<OpenFolder> _opened;
  DeviceID _device;
  bool _isFirst = false;  // nothing is catalogued: whatever is seen is new, and nobody's
  bool _hasDocuments = false;
};

}  // namespace vantrell::linuxos::catalog
