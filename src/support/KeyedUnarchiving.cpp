#include "support/KeyedUnarchiving.h"

#include <any>
#include <string>
#include <utility>

#include "support/Log.h"

namespace vantrell {
namespace {

Result<ArchiveValue> decoded(FndDataView data, ArchiveClass expected, ArchiveClass within) {
  return unarchivedObjectOfClasses(data, {expected, within});
}

void logRefusal(std::string_view got, const FndError& reason, const FndURL& source) {
  logDebug("can't unarchive object; ", reason);
  logError("got ", got, " while unarchiving object from ", source);
}

}  // namespace

FndError invalidResultingClass(std::string_view expected, std::string_view actual) {
  std::string message = "The archive holds an object of another class (expected: ";
  message.append(expected).append(", actual: ").append(actual).append(").");
  return FndError(kVantrellErrorDomain, static_cast<std::int64_t>(VantrellErrorCode::DamagedData),
                  {{"message", std::any(std::move(message))},
                   {"expected", std::any(std::string(expected))},
                   {"actual", std::any(std::string(actual))}});
}

std::optional<ArchiveValue> unarchivedObject(FndDataView data, ArchiveClass expected,
                                             const FndURL& source) {
  return unarchivedObject(data, expected, expected, source);
}

std::optional<ArchiveValue> unarchivedObject(FndDataView data, ArchiveClass expected,
                                             ArchiveClass within, const FndURL& source) {
  Result<ArchiveValue> value = decoded(data, expected, within);
  if (!value) {
    logRefusal("nil", value.error(), source);
    return std::nullopt;
  }
  // What may stand inside a list may also be all that the archive holds.
  if (value->archiveClass() != expected) {
    logRefusal(value->description(),
               invalidResultingClass(archiveClassName(expected), value->className()), source);
    return std::nullopt;
  }
  return std::move(*value);
}

}  // namespace vantrell
