#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "platform/filesystem/FileSystem.h"
#include "platform/filesystem/Volumes.h"
#include "platform/log/LogSink.h"
#include "platform/types/TypeRegistry.h"
#include "platform/verstow/VerstowManager.h"

namespace vantrell::testing {

/// One version of the services around files, with an empty storage root, and the verbs that set a
/// scene behind their backs. The caller of the services is an ordinary user who owns the storage.
///
/// Its types know folders with the extension "pouch" as packages of type "org.example.pouch",
/// "txt" as text/plain, "md" as text/markdown below it, and "text/x-alias" as an alias of
/// text/markdown.
class Environment {
 public:
  virtual ~Environment() = default;

  virtual FileSystem& fileSystem() = 0;
  virtual ExtendedAttributes& attributes() = 0;
  virtual Volumes& volumes() = 0;
  virtual VerstowManager& verstow() = 0;
  virtual const TypeRegistry& types() = 0;
  /// The path of the storage root.
  virtual std::string root() = 0;

  // Paths count from the root and begin with "/".
  virtual void makeFolder(const std::string& path) = 0;
  virtual void writeFile(const std::string& path, const std::string& content) = 0;
  virtual void makeLink(const std::string& path, const std::string& target) = 0;
  virtual void makeFifo(const std::string& path) = 0;
  virtual void move(const std::string& from, const std::string& to) = 0;
  virtual void remove(const std::string& path) = 0;
  virtual void setMode(const std::string& path, unsigned mode) = 0;
  /// Has the folder looked at by whatever counts entries.
  virtual void catalogue(const std::string& path) = 0;

  FndURL url(const std::string& path) { return FndURL::fileURLWithPath(root() + path); }
};

struct EnvironmentMaker {
  std::string name;
  std::function<std::unique_ptr<Environment>()> make;
};

/// Every version there is.
const std::vector<EnvironmentMaker>& environments();

/// The Linux services, on an index that only remembers.
std::unique_ptr<Environment> makeLinuxEnvironment();
/// The Linux services on the catalog, as programs have them.
std::unique_ptr<Environment> makeCatalogEnvironment();
std::unique_ptr<Environment> makeFakeEnvironment();

}  // namespace vantrell::testing
