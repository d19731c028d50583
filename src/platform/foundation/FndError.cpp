#include "platform/foundation/FndError.h"

#include <utility>

#include "platform/foundation/PosixNames.h"

namespace vantrell {

FndError::FndError(std::string_view domain, std::int64_t code, UserInfo userInfo)
    : _domain(domain), _code(code), _userInfo(std::move(userInfo)) {}

FndError FndError::posix(int osError, UserInfo userInfo) {
  return FndError(kFndPOSIXErrorDomain, osError, std::move(userInfo));
}

FndError FndError::foundation(FndFoundationErrorCode code, UserInfo userInfo) {
  return FndError(kFndFoundationErrorDomain, static_cast<std::int64_t>(code), std::move(userInfo));
}

FndError FndError::vantrell(VantrellErrorCode code, std::string message) {
  return FndError(kVantrellErrorDomain, static_cast<std::int64_t>(code),
                  {{"message", std::any(std::move(message))}});
}

std::string FndError::message() const {
  if (const auto* text = info<std::string>("message")) return *text;
  if (_domain == kFndPOSIXErrorDomain) return posixErrorText(static_cast<int>(_code));
  if (_domain == kFndFoundationErrorDomain) {
    switch (static_cast<FndFoundationErrorCode>(_code)) {
      case FndFoundationErrorCode::FileReadNoSuchFile:
        return "The file does not exist.";
      case FndFoundationErrorCode::FileWriteNoPermission:
        return "Writing is not permitted here.";
      case FndFoundationErrorCode::FileWriteFileExists:
        return "An item with that name already exists.";
    }
  }
  return "The operation could not be completed.";
}

std::string FndError::description() const {
  return message() + " (" + _domain + " " + std::to_string(_code) + ")";
}

}  // namespace vantrell
