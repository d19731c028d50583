#include "support/ResourceAccess.h"

#include <utility>
#include <variant>

#include "platform/filesystem/URLResourceValues.h"
#include "support/Log.h"

namespace vantrell {
namespace {

template <class Value>
std::optional<Value> resource(FndURLResourceKey key, const FndURL& url) {
  auto value = resourceValue(url, key);
  if (!value) {
    logError("can't get resource \"", resourceKeyName(key), "\" for ", url, "; ", value.error());
    return std::nullopt;
  }
  if (!*value) return std::nullopt;
  Value* typed = std::get_if<Value>(&**value);
  if (typed == nullptr) return std::nullopt;
  return std::move(*typed);
}

}  // namespace

std::optional<std::string> stringResource(FndURLResourceKey key, const FndURL& url) {
  return resource<std::string>(key, url);
}

std::optional<FndNumber> numberResource(FndURLResourceKey key, const FndURL& url) {
  return resource<FndNumber>(key, url);
}

std::optional<FndDate> dateResource(FndURLResourceKey key, const FndURL& url) {
  return resource<FndDate>(key, url);
}

std::optional<bool> boolResource(FndURLResourceKey key, const FndURL& url) {
  return resource<bool>(key, url);
}

std::optional<FndData> dataResource(FndURLResourceKey key, const FndURL& url) {
  return resource<FndData>(key, url);
}

}  // namespace vantrell
