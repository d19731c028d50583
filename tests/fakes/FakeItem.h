#pragma once

#include <optional>
#include <string>

#include "platform/dochost/DochostItem.h"

namespace vantrell {

/// An item that says what its fields say.
///
/// Threads: set the fields before it is shared.
class FakeItem : public DochostItem {
 public:
  struct Fields {
    std::string itemIdentifier = "did=1";
    std::string parentItemIdentifier{DochostRootContainerItemIdentifier};
    std::string filename = "a.txt";
    std::string typeIdentifier = "text/plain";
    std::optional<std::uint64_t> documentSize{};
    std::optional<FndDate> creationDate{};
    std::optional<FndDate> contentModificationDate{};
    std::optional<std::uint64_t> childItemCount{};
    std::uint64_t capabilities = kDochostItemAllowsReading;
    std::optional<FndData> versionIdentifier{};
    bool isTrashed = false;
    std::optional<FndDate> lastUsedDate{};
    std::optional<FndData> tagData{};
    std::optional<std::uint64_t> favoriteRank{};
    std::optional<FileID> fileID{};
    std::optional<DocumentID> docID{};
    FndURL fileURL = FndURL::fileURLWithPath("/storage/a.txt");
    std::optional<std::string> lumenDomainIdentifier{};
    std::optional<std::string> appContainerBundleIdentifier{};
    bool isUbiquitous = false;
    std::optional<FndURL> putBackURL{};
  };

  explicit FakeItem(Fields fields) : _fields(std::move(fields)) {}

  const DochostItemIdentifier& itemIdentifier() const override { return _fields.itemIdentifier; }
  const DochostItemIdentifier& parentItemIdentifier() const override {
    return _fields.parentItemIdentifier;
  }
  const std::string& filename() const override { return _fields.filename; }
  const std::string& typeIdentifier() const override { return _fields.typeIdentifier; }
  std::optional<std::uint64_t> documentSize() const override { return _fields.documentSize; }
  std::optional<FndDate> creationDate() const override { return _fields.creationDate; }
  std::optional<FndDate> contentModificationDate() const override {
    return _fields.contentModificationDate;
  }
  std::optional<std::uint64_t> childItemCount() const override { return _fields.childItemCount; }
  std::uint64_t capabilities() const override { return _fields.capabilities; }
  const std::optional<FndData>& versionIdentifier() const override {
    return _fields.versionIdentifier;
  }
  bool isTrashed() const override { return _fields.isTrashed; }
  std::optional<FndDate> lastUsedDate() const override { return _fields.lastUsedDate; }
  const std::optional<FndData>& tagData() const override { return _fields.tagData; }
  std::optional<std::uint64_t> favoriteRank() const override { return _fields.favoriteRank; }
  std::optional<FileID> fileID() const override { return _fields.fileID; }
  std::optional<DocumentID> docID() const override { return _fields.docID; }
  const FndURL& fileURL() const override { return _fields.fileURL; }
  const std::optional<std::string>& dh_lumenDomainIdentifier() const override {
    return _fields.lumenDomainIdentifier;
  }
  const std::optional<std::string>& dh_appContainerBundleIdentifier() const override {
    return _fields.appContainerBundleIdentifier;
  }
  bool dh_isUbiquitous() const override { return _fields.isUbiquitous; }
  std::optional<FndURL> putBackURL() const override { return _fields.putBackURL; }

 private:
  Fields _fields;
};

}  // namespace vantrell
