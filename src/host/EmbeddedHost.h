#pragma once

#include <memory>
#include <optional>
#include <string>

#include "host/ExtensionModule.h"
#include "host/HostManager.h"
#include "linux/system/LinuxSystem.h"
#include "linux/system/XdgFolders.h"
#include "platform/Services.h"
#include "platform/dochost/DochostExtension.h"
#include "platform/foundation/FndError.h"

namespace vantrell::host {

/// Where a host works, known before it starts.
struct HostPlaces {
  std::string storageRoot;  ///< canonical
  std::string stateFolder;
  std::string module;
  std::string packageTypes;  ///< the folder of the package declarations that come with it
  std::vector<std::string> dataFolders;  ///< the XDG data folders, the most important first
};

/// The host within a program that runs one command: it has looked at the storage once, when it
/// started, and serves requests from then on.
///
/// Threads: start and destroy it on one thread; the extension may be used from any.
/// Lifetime: when it goes, the extension goes first, then whatever still runs for it ends, then
/// the services go. Keep nothing of the extension's beyond that. One host in a process at a time.
class EmbeddedHost {
 public:
  /// Errors: those of `storageRoot`.
  static Result<HostPlaces> places(const std::optional<std::string>& storage,
                                   const linuxos::XdgFolders& folders);

  /// Takes the state folder, looks at the storage, loads the module and starts the extension.
  /// Errors: StateUnavailable (the state folder is in use, or it, its database or the module
  /// cannot be used), POSIX.
  static Result<std::unique_ptr<EmbeddedHost>> start(HostPlaces places, bool verbose);

  ~EmbeddedHost();

  DochostExtension& extension() { return *_extension; }
  const HostPlaces& places() const { return _places; }
  linuxos::LinuxSystem& system() { return *_system; }
  /// What the look at the start found.
  const linuxos::LookReport& lookAtStart() const { return _look; }

 private:
  EmbeddedHost(HostPlaces places, std::unique_ptr<linuxos::LinuxSystem> system,
               linuxos::LookReport look, const ExtensionModule& module);

  const HostPlaces _places;
  const linuxos::LookReport _look;
  // From here on the order matters: each uses those above it.
  std::unique_ptr<linuxos::LinuxSystem> _system;
  HostManager _manager;
  platform::Installation _installation;
  std::unique_ptr<DochostExtension> _extension;
};

}  // namespace vantrell::host
