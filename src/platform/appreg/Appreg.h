#pragma once

#include <functional>
#include <map>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include "platform/archive/KeyedArchive.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

/// The registry's record of something installed: a snapshot that never changes.
///
/// Threads: all members may be called from any thread.
class AppregBundleProxy {
 public:
  virtual ~AppregBundleProxy() = default;

  virtual std::optional<std::string> bundleIdentifier() const = 0;
  /// The folder in which the application keeps its data.
  virtual std::optional<FndURL> dataContainerURL() const = 0;
  virtual std::optional<std::string> localizedName() const = 0;
  /// The truth value under an info-dictionary key; none when it is not there or not one.
  virtual std::optional<bool> infoBoolean(std::string_view key) const = 0;
  /// The record as an archive keeps it; `Appreg::bundleProxyFromArchive` reads it back.
  virtual ArchiveValue archived() const = 0;
  /// For log lines.
  virtual std::string description() const = 0;
};

/// The record of an application that people start.
class AppregApplicationProxy : public AppregBundleProxy {
 public:
  virtual bool supportsOpenInPlace() const = 0;
  virtual bool fileSharingEnabled() const = 0;
  /// The bitmap of the primary icon in one of the registry's variants (0, 1, 15, 24, 32).
  virtual std::optional<FndData> primaryIconDataForVariant(int variant) const = 0;
};

/// The application registry. A machine may have none.
///
/// Threads: all members may be called from any thread.
class Appreg {
 public:
  using BundleProxy = std::shared_ptr<const AppregBundleProxy>;  // shared by maps and callers
  using Block = std::function<void(const BundleProxy&)>;

  virtual ~Appreg() = default;
  /// Calls `block` with each record of the category (0: the user's own, 2: the system's), in an
  /// order that repeats.
  virtual void enumerateApplicationsOfCategory(int category, const Block& block) = 0;
  /// Null when there is none.
  virtual BundleProxy bundleProxyForIdentifier(std::string_view bundleIdentifier) = 0;
  /// The record whose data container's "Documents" folder is `url`; null when there is none.
  virtual BundleProxy bundleProxyForAppLibraryURL(const FndURL& url) = 0;
  /// Null when `archived` is no such record.
  virtual BundleProxy bundleProxyFromArchive(const ArchiveValue& archived) = 0;
};

}  // namespace vantrell
