#include "platform/Services.h"

#include <map>
#include <mutex>
#include <utility>

#include "platform/foundation/Fatal.h"

namespace vantrell::platform {
namespace {

struct Installed {
  Services services;
  bool present = false;
  // Recursive: making one process-wide object may ask for another.
  std::recursive_mutex mutex;
  std::map<std::type_index, std::shared_ptr<void>> objects;  // guarded by mutex
};

Installed& installed() {
  static Installed theOne;
  return theOne;
}

void uninstall() {
  // The objects go outside the lock: their destructors may still ask for services, and for other
  // objects, which then go in the next round.
  std::map<std::type_index, std::shared_ptr<void>> objects;
  do {
    objects.clear();
    const std::lock_guard lock(installed().mutex);
    objects.swap(installed().objects);
  } while (!objects.empty());
  installed().present = false;
  installed().services = {};
}

}  // namespace

Installation::Installation(Installation&& other) noexcept
    : _holds(std::exchange(other._holds, false)) {}

Installation& Installation::operator=(Installation&& other) noexcept {
  if (this == &other) return *this;
  if (_holds) uninstall();
  _holds = std::exchange(other._holds, false);
  return *this;
}

Installation::~Installation() {
  if (_holds) uninstall();
}

Installation install(const Services& services) {
  if (installed().present) fatalError("services are installed already");
  installed().services = services;
  installed().present = true;
  Installation installation;
  installation._holds = true;
  return installation;
}

const Services& services() {
  if (!installed().present) fatalError("no services are installed");
  return installed().services;
}

std::shared_ptr<void> processWide(std::type_index type,
                                  const std::function<std::shared_ptr<void>()>& make) {
  const std::lock_guard lock(installed().mutex);
  auto& slot = installed().objects[type];
  if (!slot) slot = make();
  return slot;
}

}  // namespace vantrell::platform
