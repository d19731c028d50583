#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <utility>

#include "platform/dochost/DochostItem.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

class LocalAppLibraryItem;

/// The record of one file or folder: what it was when the record was built. It is never
/// refreshed; whoever wants to know again builds a new one.
///
/// Threads: all members may be called from any thread, `setChildItemCount` excepted.
/// Lifetime: shared; observers, pages and errors hold the same record.
class LocalItem : public DochostItem, public std::enable_shared_from_this<LocalItem> {
 protected:
  struct Fields;

 public:
  /// What a record is built with besides its URL. The defaults suit a look-up by identifier.
  struct Options {
    std::optional<DochostItemIdentifier> customItemID;        ///< instead of the computed one
    std::optional<DochostItemIdentifier> customParentItemID;  ///< instead of the computed one
    std::optional<std::string> customFilename;                ///< instead of the name on the disk
    /// Look up the application in whose library the item is.
    bool hasLumenDomainIdentifier = true;
    /// The application's bundle identifier, when it is known already.
    std::optional<std::string> bundleIdentifier;
  };

  explicit LocalItem(Fields fields);

  /// The record of what is at `url`, a canonical URL. Values that the URL object remembers are
  /// taken as they are, the others are read. Null, and a line in the log, when the object has no
  /// identifier, parent, name or type, and for a top-level "Inbox" folder.
  static std::shared_ptr<const LocalItem> init(const FndURL& url);
  static std::shared_ptr<const LocalItem> init(const FndURL& url, const Options& options);

  /// The resource values to prefetch when a directory is listed for records.
  static std::span<const FndURLResourceKey> urlKeys();

  const DochostItemIdentifier& itemIdentifier() const override;
  const DochostItemIdentifier& parentItemIdentifier() const override;
  const std::string& filename() const override;
  const std::string& typeIdentifier() const override;
  std::optional<std::uint64_t> documentSize() const override;
  std::optional<FndDate> creationDate() const override;
  std::optional<FndDate> contentModificationDate() const override;
  std::optional<std::uint64_t> childItemCount() const override;
  std::uint64_t capabilities() const override;
  const std::optional<FndData>& versionIdentifier() const override;
  bool isTrashed() const override;
  std::optional<FndDate> lastUsedDate() const override;
  const std::optional<FndData>& tagData() const override;
  std::optional<std::uint64_t> favoriteRank() const override;
  std::optional<FileID> fileID() const override;
  std::optional<DocumentID> docID() const override;
  const FndURL& fileURL() const override;
  const std::optional<std::string>& dh_lumenDomainIdentifier() const override;
  const std::optional<std::string>& dh_appContainerBundleIdentifier() const override;
  bool dh_isUbiquitous() const override;
  /// Found out on first use, and kept.
  std::optional<FndURL> putBackURL() const override;

  bool trashed() const { return isTrashed(); }
  const std::string& itemIdentifierAsString() const { return itemIdentifier(); }
  const std::string& parentItemIdentifierAsString() const { return parentItemIdentifier(); }

  /// A directory that is not shown as one document.
  bool isFolder() const;
  bool isPackage() const;
  /// For log lines: class, address, identifier, name, parent, type and marks.
  std::string description() const;
  /// The item of the app library that holds this one, or this one if it is such an item; null
  /// when no app library does.
  virtual std::shared_ptr<const LocalAppLibraryItem> fetchAppLibraryItem() const;

  /// For who builds a record, before it is shared.
  void setChildItemCount(std::optional<std::uint64_t> count);

 protected:
  struct Fields {
    explicit Fields(FndURL url) : fileURL(std::move(url)) {}

    DochostItemIdentifier _itemIdentifier;
    DochostItemIdentifier _parentItemIdentifier;
    std::string filename;
    std::string typeIdentifier;
    std::optional<std::uint64_t> documentSize;
    std::optional<FndDate> creationDate;
    std::optional<FndDate> contentModificationDate;
    std::optional<std::uint64_t> childItemCount;
    std::uint64_t capabilities = 0;
    std::optional<FndData> versionIdentifier;
    bool isTrashed = false;
    std::optional<FndDate> lastUsedDate;
    std::optional<FndData> tagData;
    std::optional<std::uint64_t> favoriteRank;
    std::optional<FileID> fileID;
    std::optional<DocumentID> docID;
    FndURL fileURL;
    std::optional<std::string> dh_lumenDomainIdentifier;
    std::optional<std::string> dh_appContainerBundleIdentifier;
  };

  /// What `init` finds out; none when there can be no record.
  static std::optional<Fields> read(const FndURL& url, const Options& options);

  virtual std::string_view className() const { return "LocalItem"; }

 private:
  class Reader;

  Fields _fields;
  mutable std::once_flag _putBackOnce;
  mutable std::optional<FndURL> _putBackURL;  // written once, under _putBackOnce
};

}  // namespace vantrell
