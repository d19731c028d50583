#pragma once

#include <optional>
#include <string_view>

#include "platform/appreg/Appreg.h"
#include "platform/dochost/DochostConstants.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell {

/// Puts item identifiers together, and takes apart what one says by itself.
///
///   DochostRootContainerItemIdentifier         the storage root
///   fid=18446744073709551615                   the file ID of a folder, or of anything that is
///                                              neither a regular file nor a package
///   did=4294967295                             the document ID of a regular file or a package
///   #com.quillon.tessera, #(null)              the app library of the application with that
///                                              bundle identifier, or with none
///   DochostTemporaryLocalFolderItemIdentifier  ".TemporaryLocalFolder" below the storage root
///
/// Numbers are decimal, without sign or leading zeros. Nothing is escaped.
///
/// Threads: all members may be called from any thread.
class ZubFileObjectIdentifier {
 public:
  ZubFileObjectIdentifier() = delete;

  static DochostItemIdentifier fromFileID(FileID fileID);
  static DochostItemIdentifier fromDocumentID(DocumentID documentID);
  /// The identifier of the app library whose root is `url` (the "Documents" folder in the data
  /// container). None, and a line in the framework's log, when no application has it.
  static std::optional<DochostItemIdentifier> fromAppLibraryDataContainerURL(const FndURL& url);

  /// The document ID in an identifier of the "did=" form; none for any other.
  static std::optional<DocumentID> documentIDIn(std::string_view identifier);
  /// The bundle identifier in an identifier of the "#" form; none for any other.
  static std::optional<std::string_view> bundleIdentifierIn(std::string_view identifier);
};

/// The item identifier of the app library that belongs to `bundleProxy`.
DochostItemIdentifier appLibraryIdentifier(const AppregBundleProxy& bundleProxy);

}  // namespace vantrell
