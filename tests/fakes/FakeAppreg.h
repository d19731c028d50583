#pragma once

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "platform/appreg/Appreg.h"

namespace vantrell {

/// A record that says what its fields say. `Base` is one of the registry's two kinds of record.
template <class Base>
class FakeProxy : public Base {
 public:
  struct Fields {
    std::optional<std::string> bundleIdentifier{};
    std::optional<std::string> dataContainerPath{};
    std::optional<std::string> localizedName{};
    std::map<std::string, bool, std::less<>> infoBooleans{};
    bool supportsOpenInPlace = true;
    bool fileSharingEnabled = true;
  };

  explicit FakeProxy(Fields given) : fields(std::move(given)) {}

  std::optional<std::string> bundleIdentifier() const override { return fields.bundleIdentifier; }
  std::optional<FndURL> dataContainerURL() const override {
    if (!fields.dataContainerPath) return std::nullopt;
    return FndURL::fileURLWithPath(*fields.dataContainerPath);
  }
  std::optional<std::string> localizedName() const override { return fields.localizedName; }
  std::optional<bool> infoBoolean(std::string_view key) const override {
    const auto found = fields.infoBooleans.find(key);
    return found == fields.infoBooleans.end() ? std::nullopt : std::optional(found->second);
  }
  ArchiveValue archived() const override {
    ArchiveValue::Dictionary coded;
    if (fields.bundleIdentifier) {
      coded.emplace("bundleIdentifier", ArchiveValue(*fields.bundleIdentifier));
    }
    return ArchiveValue(ArchiveValue::Record{"FakeProxy", std::move(coded)});
  }
  std::string description() const override {
    return "<proxy " + fields.bundleIdentifier.value_or("nil") + ">";
  }

  const Fields fields;
};

/// The record of something that is no application.
using FakeBundleProxy = FakeProxy<AppregBundleProxy>;

/// The record of an application. It has no icons.
class FakeApplicationProxy : public FakeProxy<AppregApplicationProxy> {
 public:
  using FakeProxy::FakeProxy;
  bool supportsOpenInPlace() const override { return fields.supportsOpenInPlace; }
  bool fileSharingEnabled() const override { return fields.fileSharingEnabled; }
  std::optional<FndData> primaryIconDataForVariant(int) const override { return std::nullopt; }
};

/// A registry that holds what it is given, in that order.
///
/// Threads: fill it before it is used.
class FakeAppreg : public Appreg {
 public:
  void add(int category, BundleProxy proxy) { _records.emplace_back(category, std::move(proxy)); }
  void addApplication(FakeApplicationProxy::Fields fields) {
    add(0, std::make_shared<FakeApplicationProxy>(std::move(fields)));
  }

  void enumerateApplicationsOfCategory(int category, const Block& block) override;
  BundleProxy bundleProxyForIdentifier(std::string_view bundleIdentifier) override;
  BundleProxy bundleProxyForAppLibraryURL(const FndURL& url) override;
  BundleProxy bundleProxyFromArchive(const ArchiveValue& archived) override;

 private:
  std::vector<std::pair<int, BundleProxy>> _records;
};

}  // namespace vantrell
