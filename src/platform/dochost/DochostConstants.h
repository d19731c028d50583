#pragma once

#include <string>
#include <string_view>

#include "platform/foundation/FndData.h"

namespace vantrell {

/// What names an item to the host framework. The extension alone gives it meaning.
using DochostItemIdentifier = std::string;

inline constexpr std::string_view DochostRootContainerItemIdentifier =
    "DochostRootContainerItemIdentifier";
inline constexpr std::string_view DochostWorkingSetContainerItemIdentifier =
    "DochostWorkingSetContainerItemIdentifier";
inline constexpr std::string_view DochostAllDirectoriesContainerItemIdentifier =
    "DochostAllDirectoriesContainerItemIdentifier";
inline constexpr std::string_view DochostTemporaryLocalFolderItemIdentifier =
    "DochostTemporaryLocalFolderItemIdentifier";

/// The pages that begin an enumeration.
const FndData& dochostInitialPageSortedByName();
const FndData& dochostInitialPageSortedByDate();

/// What may be done with an item; combined as bits.
enum DochostItemCapabilities : std::uint64_t {
  kDochostItemAllowsReading = 1,  ///< for folders: enumerating their content
  kDochostItemAllowsWriting = 2,  ///< for folders: adding sub-items
};

}  // namespace vantrell
