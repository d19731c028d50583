#pragma once

#include <functional>
#include <string>
#include <string_view>
#include <unordered_map>

namespace vantrell::linuxos {

struct StringHash {
  using is_transparent = void;
  std::size_t operator()(std::string_view text) const {
    return std::hash<std::string_view>()(text);
  }
};

/// A map by text that is asked with a view, without a copy being made.
template <class Value>
using StringMap = std::unordered_map<std::string, Value, StringHash, std::equal_to<>>;

}  // namespace vantrell::linuxos
