#include "platform/foundation/FndNumber.h"

#include <array>
#include <charconv>
#include <limits>

namespace vantrell {

FndNumber::FndNumber(std::int64_t value) : _value(value) {
  if (value >= 0) _value = static_cast<std::uint64_t>(value);
}

std::optional<std::uint64_t> FndNumber::exactUInt64() const {
  if (const auto* value = std::get_if<std::uint64_t>(&_value)) return *value;
  return std::nullopt;
}

std::optional<std::int64_t> FndNumber::exactInt64() const {
  if (const auto* value = std::get_if<std::int64_t>(&_value)) return *value;
  const auto* value = std::get_if<std::uint64_t>(&_value);
  constexpr auto kLargest = static_cast<std::uint64_t>(std::numeric_limits<std::int64_t>::max());
  if (value == nullptr || *value > kLargest) return std::nullopt;
  return static_cast<std::int64_t>(*value);
}

double FndNumber::doubleValue() const {
  return std::visit([](auto value) { return static_cast<double>(value); }, _value);
}

std::string FndNumber::description() const {
  if (const auto* truth = std::get_if<bool>(&_value)) return *truth ? "true" : "false";
  std::array<char, 64> text{};
  const auto end = std::visit(
      [&text](auto value) -> char* {
        if constexpr (std::is_same_v<decltype(value), bool>) {
          return text.data();
        } else {
          return std::to_chars(text.data(), text.data() + text.size(), value).ptr;
        }
      },
      _value);
  return std::string(text.data(), end);
}

}  // namespace vantrell
