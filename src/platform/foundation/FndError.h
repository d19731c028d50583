#pragma once

#include <any>
#include <cstdint>
#include <expected>
#include <map>
#include <string>
#include <string_view>

namespace vantrell {

/// Codes are errno values.
inline constexpr std::string_view kFndPOSIXErrorDomain = "FndPOSIXErrorDomain";
/// Codes are those of `FndFoundationErrorCode`.
inline constexpr std::string_view kFndFoundationErrorDomain = "FndFoundationErrorDomain";
/// Codes are those of `DochostErrorCode`.
inline constexpr std::string_view kDochostErrorDomain = "DochostErrorDomain";
/// Codes are those of `VantrellErrorCode`.
inline constexpr std::string_view kVantrellErrorDomain = "com.quillon.vantrell";

/// The codes of the foundation (file) domain that somebody branches on.
enum class FndFoundationErrorCode : std::int64_t {
  FileReadNoSuchFile = 260,
  FileWriteNoPermission = 513,
  FileWriteFileExists = 516,
};

/// This system's own errors.
enum class VantrellErrorCode : std::int64_t {
  NotHereYet = 1,         ///< the request is known, and this version cannot answer it
  MissingVolumeUUID = 2,  ///< the volume that holds the storage has no identity
  NoDocumentsFolder = 3,  ///< no "Documents" component in the path: it has no trash
  NotInTrash = 4,         ///< the item to be put back is not in the trash
  UnknownBundle = 5,      ///< no application with that bundle identifier
  NoValidParent = 6,      ///< nowhere to put an item back to
  DamagedData = 7,        ///< an archive or a property list that cannot be decoded
  InvalidArgument = 8,    ///< the caller's words are off; the message says how
  StateUnavailable = 9,   ///< the state folder or its database cannot be used
};

/// What went wrong: a domain, a code of that domain, and what the reader may want to know more.
///
/// `userInfo` holds values under the keys that the domain names: strings, `FndURL` and shared
/// items. "message" is a text for people; `description()` shows it.
///
/// Threads: a value; share it as you would a string.
class FndError {
 public:
  using UserInfo = std::map<std::string, std::any, std::less<>>;

  FndError(std::string_view domain, std::int64_t code, UserInfo userInfo = {});

  /// An error in the POSIX domain. `osError` is an errno value.
  static FndError posix(int osError, UserInfo userInfo = {});
  static FndError foundation(FndFoundationErrorCode code, UserInfo userInfo = {});
  /// An error of this system's own, with a text that says what to do about it.
  static FndError vantrell(VantrellErrorCode code, std::string message);

  const std::string& domain() const { return _domain; }
  std::int64_t code() const { return _code; }
  const UserInfo& userInfo() const { return _userInfo; }

  /// The value under `key` when there is one of that type, else null. The error keeps it.
  template <class T>
  const T* info(std::string_view key) const {
    const auto found = _userInfo.find(key);
    return found == _userInfo.end() ? nullptr : std::any_cast<T>(&found->second);
  }

  bool is(std::string_view domain, std::int64_t code) const {
    return _code == code && _domain == domain;
  }
  bool isPosix(int osError) const { return is(kFndPOSIXErrorDomain, osError); }

  /// A text for people: the message if there is one, else what the domain says of the code.
  std::string message() const;
  /// `message()` with domain and code, as log lines show an error.
  std::string description() const;

 private:
  std::string _domain;
  std::int64_t _code;
  UserInfo _userInfo;
};

template <class T>
using Result = std::expected<T, FndError>;

}  // namespace vantrell
