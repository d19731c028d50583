#pragma once

#include <memory>

#include "items/LocalItem.h"
#include "platform/appreg/Appreg.h"

namespace vantrell {

/// The record of an app library: the "Documents" folder in an application's data container,
/// shown under the application's name, directly in the root container.
///
/// Threads, Lifetime: as `LocalItem`.
class LocalAppLibraryItem : public LocalItem {
 public:
  explicit LocalAppLibraryItem(Fields fields) : LocalItem(std::move(fields)) {}

  /// Null, and a line in the log, when the application has no data container, or when that has
  /// no "Documents" folder to make a record of.
  static std::shared_ptr<const LocalAppLibraryItem> initWithBundleProxy(
      const AppregBundleProxy& bundleProxy);

  /// As `LocalItem::init`.
  static std::shared_ptr<const LocalAppLibraryItem> init(const FndURL& url, const Options& options);

  std::shared_ptr<const LocalAppLibraryItem> fetchAppLibraryItem() const override;

 protected:
  std::string_view className() const override { return "LocalAppLibraryItem"; }
};

}  // namespace vantrell
