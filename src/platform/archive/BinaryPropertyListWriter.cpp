#include <bit>
#include <cmath>
#include <unordered_map>
#include <utility>

#include "platform/archive/BinaryPropertyListFormat.h"
#include "platform/archive/PropertyList.h"
#include "platform/archive/TreeMeasure.h"
#include "platform/foundation/UnicodeText.h"

namespace vantrell {
namespace {

using bplist::Type;

struct PropertyListShape {
  static const void* container(const PropertyListValue& value) {
    if (value.array() != nullptr) return value.array();
    return value.dictionary();
  }

  template <class Each>
  static void forEachChild(const PropertyListValue& value, const Each& each) {
    if (const auto* array = value.array()) {
      for (const PropertyListValue& element : *array) {
        if (!each(element)) return;
      }
      return;
    }
    for (const auto& [key, element] : *value.dictionary()) {
      if (!each(element)) return;
    }
  }
};

std::unexpected<FndError> refused(std::string why) {
  return std::unexpected(FndError::vantrell(
      VantrellErrorCode::DamagedData, "This cannot be a property list: " + std::move(why) + "."));
}

void appendBigEndian(FndData& bytes, std::uint64_t value, std::size_t size) {
  for (std::size_t i = size; i > 0; --i) {
    bytes.push_back(static_cast<std::uint8_t>(value >> (8 * (i - 1))));
  }
}

// The least of 1, 2, 4 and 8 bytes that holds `value` unsigned.
std::size_t bytesFor(std::uint64_t value) {
  if (value <= 0xff) return 1;
  if (value <= 0xffff) return 2;
  return value <= 0xffffffff ? 4 : 8;
}

std::uint8_t marker(Type type, std::size_t low) {
  return static_cast<std::uint8_t>(static_cast<unsigned>(type) << 4 | low);
}

FndData unsignedInteger(std::uint64_t value) {
  if (value > static_cast<std::uint64_t>(INT64_MAX)) {  // eight bytes would read as negative
    FndData bytes = {marker(Type::Integer, 4)};
    appendBigEndian(bytes, 0, 8);
    appendBigEndian(bytes, value, 8);
    return bytes;
  }
  const std::size_t size = bytesFor(value);
  FndData bytes = {marker(Type::Integer, static_cast<std::size_t>(std::countr_zero(size)))};
  appendBigEndian(bytes, value, size);
  return bytes;
}

FndData eightBytes(std::uint8_t first, std::uint64_t bits) {
  FndData bytes = {first};
  appendBigEndian(bytes, bits, 8);
  return bytes;
}

FndData number(const FndNumber& value) {
  if (value.isBool())
    return {value.doubleValue() != 0 ? bplist::kTrueMarker : bplist::kFalseMarker};
  if (value.isReal()) {
    return eightBytes(marker(Type::Real, 3), std::bit_cast<std::uint64_t>(value.doubleValue()));
  }
  if (const auto positive = value.exactUInt64()) return unsignedInteger(*positive);
  return eightBytes(marker(Type::Integer, 3), static_cast<std::uint64_t>(*value.exactInt64()));
}

// A marker with a count in it or behind it.
FndData counted(Type type, std::size_t count) {
  if (count < bplist::kCountFollows) return {marker(type, count)};
  FndData bytes = {marker(type, bplist::kCountFollows)};
  const FndData integer = unsignedInteger(count);
  bytes.insert(bytes.end(), integer.begin(), integer.end());
  return bytes;
}

bool isASCII(const std::string& text) {
  for (const char c : text) {
    if (static_cast<unsigned char>(c) >= 0x80) return false;
  }
  return true;
}

Result<FndData> string(const std::string& text) {
  if (isASCII(text)) {
    FndData bytes = counted(Type::Ascii, text.size());
    bytes.insert(bytes.end(), text.begin(), text.end());
    return bytes;
  }
  const auto units = utf16FromUTF8(text);
  if (!units) return refused("a string is not UTF-8");
  FndData bytes = counted(Type::Utf16, units->size() / 2);
  bytes.insert(bytes.end(), units->begin(), units->end());
  return bytes;
}

Result<FndData> date(const FndDate& value) {
  const double seconds = value.secondsSinceReferenceDate();
  if (!FndDate::fromSecondsSinceReferenceDate(seconds)) return refused("a date is too far away");
  return eightBytes(marker(Type::Date, 3), std::bit_cast<std::uint64_t>(seconds));
}

FndData data(const FndData& value) {
  FndData bytes = counted(Type::Data, value.size());
  bytes.insert(bytes.end(), value.begin(), value.end());
  return bytes;
}

FndData uid(PropertyListUID value) {
  const std::size_t size = bytesFor(value.value);
  FndData bytes = {marker(Type::UID, size - 1)};
  appendBigEndian(bytes, value.value, size);
  return bytes;
}

Result<FndData> scalar(const PropertyListValue& value) {
  if (const auto* text = value.string()) return string(*text);
  if (const auto* moment = value.date()) return date(*moment);
  if (const auto* bytes = value.data()) return data(*bytes);
  if (const auto* reference = value.uid()) return uid(*reference);
  return number(*value.number());
}

class Writer {
 public:
  Result<FndData> write(const PropertyListValue& root) {
    if (!TreeMeasure<PropertyListValue, PropertyListShape>().fits(root)) {
      return refused("it is nested too deep or has too many values");
    }
    if (const auto added = add(root); !added) return std::unexpected(added.error());
    return assembled();
  }

