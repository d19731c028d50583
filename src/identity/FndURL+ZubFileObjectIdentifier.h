#pragma once

#include <optional>
#include <string_view>

#include "platform/dochost/DochostConstants.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell {

// From a place to its identifier, and back. What fails is logged here and answered with none.
//
// Threads: any. Resolving a document ID that is busy blocks the caller for up to 5 milliseconds.

/// The volume that holds the object at `url`, which need not be readable. Never 0.
/// Errors: POSIX.
Result<DeviceID> deviceIDWithError(const FndURL& url);

/// The same; 0 on failure.
DeviceID deviceID(const FndURL& url);

/// The identifier of the item at `url`, which must be canonical. What has been found out is
/// remembered by the URL object, so that asking again costs nothing.
///
/// This is the only place where a document is given its ID.
std::optional<DochostItemIdentifier> itemIdentifier(const FndURL& url);

/// Where the item with that identifier is now: the storage root, and the "fid=" and "did="
/// forms. Never a place outside the storage root and the app libraries.
std::optional<FndURL> fileURLWithItemIdentifier(std::string_view identifier);

/// Where the object of that number on the storage root's volume is now, under the same promise.
std::optional<FndURL> fileURLWithFileIdentifier(FileID fileID);

/// As above, on the volume `device`.
std::optional<FndURL> _fileURLWithFileIdentifier_deviceIdentifier(FileID fileID, DeviceID device);

}  // namespace vantrell
