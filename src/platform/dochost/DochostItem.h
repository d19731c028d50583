#pragma once

#include <cstdint>
#include <memory>
#include <optional>
#include <string>

#include "platform/dochost/DochostConstants.h"
#include "platform/foundation/FndDate.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell {

/// One file or folder as the host framework knows it: a snapshot that never changes.
///
/// Threads: all members may be called from any thread.
class DochostItem {
 public:
  virtual ~DochostItem();

  virtual const DochostItemIdentifier& itemIdentifier() const = 0;
  virtual const DochostItemIdentifier& parentItemIdentifier() const = 0;
  virtual const std::string& filename() const = 0;
  virtual const std::string& typeIdentifier() const = 0;
  /// In bytes.
  virtual std::optional<std::uint64_t> documentSize() const = 0;
  virtual std::optional<FndDate> creationDate() const = 0;
  virtual std::optional<FndDate> contentModificationDate() const = 0;
  virtual std::optional<std::uint64_t> childItemCount() const = 0;
  /// Bits of `DochostItemCapabilities`.
  virtual std::uint64_t capabilities() const = 0;
  /// Changes whenever the content does.
  virtual const std::optional<FndData>& versionIdentifier() const = 0;
  virtual bool isTrashed() const = 0;
  virtual std::optional<FndDate> lastUsedDate() const = 0;
  /// `dochostTagsFromData` reads it.
  virtual const std::optional<FndData>& tagData() const = 0;
  virtual std::optional<std::uint64_t> favoriteRank() const = 0;

  virtual std::optional<FileID> fileID() const = 0;
  virtual std::optional<DocumentID> docID() const = 0;
  virtual const FndURL& fileURL() const = 0;
  /// Bundle identifier of the app library that holds the item, as the search index's domain.
  virtual const std::optional<std::string>& dh_lumenDomainIdentifier() const = 0;
  virtual const std::optional<std::string>& dh_appContainerBundleIdentifier() const = 0;
  virtual bool dh_isUbiquitous() const = 0;
  /// Where the item goes back to from the trash.
  virtual std::optional<FndURL> putBackURL() const = 0;
};

/// Items are shared: observers, pages and errors hold the same snapshot.
using DochostItemRef = std::shared_ptr<const DochostItem>;

}  // namespace vantrell
