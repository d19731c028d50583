#pragma once

#include <cstdint>
#include <optional>
#include <string_view>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndUUID.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell {

/// What stands in every sync anchor and every page: where to go on.
///
/// Threads: a value.
struct FSChangeToken {
  /// The keys under which the fields are coded.
  enum class CodingKeys : std::uint8_t {
    version,
    deviceUUID,
    streamEventID,
    offset,
    appLibraryVersionToken,
  };

  std::uint64_t version = 0;
  FndUUID deviceUUID;        ///< of the volume that holds what is enumerated
  EventID streamEventID;     ///< the event after which changes are to be replayed
  std::uint64_t offset = 0;  ///< entries of the listing already delivered; 0 in anchors
  std::uint64_t appLibraryVersionToken = 0;

  static FSChangeToken syncAnchor(const FndUUID& deviceUUID, EventID currentEventID);
  /// `gatherEventID` is the event at which the listing was started.
  static FSChangeToken page(const FndUUID& deviceUUID, EventID gatherEventID, std::uint64_t offset);

  /// The token as it is handed out; never exactly 48 bytes.
  FndData encoded() const;
  /// Reads what `encoded` gave. Errors: DamagedData, also for anything of exactly 48 bytes.
  static Result<FSChangeToken> decoded(FndDataView data);

  bool operator==(const FSChangeToken&) const = default;
};

/// The one letter of a key, and the key of exactly such a string.
std::string_view stringValue(FSChangeToken::CodingKeys key);
std::optional<FSChangeToken::CodingKeys> codingKeyFromString(std::string_view string);

/// Lengthens data of the one size that is never handed out by a zero byte.
FndData paddedAnchorData(FndData data);

/// As `FSChangeToken::decoded`, for what the host hands in. Errors, logged: sync anchor expired.
Result<FSChangeToken> changeTokenFromAnchorData(FndDataView data);

/// Whether a token still belongs to the volume. Errors, logged: sync anchor expired.
Result<void> checkDeviceUUID(const FSChangeToken& token, const FndUUID& currentUUID);

}  // namespace vantrell
