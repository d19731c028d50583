#include "host/EmbeddedHost.h"

#include <utility>

#include "host/ProgramFiles.h"
#include "host/StorageRoot.h"
#include "platform/foundation/SerialQueue.h"

namespace vantrell::host {
namespace {

platform::Services servicesOf(linuxos::LinuxSystem& system, DochostManager& manager) {
  platform::Services services = system.services();
  services.manager = &manager;
  return services;
}

}  // namespace

Result<HostPlaces> EmbeddedHost::places(const std::optional<std::string>& storage,
                                        const linuxos::XdgFolders& folders) {
  auto root = storageRoot(storage, folders);
  if (!root) return std::unexpected(std::move(root.error()));
  return HostPlaces{.storageRoot = *std::move(root),
                    .stateFolder = folders.stateHome() + "/vantrell",
                    .module = extensionModulePath(),
                    .packageTypes = packageTypeFolder(),
                    .dataFolders = folders.dataFolders()};
}

Result<std::unique_ptr<EmbeddedHost>> EmbeddedHost::start(HostPlaces places, bool verbose) {
  // First: a module that cannot be loaded should not cost a look at a large storage.
  const auto module = ExtensionModule::load(places.module);
  if (!module) return std::unexpected(module.error());
  auto system = linuxos::LinuxSystem::open({.storageRoot = places.storageRoot,
                                            .stateFolder = places.stateFolder,
                                            .dataFolders = places.dataFolders,
                                            .packageTypeFolder = places.packageTypes,
                                            .verbose = verbose});
  if (!system) return std::unexpected(std::move(system.error()));
  auto look = (*system)->look();
  if (!look) return std::unexpected(std::move(look.error()));
  return std::unique_ptr<EmbeddedHost>(
      new EmbeddedHost(std::move(places), *std::move(system), *std::move(look), *module));
}

EmbeddedHost::EmbeddedHost(HostPlaces places, std::unique_ptr<linuxos::LinuxSystem> system,
                           linuxos::LookReport look, const ExtensionModule& module)
    : _places(std::move(places)),
      _look(std::move(look)),
      _system(std::move(system)),
      _manager(FndURL::fileURLWithPath(_places.storageRoot)),
      _installation(platform::install(servicesOf(*_system, _manager))),
      _extension(module.createExtension()) {}

EmbeddedHost::~EmbeddedHost() {
  _extension.reset();
  waitForQuietQueues();
}

}  // namespace vantrell::host