 private:
  struct Object {
    FndData bytes;                          // the whole scalar, or a container's marker and count
    std::vector<std::uint64_t> references;  // what follows, for a container
  };

  // These give the number of the object.
  Result<std::uint64_t> add(const PropertyListValue& value) {
    if (const auto* array = value.array()) return addArray(*array);
    if (const auto* dictionary = value.dictionary()) return addDictionary(*dictionary);
    return addScalar(scalar(value));
  }

  Result<std::uint64_t> addScalar(Result<FndData> bytes) {
    if (!bytes) return std::unexpected(std::move(bytes.error()));
    const bool shared = bytes->size() <= bplist::kLongestSharedScalar;
    if (shared) {
      const auto [known, isNew] =
          _shared.try_emplace(std::string(bytes->begin(), bytes->end()), _objects.size());
      if (!isNew) return known->second;
    }
    return append({std::move(*bytes), {}});
  }

  Result<std::uint64_t> addArray(const PropertyListValue::Array& array) {
    const std::uint64_t index = append({counted(Type::Array, array.size()), {}});
    std::vector<std::uint64_t> references;
    references.reserve(array.size());
    for (const PropertyListValue& element : array) {
      auto added = add(element);
      if (!added) return added;
      references.push_back(*added);
    }
    _objects[index].references = std::move(references);
    return index;
  }

  Result<std::uint64_t> addDictionary(const PropertyListValue::Dictionary& dictionary) {
    const std::uint64_t index = append({counted(Type::Dictionary, dictionary.size()), {}});
    std::vector<std::uint64_t> references;
    references.reserve(dictionary.size() * 2);
    for (const auto& [key, element] : dictionary) {
      auto added = addScalar(string(key));
      if (!added) return added;
      references.push_back(*added);
    }
    for (const auto& [key, element] : dictionary) {
      auto added = add(element);
      if (!added) return added;
      references.push_back(*added);
    }
    _objects[index].references = std::move(references);
    return index;
  }

  std::uint64_t append(Object object) {
    _objects.push_back(std::move(object));
    return _objects.size() - 1;
  }

  FndData assembled() const {
    FndData file(bplist::kMagic.begin(), bplist::kMagic.end());
    const std::size_t referenceSize = bytesFor(_objects.size() - 1);
    std::vector<std::uint64_t> offsets;
    offsets.reserve(_objects.size());
    for (const Object& object : _objects) {
      offsets.push_back(file.size());
      file.insert(file.end(), object.bytes.begin(), object.bytes.end());
      for (const std::uint64_t reference : object.references) {
        appendBigEndian(file, reference, referenceSize);
      }
    }
    const std::uint64_t tableOffset = file.size();
    const std::size_t offsetSize = bytesFor(offsets.back());
    for (const std::uint64_t offset : offsets) appendBigEndian(file, offset, offsetSize);
    file.insert(file.end(), 6, 0);
    file.push_back(static_cast<std::uint8_t>(offsetSize));
    file.push_back(static_cast<std::uint8_t>(referenceSize));
    appendBigEndian(file, _objects.size(), 8);
    appendBigEndian(file, 0, 8);
    appendBigEndian(file, tableOffset, 8);
    return file;
  }

  std::vector<Object> _objects;
  std::unordered_map<std::string, std::uint64_t> _shared;  // by the bytes of the scalar
};

}  // namespace

Result<FndData> binaryPropertyListFromValue(const PropertyListValue& value) {
  return Writer().write(value);
}

}  // namespace vantrell
