#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <variant>

namespace vantrell {

/// A number that remembers what it was made from: a truth value, an integer of either sign, or
/// a floating-point number.
///
/// Integers are equal when their values are, whatever their sign; a truth value, an integer and
/// a floating-point number are never equal to one another.
class FndNumber {
 public:
  explicit FndNumber(bool value) : _value(value) {}
  explicit FndNumber(double value) : _value(value) {}
  explicit FndNumber(std::uint64_t value) : _value(value) {}
  explicit FndNumber(std::int64_t value);

  bool isBool() const { return std::holds_alternative<bool>(_value); }
  bool isReal() const { return std::holds_alternative<double>(_value); }
  bool isInteger() const { return !isBool() && !isReal(); }

  /// The exact value in that type, or none when it is not an integer or does not fit.
  std::optional<std::uint64_t> exactUInt64() const;
  std::optional<std::int64_t> exactInt64() const;
  /// The nearest double, for any number; a truth value counts as 0 or 1.
  double doubleValue() const;

  /// Decimal; "true" or "false" for a truth value.
  std::string description() const;

  bool operator==(const FndNumber&) const = default;

 private:
  // An integer that is not negative is always held unsigned, so that equal values compare equal.
  std::variant<bool, std::int64_t, std::uint64_t, double> _value;
};

}  // namespace vantrell
