#pragma once

#include <string>
#include <string_view>

#include "platform/foundation/FndError.h"

namespace vantrell::cli {

/// Tells on standard error what went wrong: text for people, or one JSON object a line.
///
/// Threads: use each from one thread at a time.
class Reporter {
 public:
  explicit Reporter(bool asJson) : _asJson(asJson) {}

  /// `subject` is what the user named, as it was written; it may be empty.
  void error(std::string_view subject, const FndError& error) const;
  void warning(const std::string& text) const;
  void wrongUsage(const std::string& reason) const;

 private:
  bool _asJson;
};

}  // namespace vantrell::cli
