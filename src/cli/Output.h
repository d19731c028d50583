#pragma once

#include <string>
#include <string_view>

#include "platform/foundation/FndError.h"

namespace vantrell::cli {

/// Collects text and writes it to a descriptor that somebody else keeps open.
///
/// Threads: use each from one thread at a time.
class Output {
 public:
  explicit Output(int descriptor) : _descriptor(descriptor) {}

  void append(std::string_view text) { _pending += text; }

  /// Writes what is collected. A reader who has gone away (`| head`) is no error: `isWanted`
  /// is false from then on, and nothing more is written. Errors: POSIX.
  Result<void> flush();

  bool isWanted() const { return _isWanted; }
  bool isTerminal() const;

 private:
  int _descriptor;
  std::string _pending;
  bool _isWanted = true;
};

}  // namespace vantrell::cli
