#pragma once

#include <unistd.h>

#include <cerrno>
#include <string_view>

namespace vantrell::linuxos {

/// Writes all of `text`, taking up again what was cut off. False when the rest cannot be written.
inline bool writeWhole(int fd, std::string_view text) {
  while (!text.empty()) {
    const ssize_t written = ::write(fd, text.data(), text.size());
    if (written < 0 && errno == EINTR) continue;
    if (written <= 0) return false;
    text.remove_prefix(static_cast<std::size_t>(written));
  }
  return true;
}

}  // namespace vantrell::linuxos
