// The way back from an identifier: the resolving half of the URL operations.

#include <cerrno>
#include <charconv>
#include <chrono>
#include <cstdint>
#include <limits>
#include <string>
#include <utility>
#include <vector>

#include "applibraries/ZubAppLibraryManager.h"
#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "identity/IdentityLog.h"
#include "platform/Services.h"
#include "platform/dochost/DhURLOperations.h"
#include "support/Errors.h"

namespace vantrell {
namespace {

constexpr int kMostRetries = 5;
constexpr std::chrono::milliseconds kRestBetweenTries{1};

std::vector<std::string_view> splitAtEquals(std::string_view text) {
  std::vector<std::string_view> parts;
  for (;;) {
    const std::size_t equals = text.find('=');
    parts.push_back(text.substr(0, equals));
    if (equals == std::string_view::npos) return parts;
    text.remove_prefix(equals + 1);
  }
}

// Reads a decimal number as far as there is one: leading white space and a sign are taken, what
// follows the digits is passed over, and no digits at all are 0. A number beyond 64 bits reads
// as the nearest one that there is, so that it names nothing instead of something else.
std::int64_t lenientInteger(std::string_view text) {
  const std::size_t start = text.find_first_not_of(" \t\n\v\f\r");
  if (start == std::string_view::npos) return 0;
  text.remove_prefix(start);
  const bool negative = text.front() == '-';
  if (text.front() == '+') text.remove_prefix(1);
  if (text.starts_with('-') != negative) return 0;  // "+-1"
  std::int64_t number = 0;
  const auto read = std::from_chars(text.data(), text.data() + text.size(), number);
  if (read.ec != std::errc::result_out_of_range) return number;
  return negative ? std::numeric_limits<std::int64_t>::min()
                  : std::numeric_limits<std::int64_t>::max();
}

// The device of the storage root; 0 after saying so in the log.
DeviceID storageDevice() {
  const FndURL& storageRoot = platform::services().manager->documentStorageURL();
  const Result<DeviceID> device = deviceIDWithError(storageRoot);
  if (device) return *device;
  logIdentity(LogLevel::Error, "can't get device ID for \"", storageRoot.path(), "\"; ",
              errnoText(device.error()));
  return {};
}

// One call of the storage service, with 0 as an answer made the failure that it stands for.
Result<FileID> resolveOnce(std::int64_t number, DeviceID device) {
  constexpr std::int64_t kLargest = std::numeric_limits<std::uint32_t>::max();
  if (number < 0 || number > kLargest) return std::unexpected(errorWithPOSIXCode(ENOENT));
  VerstowManager& verstow = *platform::services().verstow;
  verstow.prepare();
  Result<FileID> fileID =
      verstow.resolveDocumentID(DocumentID{static_cast<std::uint32_t>(number)}, device);
  if (fileID && fileID->value == 0) return std::unexpected(errorWithPOSIXCode(ENOENT));
  return fileID;
}

bool mayPass(int osError) { return osError == EAGAIN || osError == EBUSY || osError == ESTALE; }

std::optional<FileID> resolveDocument(std::int64_t number, DeviceID device) {
  Result<FileID> fileID = resolveOnce(number, device);
  for (int retries = 0; !fileID; ++retries) {
    if (retries == kMostRetries) {
      logIdentity(LogLevel::Debug, "can't resolve doc ID \"", number, "\" after five attempts");
      return std::nullopt;
    }
    const int osError = posixCodeOfError(fileID.error());
    if (!mayPass(osError)) {
      logIdentity(LogLevel::Error, "can't resolve doc ID \"", number, "\"; ", errnoText(osError));
      return std::nullopt;
    }
    logIdentity(LogLevel::Debug, "doc ID resolution failed with errno(", osError,
                "), let's try again after resting");
    platform::services().clock->rest(kRestBetweenTries);
    fileID = resolveOnce(number, device);
  }
  return *fileID;
}

bool isWithin(const FndURL& root, const FndURL& url) {
  return dh_relationshipToItemAtURL(root, url) != DhURLRelationship::Other;
}

// Whatever number an identifier makes up, it must not lead out of what is shown.
bool isShown(const FndURL& url) {
  if (isWithin(platform::services().manager->documentStorageURL(), url)) return true;
  const auto roots = ZubAppLibraryManager::rootURLsForAppLibraries();
  for (const FndURL& root : *roots) {
    if (isWithin(root, url)) return true;
  }
  return false;
}

}  // namespace

std::optional<FndURL> fileURLWithItemIdentifier(std::string_view identifier) {
  if (identifier == DochostRootContainerItemIdentifier) {
    // A new object: the manager's own remembers what it has read for as long as it lives.
    return FndURL::fileURLWithPath(platform::services().manager->documentStorageURL().path());
  }
  const std::vector<std::string_view> parts = splitAtEquals(identifier);
  if (parts.size() != 2) {
    logIdentity(LogLevel::Error, "invalid identifier; identifier should have 2 components, not ",
                parts.size());
    return std::nullopt;
  }
  const bool isDocument = parts[0] == "did";
  if (!isDocument && parts[0] != "fid") {
    logIdentity(LogLevel::Error, "invalid host for identifier \"", identifier, "\"");
    return std::nullopt;
  }
  const DeviceID device = storageDevice();
  if (device.value == 0) return std::nullopt;
  const std::int64_t number = lenientInteger(parts[1]);
  FileID fileID{static_cast<std::uint64_t>(number)};
  if (isDocument) {
    const std::optional<FileID> resolved = resolveDocument(number, device);
    if (!resolved) return std::nullopt;
    fileID = *resolved;
  }
  return _fileURLWithFileIdentifier_deviceIdentifier(fileID, device);
}

std::optional<FndURL> fileURLWithFileIdentifier(FileID fileID) {
  const DeviceID device = storageDevice();
  if (device.value == 0) return std::nullopt;
  return _fileURLWithFileIdentifier_deviceIdentifier(fileID, device);
}

std::optional<FndURL> _fileURLWithFileIdentifier_deviceIdentifier(FileID fileID, DeviceID device) {
  const Result<std::string> path = platform::services().volumes->pathForFileID(device, fileID);
  if (path) {
    FndURL url = FndURL::fileURLWithPath(*path);
    if (isShown(url)) return url;
  }
  logIdentity(LogLevel::Debug, "can't resolve path matching file ID \"",
              static_cast<std::int64_t>(fileID.value), "\"; ",
              errnoText(path ? ENOENT : posixCodeOfError(path.error())));
  return std::nullopt;
}

}  // namespace vantrell
