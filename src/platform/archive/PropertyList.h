#pragma once

#include <cstdint>
#include <map>
#include <memory>
#include <string>
#include <variant>
#include <vector>

#include "platform/foundation/FndData.h"
#include "platform/foundation/FndDate.h"
#include "platform/foundation/FndError.h"
#include "platform/foundation/FndNumber.h"

namespace vantrell {

/// A reference into another table, as keyed archives use it.
struct PropertyListUID {
  std::uint32_t value = 0;
  auto operator<=>(const PropertyListUID&) const = default;
};

/// A value of a property list. Strings are UTF-8. A dictionary is ordered by its keys' bytes.
///
/// Strings, data and containers are shared and never change: a list in which one object stands in
/// a thousand places costs one object.
///
/// Threads: a value; what copies share is never written to.
class PropertyListValue {
 public:
  using Array = std::vector<PropertyListValue>;
  using Dictionary = std::map<std::string, PropertyListValue, std::less<>>;

  explicit PropertyListValue(FndNumber value) : _value(std::move(value)) {}
  explicit PropertyListValue(FndDate value) : _value(value) {}
  explicit PropertyListValue(std::string value)
      : _value(std::make_shared<const std::string>(std::move(value))) {}
  explicit PropertyListValue(FndData value)
      : _value(std::make_shared<const FndData>(std::move(value))) {}
  explicit PropertyListValue(PropertyListUID value) : _value(value) {}
  explicit PropertyListValue(Array value)
      : _value(std::make_shared<const Array>(std::move(value))) {}
  explicit PropertyListValue(Dictionary value)
      : _value(std::make_shared<const Dictionary>(std::move(value))) {}

  /// Null when the value is of another type. The value keeps what is pointed to.
  const FndNumber* number() const { return std::get_if<FndNumber>(&_value); }
  const FndDate* date() const { return std::get_if<FndDate>(&_value); }
  const std::string* string() const { return pointee<std::string>(); }
  const FndData* data() const { return pointee<FndData>(); }
  const PropertyListUID* uid() const { return std::get_if<PropertyListUID>(&_value); }
  const Array* array() const { return pointee<Array>(); }
  const Dictionary* dictionary() const { return pointee<Dictionary>(); }

  /// Deep equality, which does not unfold what both sides share.
  friend bool operator==(const PropertyListValue& a, const PropertyListValue& b);

 private:
  template <class T>
  const T* pointee() const {
    const auto* shared = std::get_if<std::shared_ptr<const T>>(&_value);
    return shared == nullptr ? nullptr : shared->get();
  }

  std::variant<FndNumber, FndDate, PropertyListUID, std::shared_ptr<const std::string>,
               std::shared_ptr<const FndData>, std::shared_ptr<const Array>,
               std::shared_ptr<const Dictionary>>
      _value;
};

/// `value` as a binary property list ("bplist00"). The same value gives the same bytes.
/// Errors: DamagedData for a string that is not UTF-8, for a date more than a million years away,
/// for nesting deeper than a decoder takes (512), and for more than 2^24 values, each counted
/// wherever it stands.
Result<FndData> binaryPropertyListFromValue(const PropertyListValue& value);

/// Reads a binary property list that anybody may have written. Work and memory are bounded by a
/// fixed multiple of the number of bytes. Errors: DamagedData, with what is wrong and where.
Result<PropertyListValue> valueFromBinaryPropertyList(FndDataView bytes);

}  // namespace vantrell
