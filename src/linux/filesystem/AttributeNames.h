#pragma once

#include <optional>
#include <string>
#include <string_view>

namespace vantrell::linuxos {

/// An attribute's name as Linux wants it: in the namespace that belongs to users. None for a name
/// that no attribute can have.
inline std::optional<std::string> linuxAttributeName(std::string_view name) {
  if (name.empty() || name.find('\0') != std::string_view::npos) return std::nullopt;
  std::string full = "user.";
  full += name;
  return full;
}

}  // namespace vantrell::linuxos
