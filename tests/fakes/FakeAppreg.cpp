#include "tests/fakes/FakeAppreg.h"

#include <stdexcept>

namespace vantrell {

void FakeAppreg::enumerateApplicationsOfCategory(int category, const Block& block) {
  if (category != 0 && category != 2) throw std::logic_error("there is no such category");
  for (const auto& [itsCategory, proxy] : _records) {
    if (itsCategory == category) block(proxy);
  }
}

Appreg::BundleProxy FakeAppreg::bundleProxyForIdentifier(std::string_view bundleIdentifier) {
  for (const auto& [category, proxy] : _records) {
    if (proxy != nullptr && proxy->bundleIdentifier() == bundleIdentifier) return proxy;
  }
  return nullptr;
}

Appreg::BundleProxy FakeAppreg::bundleProxyForAppLibraryURL(const FndURL& url) {
  for (const auto& [category, proxy] : _records) {
    if (proxy == nullptr || !proxy->dataContainerURL()) continue;
    if (proxy->dataContainerURL()->URLByAppendingPathComponent("Documents") == url) return proxy;
  }
  return nullptr;
}

Appreg::BundleProxy FakeAppreg::bundleProxyFromArchive(const ArchiveValue& archived) {
  const auto* record = archived.record();
  if (record == nullptr || record->className != "FakeProxy") return nullptr;
  const auto found = record->fields.find("bundleIdentifier");
  if (found == record->fields.end() || found->second.string() == nullptr) return nullptr;
  return bundleProxyForIdentifier(*found->second.string());
}

}  // namespace vantrell
