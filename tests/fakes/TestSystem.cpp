#include "tests/fakes/TestSystem.h"

namespace vantrell {

TestSystem::TestSystem() {
  tree.makeFolder(kStorageRoot);
  platform::Services services;
  services.fileSystem = &fileSystem;
  services.attributes = &attributes;
  services.volumes = &volumes;
  services.types = &types;
  services.verstow = &verstow;
  services.log = &log;
  services.manager = &manager;
  services.clock = &clock;
  services.appreg = &appreg;
  _installation = platform::install(services);
}

TestSystem::~TestSystem() = default;

std::string TestSystem::inStorage(std::string_view relativePath) {
  return std::string(kStorageRoot).append("/").append(relativePath);
}

FndURL TestSystem::urlInStorage(std::string_view relativePath) {
  return FndURL::fileURLWithPath(inStorage(relativePath));
}

FndURL TestSystem::file(std::string_view relativePath, std::string_view content) {
  tree.writeFile(inStorage(relativePath), content);
  return urlInStorage(relativePath);
}

FndURL TestSystem::folder(std::string_view relativePath) {
  tree.makeFolder(inStorage(relativePath));
  return urlInStorage(relativePath);
}

FndURL TestSystem::addApp(std::string bundleIdentifier, std::optional<std::string> localizedName) {
  const std::string container = "/apps/" + bundleIdentifier;
  tree.makeFolder(container + "/Documents");
  appreg.addApplication({.bundleIdentifier = std::move(bundleIdentifier),
                         .dataContainerPath = container,
                         .localizedName = std::move(localizedName)});
  return FndURL::fileURLWithPath(container + "/Documents");
}

}  // namespace vantrell
