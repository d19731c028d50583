#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

#include "platform/archive/KeyedArchive.h"
#include "platform/foundation/FndData.h"
#include "platform/foundation/FndDate.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndURL.h"

namespace vantrell {

// The metadata that travels with a file in its extended attributes. Each value is one keyed
// archive; the name's end "#PS" asks that the attribute be kept when an application saves the
// document by replacing its file.
//
//   com.quillon.lastuseddate#PS               a date: when the user last opened the item
//   com.quillon.metadata:_kMDItemUserTags     a list of strings: labels of tags, in their order
//   com.quillon.favorite-rank.number#PS       a number, unsigned 64-bit
//   com.quillon.trash.time#PS                 a date: when the item went to the trash
//   com.quillon.trash.putback#PS              a string: the path the item had, relative to the
//                                             root of its library
//
// An attribute that is not there, cannot be read, is no archive, or holds an object of another
// class means that there is no value. Nothing is repaired on reading.
//
// Threads: any.

inline constexpr std::string_view kLastUsedDateAttribute = "com.quillon.lastuseddate#PS";
inline constexpr std::string_view kTagsAttribute = "com.quillon.metadata:_kMDItemUserTags";
inline constexpr std::string_view kFavoriteRankAttribute = "com.quillon.favorite-rank.number#PS";
inline constexpr std::string_view kTrashTimeAttribute = "com.quillon.trash.time#PS";
inline constexpr std::string_view kPutBackAttribute = "com.quillon.trash.putback#PS";

std::optional<FndDate> readLastUsedDate(const FndURL& url);
/// The labels as the framework's tag data, without colours.
std::optional<FndData> readTagData(const FndURL& url);
std::optional<std::uint64_t> readFavoriteRank(const FndURL& url);
std::optional<FndDate> readTrashTime(const FndURL& url);
std::optional<std::string> readPutBackLocation(const FndURL& url);

/// The labels in the framework's tag data, in order, as the tags attribute holds them. Errors:
/// DamagedData.
Result<ArchiveValue> tagLabelsFromTagData(FndDataView tagData);

/// Archives `value` and sets the attribute to it, or removes the attribute when there is no
/// value. Errors, logged: POSIX.
Result<void> writeMetadata(const FndURL& url, std::string_view attribute,
                           const std::optional<ArchiveValue>& value);

}  // namespace vantrell
