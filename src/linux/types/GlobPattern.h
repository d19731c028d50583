#pragma once

#include <string_view>

namespace vantrell::linuxos {

/// True when `text` matches `pattern`: "*" any bytes, "?" one byte, "[a-z]" and "[!a-z]" one byte
/// of a set, anything else itself. A "[" without its "]" is an ordinary byte.
///
/// Takes time in proportion to the product of the lengths at most, whatever the pattern:
/// fnmatch(3) can take exponential time, and patterns come from files that anybody may install.
bool matchesGlob(std::string_view pattern, std::string_view text);

}  // namespace vantrell::linuxos
