#pragma once

#include <nlohmann/json.hpp>
#include <string>
#include <string_view>

#include "platform/dochost/DochostItem.h"
#include "platform/foundation/FndError.h"

namespace vantrell::cli {

/// Keeps the order in which fields are put in.
using Json = nlohmann::ordered_json;

/// Puts `bytes` in under `key`. What is not UTF-8 is shown there with replacement characters,
/// and stands whole, in base64, under the key with "Base64" behind it.
void putText(Json& object, std::string_view key, const std::string& bytes);

/// The record of an item, with the field names of the host framework's items. Values the item
/// does not have are left out.
Json recordOfItem(const DochostItem& item);

/// Domain, code and message; for a POSIX error its symbolic name too.
Json recordOfError(const FndError& error);

/// The object on one line, with the line's end.
std::string lineOf(const Json& object);

/// The object's fields for people: one a line, the values aligned, nested ones as "outer.inner",
/// nothing in it that a terminal would take for more than text.
std::string tableOf(const Json& object);

}  // namespace vantrell::cli
