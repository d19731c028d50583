#pragma once

#include <functional>
#include <memory>
#include <typeindex>

#include "platform/Clock.h"
#include "platform/appreg/Appreg.h"
#include "platform/devinfo/Devinfo.h"
#include "platform/dochost/DhFileOperations.h"
#include "platform/dochost/DochostManager.h"
#include "platform/filesystem/FileSystem.h"
#include "platform/filesystem/Volumes.h"
#include "platform/imaging/Imaging.h"
#include "platform/log/LogSink.h"
#include "platform/tremor/Tremor.h"
#include "platform/types/TypeRegistry.h"
#include "platform/verstow/VerstowManager.h"

namespace vantrell::platform {

/// The system as the extension sees it. The services are borrowed: who installs them keeps them
/// until the installation has gone. Those in the second group may be null.
struct Services {
  FileSystem* fileSystem = nullptr;
  ExtendedAttributes* attributes = nullptr;
  Volumes* volumes = nullptr;
  TypeRegistry* types = nullptr;
  VerstowManager* verstow = nullptr;
  LogSink* log = nullptr;
  DochostManager* manager = nullptr;
  Clock* clock = nullptr;

  Tremor* tremor = nullptr;                    ///< null: nothing records what happens
  Appreg* appreg = nullptr;                    ///< null: no application registry
  DhFileOperations* fileOperations = nullptr;  ///< null: nothing can be changed through this
  Devinfo* devinfo = nullptr;                  ///< null: nothing is known of the machine
  Imaging* imaging = nullptr;                  ///< null: no pictures
};

/// Keeps the services installed; with it go the process-wide objects made meanwhile.
///
/// Lifetime: destroy it after everything that uses the services.
class [[nodiscard]] Installation {
 public:
  Installation() = default;
  Installation(Installation&& other) noexcept;
  Installation& operator=(Installation&& other) noexcept;
  ~Installation();

 private:
  friend Installation install(const Services& services);
  bool _holds = false;
};

/// Installs `services` for the process, before anything of the extension runs. A second
/// installation while one stands ends the process.
Installation install(const Services& services);

/// What is installed. Without an installation it ends the process.
///
/// Threads: any; cheap.
const Services& services();

/// The object kept under `type`, made by `make` when there is none since the installation.
std::shared_ptr<void> processWide(std::type_index type,
                                  const std::function<std::shared_ptr<void>()>& make);

/// The process-wide `T`, made with its default constructor on first use, and gone with the
/// installation: a new one begins afresh.
template <class T>
T& processWide() {
  return *static_cast<T*>(processWide(typeid(T), [] {
                            return std::static_pointer_cast<void>(std::make_shared<T>());
                          }).get());
}

}  // namespace vantrell::platform
