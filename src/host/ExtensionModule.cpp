#include "host/ExtensionModule.h"

#include <dlfcn.h>

namespace vantrell::host {
namespace {

FndError notLoaded(const std::string& path) {
  const char* reason = ::dlerror();
  return FndError::vantrell(VantrellErrorCode::StateUnavailable,
                            "The provider's module \"" + path + "\" cannot be loaded: " +
                                (reason == nullptr ? "no reason given" : reason) + ".");
}

}  // namespace

Result<ExtensionModule> ExtensionModule::load(const std::string& path) {
  void* module = ::dlopen(path.c_str(), RTLD_NOW | RTLD_LOCAL | RTLD_NODELETE);
  if (module == nullptr) return std::unexpected(notLoaded(path));
  void* entry = ::dlsym(module, kVantrellCreateExtensionSymbol);
  if (entry == nullptr) return std::unexpected(notLoaded(path));
  return ExtensionModule(reinterpret_cast<VantrellCreateExtension>(entry));
}

std::unique_ptr<DochostExtension> ExtensionModule::createExtension() const {
  return std::unique_ptr<DochostExtension>(_entry());
}

}  // namespace vantrell::host
