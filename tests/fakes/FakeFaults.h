#pragma once

#include <map>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "platform/foundation/FndError.h"

namespace vantrell {

/// The calls of the fakes that can be made to fail.
enum class FakeCall {
  ReadResourceValues,
  Open,
  Status,
  EnumerateDirectory,
  NextEntry,
  CreateDirectory,
  RecursiveSize,
  CanonicalURL,
  DeviceID,
  Identity,
  SetAttribute,
  RemoveAttribute,
  SizeOfAttribute,
  CopyAttribute,
  VolumeUUID,
  PathForFileID,
};

/// Says which calls fail, and counts all of them.
///
/// Threads: any.
class FakeFaults {
 public:
  /// The next calls of that kind fail, one with each of `errors`.
  void failNext(FakeCall call, std::vector<FndError> errors);
  /// The call after `count` more of that kind fails.
  void failAfter(FakeCall call, std::size_t count, FndError error);
  /// Every call of that kind about `path` fails.
  void failAt(FakeCall call, std::string path, FndError error);

  std::size_t calls(FakeCall call) const;

  /// For the fakes: counts the call, and answers the error that it is to fail with.
  std::optional<FndError> next(FakeCall call, const std::string& path);

 private:
  mutable std::mutex _mutex;
  std::map<std::pair<FakeCall, std::size_t>, FndError> _atCount;  // guarded by _mutex
  std::map<FakeCall, std::vector<FndError>> _next;                // guarded by _mutex
  std::map<std::pair<FakeCall, std::string>, FndError> _at;       // guarded by _mutex
  std::map<FakeCall, std::size_t> _calls;                         // guarded by _mutex
};

}  // namespace vantrell
