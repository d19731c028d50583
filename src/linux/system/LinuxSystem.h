#pragma once

#include <memory>
#include <string>
#include <vector>

#include "linux/catalog/Catalog.h"
#include "platform/Services.h"

namespace vantrell::linuxos {

/// What a `LinuxSystem` is made for.
struct LinuxSystemOptions {
  std::string storageRoot;  ///< canonical
  std::string stateFolder;
  std::vector<std::string> dataFolders;  ///< the XDG data folders, the most important first
  std::string packageTypeFolder;         ///< the package declarations that come with the program
  bool verbose = false;                  ///< every log line goes to standard error
};

/// The platform's services on this machine, with everything that they need.
///
/// Threads: open, look at and destroy it on one thread; the services may be used from any.
/// Lifetime: holds the state folder's lock until it goes. The services are gone with it.
class LinuxSystem {
 public:
  /// Takes the state folder and opens the catalog. Errors: StateUnavailable, POSIX.
  static Result<std::unique_ptr<LinuxSystem>> open(const LinuxSystemOptions& options);
  ~LinuxSystem();

  /// Looks at everything below the storage root. Call it before the services are used. Errors:
  /// those of the catalog's `look`.
  Result<LookReport> look();

  /// All that this system has; the manager is the host's to add.
  platform::Services services();

  Result<CatalogStatistics> statistics();
  std::string databasePath() const;
  /// The folders with a database of types; without one, files are plain data.
  const std::vector<std::string>& typeDatabases() const;
  /// Where log lines go, for people.
  std::string logDescription() const;

 private:
  struct Parts;
  explicit LinuxSystem(std::unique_ptr<Parts> parts);

  std::unique_ptr<Parts> _parts;
};

}  // namespace vantrell::linuxos
