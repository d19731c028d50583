#include "enumeration/FSChangeToken.h"

#include <array>
#include <string>
#include <utility>

#include "platform/archive/PropertyList.h"
#include "platform/dochost/DochostErrors.h"
#include "platform/foundation/Fatal.h"
#include "support/Log.h"

namespace vantrell {
namespace {

// A token is a binary property list: one dictionary with exactly five keys.
//
//   "v" integer  version                     "o" integer  offset
//   "d" string   36 characters, upper case   "a" integer  app-library version token
//   "s" integer  stream event ID
//
// Data of exactly 48 bytes is never handed out and never taken: a list that comes out that long
// gets one zero byte more.

constexpr std::size_t kRefusedSize = 48;

using CodingKeys = FSChangeToken::CodingKeys;
constexpr std::array kAllKeys = {CodingKeys::version, CodingKeys::deviceUUID,
                                 CodingKeys::streamEventID, CodingKeys::offset,
                                 CodingKeys::appLibraryVersionToken};
constexpr std::array<std::string_view, kAllKeys.size()> kStrings = {"v", "d", "s", "o", "a"};

FndError damaged(std::string message) {
  return FndError::vantrell(VantrellErrorCode::DamagedData, std::move(message));
}

PropertyListValue integer(std::uint64_t value) { return PropertyListValue(FndNumber(value)); }

const PropertyListValue* find(const PropertyListValue::Dictionary& fields, CodingKeys key) {
  for (const auto& [string, value] : fields) {
    if (codingKeyFromString(string) == key) return &value;
  }
  return nullptr;
}

Result<std::uint64_t> unsignedField(const PropertyListValue::Dictionary& fields, CodingKeys key) {
  const PropertyListValue* value = find(fields, key);
  const FndNumber* number = value == nullptr ? nullptr : value->number();
  const auto exact = number == nullptr ? std::nullopt : number->exactUInt64();
  if (exact) return *exact;
  return std::unexpected(
      damaged("The token has no number under \"" + std::string(stringValue(key)) + "\"."));
}

Result<FndUUID> deviceField(const PropertyListValue::Dictionary& fields) {
  const PropertyListValue* value = find(fields, CodingKeys::deviceUUID);
  const std::string* text = value == nullptr ? nullptr : value->string();
  const auto uuid = text == nullptr ? std::nullopt : FndUUID::fromString(*text);
  if (uuid) return *uuid;
  return std::unexpected(damaged("The token has no UUID under \"d\"."));
}

}  // namespace

std::string_view stringValue(CodingKeys key) { return kStrings[static_cast<std::size_t>(key)]; }

std::optional<CodingKeys> codingKeyFromString(std::string_view string) {
  for (const CodingKeys key : kAllKeys) {
    if (stringValue(key) == string) return key;
  }
  return std::nullopt;
}

FSChangeToken FSChangeToken::syncAnchor(const FndUUID& deviceUUID, EventID currentEventID) {
  return {.version = 0,
          .deviceUUID = deviceUUID,
          .streamEventID = currentEventID,
          .offset = 0,
          .appLibraryVersionToken = 0};
}

FSChangeToken FSChangeToken::page(const FndUUID& deviceUUID, EventID gatherEventID,
                                  std::uint64_t offset) {
  FSChangeToken token = syncAnchor(deviceUUID, gatherEventID);
  token.offset = offset;
  return token;
}

FndData FSChangeToken::encoded() const {
  PropertyListValue::Dictionary fields;
  fields.emplace(stringValue(CodingKeys::version), integer(version));
  fields.emplace(stringValue(CodingKeys::deviceUUID), PropertyListValue(deviceUUID.description()));
  fields.emplace(stringValue(CodingKeys::streamEventID), integer(streamEventID.value));
  fields.emplace(stringValue(CodingKeys::offset), integer(offset));
  fields.emplace(stringValue(CodingKeys::appLibraryVersionToken), integer(appLibraryVersionToken));
  Result<FndData> data = binaryPropertyListFromValue(PropertyListValue(std::move(fields)));
  if (!data) fatalError("can't encode a change token; " + data.error().description());
  return paddedAnchorData(std::move(*data));
}

Result<FSChangeToken> FSChangeToken::decoded(FndDataView data) {
  if (data.size() == kRefusedSize) {
    return std::unexpected(damaged("A token of 48 bytes is refused."));
  }
  const Result<PropertyListValue> root = valueFromBinaryPropertyList(data);
  if (!root) return std::unexpected(root.error());
  const auto* fields = root->dictionary();
  if (fields == nullptr) return std::unexpected(damaged("The token is no dictionary."));
  const Result<FndUUID> device = deviceField(*fields);
  if (!device) return std::unexpected(device.error());
  FSChangeToken token{.version = 0,
                      .deviceUUID = *device,
                      .streamEventID = {},
                      .offset = 0,
                      .appLibraryVersionToken = 0};
  for (const auto& [key, field] :
       {std::pair(CodingKeys::version, &token.version),
        std::pair(CodingKeys::streamEventID, &token.streamEventID.value),
        std::pair(CodingKeys::offset, &token.offset),
        std::pair(CodingKeys::appLibraryVersionToken, &token.appLibraryVersionToken)}) {
    const Result<std::uint64_t> value = unsignedField(*fields, key);
    if (!value) return std::unexpected(value.error());
    *field = *value;
  }
  return token;
}

FndData paddedAnchorData(FndData data) {
  if (data.size() == kRefusedSize) data.push_back(0);
  return data;
}

Result<FSChangeToken> changeTokenFromAnchorData(FndDataView data) {
  Result<FSChangeToken> token = FSChangeToken::decoded(data);
  if (token) return token;
  logError("can't create change token from anchor data, resetting");
  return std::unexpected(dochostErrorSyncAnchorExpired());
}

Result<void> checkDeviceUUID(const FSChangeToken& token, const FndUUID& currentUUID) {
  if (token.deviceUUID == currentUUID) return {};
  logDebug("device UUID changed (", token.deviceUUID, " -> ", currentUUID, ")");
  return std::unexpected(dochostErrorSyncAnchorExpired());
}

}  // namespace vantrell
