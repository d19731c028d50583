#include "linux/system/LinuxSystem.h"

#include <fcntl.h>

#include <utility>

#include "linux/devinfo/LinuxDevinfo.h"
#include "linux/filesystem/LinuxExtendedAttributes.h"
#include "linux/filesystem/LinuxFileSystem.h"
#include "linux/filesystem/LinuxVerstow.h"
#include "linux/filesystem/LinuxVolumes.h"
#include "linux/filesystem/ObjectStatus.h"
#include "linux/filesystem/SystemClock.h"
#include "linux/log/MakeLogSink.h"
#include "linux/system/StateFolder.h"
#include "linux/types/SharedMimeTypes.h"

namespace vantrell::linuxos {
namespace {

constexpr std::string_view kSubsystem = "com.quillon.Dochost";
constexpr std::string_view kCatalogCategory = "catalog";

LogSinkChoice sinkChoice(const LinuxSystemOptions& options) {
  LogSinkChoice choice;
  choice.toStandardError = options.verbose;
  choice.stateFolder = options.stateFolder;
  return choice;
}

}  // namespace

// In the order of use: each may use those above it.
struct LinuxSystem::Parts {
  Parts(const LinuxSystemOptions& options, StateFolder folder)
      : state(std::move(folder)),
        logChoice(sinkChoice(options)),
        log(makeLogSink(logChoice, clock)),
        types({options.dataFolders, {options.packageTypeFolder}}) {
    if (options.verbose) log->setRecordedLevel(LogLevel::Debug);
  }

  // Second step: the catalog can fail, and what comes after it borrows it.
  void serve(std::unique_ptr<Catalog> opened, const std::string& storageRoot) {
    catalog = std::move(opened);
    const auto root = lookAt(AT_FDCWD, storageRoot.c_str());
    fileSystem.emplace(*catalog, types, root ? std::optional(root->device) : std::nullopt);
    volumes.emplace(*catalog, storageRoot);
    verstow.emplace(*catalog, types, storageRoot);
  }

  StateFolder state;
  SystemClock clock;
  const LogSinkChoice logChoice;
  const std::unique_ptr<LogSink> log;
  SharedMimeTypes types;
  LinuxDevinfo devinfo;
  LinuxExtendedAttributes attributes;
  std::unique_ptr<Catalog> catalog;
  std::optional<LinuxFileSystem> fileSystem;
  std::optional<LinuxVolumes> volumes;
  std::optional<LinuxVerstow> verstow;
};

Result<std::unique_ptr<LinuxSystem>> LinuxSystem::open(const LinuxSystemOptions& options) {
  SystemClock clock;
  auto state = StateFolder::take(options.stateFolder, clock);
  if (!state) return std::unexpected(std::move(state.error()));
  auto parts = std::make_unique<Parts>(options, *std::move(state));
  const auto write = [&log = *parts->log](LogLevel level, const std::string& text) {
    if (log.records(level)) log.write({level, kSubsystem, kCatalogCategory, text});
  };
  auto catalog = Catalog::open({.stateFolder = options.stateFolder,
                                .roots = {options.storageRoot},
                                .types = parts->types,
                                .log = write});
  if (!catalog) return std::unexpected(std::move(catalog.error()));
  parts->serve(*std::move(catalog), options.storageRoot);
  return std::unique_ptr<LinuxSystem>(new LinuxSystem(std::move(parts)));
}

LinuxSystem::LinuxSystem(std::unique_ptr<Parts> parts) : _parts(std::move(parts)) {}
LinuxSystem::~LinuxSystem() = default;

Result<LookReport> LinuxSystem::look() { return _parts->catalog->look(); }

platform::Services LinuxSystem::services() {
  platform::Services services;
  services.fileSystem = &*_parts->fileSystem;
  services.attributes = &_parts->attributes;
  services.volumes = &*_parts->volumes;
  services.types = &_parts->types;
  services.verstow = &*_parts->verstow;
  services.log = _parts->log.get();
  services.clock = &_parts->clock;
  services.devinfo = &_parts->devinfo;
  return services;
}

Result<CatalogStatistics> LinuxSystem::statistics() { return _parts->catalog->statistics(); }

std::string LinuxSystem::databasePath() const { return _parts->state.path() + "/vantrell.db"; }

const std::vector<std::string>& LinuxSystem::typeDatabases() const {
  return _parts->types.databaseFolders();
}

std::string LinuxSystem::logDescription() const {
  switch (logSinkKind(_parts->logChoice)) {
    case LogSinkKind::StandardError:
      return "standard error";
    case LogSinkKind::Journal:
      return "the system's journal";
    case LogSinkKind::File:
      break;
  }
  return _parts->state.path() + "/vantrell.log";
}

}  // namespace vantrell::linuxos
