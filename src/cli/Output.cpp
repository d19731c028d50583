#include "cli/Output.h"

#include <unistd.h>

#include <cerrno>

#include "linux/PosixError.h"

namespace vantrell::cli {

Result<void> Output::flush() {
  std::string_view rest = _pending;
  int osError = 0;
  while (_isWanted && !rest.empty()) {
    const ssize_t count = ::write(_descriptor, rest.data(), rest.size());
    osError = errno;
    if (count >= 0) {
      rest.remove_prefix(static_cast<std::size_t>(count));
    } else if (osError == EPIPE) {
      _isWanted = false;
    } else if (osError != EINTR) {
      _pending.clear();
      return std::unexpected(linuxos::posixError(osError));
    }
  }
  _pending.clear();
  return {};
}

bool Output::isTerminal() const { return ::isatty(_descriptor) == 1; }

}  // namespace vantrell::cli
