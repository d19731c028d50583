#pragma once

#include <memory>
#include <string>

#include "platform/dochost/DochostExtension.h"
#include "platform/foundation/FndError.h"
#include "provider/VantrellModule.h"

namespace vantrell::host {

/// The extension's module, loaded.
///
/// Threads: a value that never changes once loaded.
/// Lifetime: the module stays in memory until the process ends, because tasks that it has given
/// to the queues may still hold its code when the last object of it is gone.
class ExtensionModule {
 public:
  /// Errors: StateUnavailable with the loader's reason.
  static Result<ExtensionModule> load(const std::string& path);

  std::unique_ptr<DochostExtension> createExtension() const;

 private:
  explicit ExtensionModule(VantrellCreateExtension entry) : _entry(entry) {}

  VantrellCreateExtension _entry;
};

}  // namespace vantrell::host
