#include <algorithm>
#include <bit>
#include <string_view>
#include <utility>

#include "platform/archive/BinaryPropertyListFormat.h"
#include "platform/archive/PropertyList.h"
#include "platform/archive/TreeMeasure.h"
#include "platform/foundation/UnicodeText.h"

namespace vantrell {
namespace {

using bplist::Type;

// Keys are the one thing that is copied to every place where it stands. This many bytes of copies
// for each byte of the file: what our writer shares never comes near it.
constexpr std::size_t kKeyBytesPerByte = 64;

std::unexpected<FndError> damaged(std::string_view what, std::size_t offset) {
  return std::unexpected(FndError::vantrell(VantrellErrorCode::DamagedData,
                                            "The property list is damaged: " + std::string(what) +
                                                " (byte " + std::to_string(offset) + ")."));
}

std::uint64_t bigEndian(FndDataView bytes) {
  std::uint64_t value = 0;
  for (const std::uint8_t byte : bytes) value = value << 8 | byte;
  return value;
}

bool isZero(FndDataView bytes) {
  return std::all_of(bytes.begin(), bytes.end(), [](std::uint8_t byte) { return byte == 0; });
}

// Reads what the top object leads to, each object once. What keeps the work in bounds:
// - an object that stands in many places is read once and shared;
// - the objects read may not have more bytes together than there are: offsets that point again
//   and again into the same bytes would make the work grow with the square of the size;
// - nothing is allocated for a count before as many bytes are known to be there.
class Reader {
 public:
  explicit Reader(FndDataView bytes)
      : _bytes(bytes), _keyBytesLeft(bytes.size() * kKeyBytesPerByte) {}

  Result<PropertyListValue> read() {
    if (auto trailer = readTrailer(); !trailer) return std::unexpected(std::move(trailer.error()));
    _slots.resize(_objectCount);
    _bytesLeft = _tableOffset - bplist::kMagic.size();
    auto top = object(_topObject, 0);
    if (!top) return std::unexpected(std::move(top.error()));
    return *(*top)->value;
  }

 private:
  // What is known of one object.
  struct Slot {
    std::optional<PropertyListValue> value;
    std::size_t height = 0;  // of containers in it, itself included
    bool isOpen = false;     // it is being read: to meet it again is a cycle
  };

  // A container's elements, and the height of the tallest.
  struct Elements {
    PropertyListValue::Array values;
    std::size_t height = 0;
  };

  // The body of an object, and how many elements it has.
  struct Body {
    std::size_t offset;
    std::size_t count;
    FndDataView bytes;
  };

  using Value = Result<PropertyListValue>;

  Result<void> readTrailer() {
    const std::size_t least = bplist::kMagic.size() + bplist::kTrailerSize + 2;
    if (_bytes.size() < least) return damaged("it is too short", _bytes.size());
    if (!std::equal(bplist::kMagic.begin(), bplist::kMagic.end(), _bytes.begin())) {
      return damaged("it does not begin with \"bplist00\"", 0);
    }
    const std::size_t end = _bytes.size() - bplist::kTrailerSize;
    const FndDataView trailer = _bytes.subspan(end);
    _offsetSize = trailer[6];
    _referenceSize = trailer[7];
    if (_offsetSize < 1 || _offsetSize > 8) return damaged("an impossible offset size", end + 6);
    if (_referenceSize < 1 || _referenceSize > 8) {
      return damaged("an impossible reference size", end + 7);
    }
    const std::uint64_t count = bigEndian(trailer.subspan(8, 8));
    _topObject = bigEndian(trailer.subspan(16, 8));
    const std::uint64_t table = bigEndian(trailer.subspan(24, 8));
    if (table <= bplist::kMagic.size() || table > end) {
      return damaged("the offset table lies outside", end + 24);
    }
    if (count > (end - table) / _offsetSize) {
      return damaged("more objects than the offset table has", end + 8);
    }
    if (_topObject >= count) return damaged("the top object does not exist", end + 16);
    _objectCount = static_cast<std::size_t>(count);
    _tableOffset = static_cast<std::size_t>(table);
    return {};
  }

  Result<const Slot*> object(std::uint64_t index, std::size_t depth) {
    const std::size_t entry = _tableOffset + static_cast<std::size_t>(index) * _offsetSize;
    Slot& slot = _slots[static_cast<std::size_t>(index)];
    if (slot.value) return &slot;
    if (slot.isOpen) return damaged("a container holds itself", entry);
    const std::uint64_t offset = bigEndian(_bytes.subspan(entry, _offsetSize));
    if (offset < bplist::kMagic.size() || offset >= _tableOffset) {
      return damaged("an object lies outside", entry);
    }
    slot.isOpen = true;
    auto value = decode(static_cast<std::size_t>(offset), depth, slot.height);
    if (!value) return std::unexpected(std::move(value.error()));
    slot.value = std::move(*value);
    return &slot;
  }

  // `height` is set for containers.
  Value decode(std::size_t offset, std::size_t depth, std::size_t& height) {
    switch (static_cast<Type>(_bytes[offset] >> 4)) {
      case Type::Truth:
        return truth(offset);
      case Type::Integer:
        return integer(offset);
      case Type::Real:
        return real(offset);
      case Type::Date:
        return date(offset);
      case Type::Data:
        return data(offset);
      case Type::Ascii:
        return ascii(offset);
      case Type::Utf16:
        return utf16(offset);
      case Type::UID:
        return uid(offset);
      case Type::Array:
        return array(offset, depth, height);
      case Type::Dictionary:
        return dictionary(offset, depth, height);
    }
    return damaged("an object of an unknown type", offset);
  }

  std::uint8_t low(std::size_t offset) const { return _bytes[offset] & 0xf; }

  // `count` times `unit` bytes at `start`, the body of the object at `offset`.
  Result<Body> body(std::size_t offset, std::size_t start, std::uint64_t count, std::size_t unit) {
    if (count > (_tableOffset - start) / unit)
      return damaged("an object runs past the end", offset);
    const auto fitting = static_cast<std::size_t>(count);
    const std::size_t whole = start - offset + fitting * unit;
    if (whole > _bytesLeft) return damaged("objects overlap", offset);
    _bytesLeft -= whole;
    return Body{start, fitting, _bytes.subspan(start, fitting * unit)};
  }

  Result<Body> fixedBody(std::size_t offset, std::size_t size) {
    return body(offset, offset + 1, size, 1);
  }

  // The body of an object whose count stands in its marker or in an integer behind it.
  Result<Body> countedBody(std::size_t offset, std::size_t unit) {
    if (low(offset) != bplist::kCountFollows) return body(offset, offset + 1, low(offset), unit);
    const std::size_t place = offset + 1;
    if (place >= _tableOffset) return damaged("an object runs past the end", offset);
    const std::size_t size = std::size_t{1} << low(place);
    if (static_cast<Type>(_bytes[place] >> 4) != Type::Integer || size > 8) {
      return damaged("a count that is no integer", place);
    }
    if (size > _tableOffset - place - 1) return damaged("an object runs past the end", offset);
    return body(offset, place + 1 + size, bigEndian(_bytes.subspan(place + 1, size)), unit);
  }

  Value truth(std::size_t offset) {
    const std::uint8_t marker = _bytes[offset];
    if (marker != bplist::kFalseMarker && marker != bplist::kTrueMarker) {
      return damaged("an object of an unknown type", offset);
    }
    if (auto found = fixedBody(offset, 0); !found) return std::unexpected(found.error());
    return PropertyListValue(FndNumber(marker == bplist::kTrueMarker));
  }

  Value integer(std::size_t offset) {
    if (low(offset) > 4) return damaged("an integer of an impossible size", offset);
    const auto found = fixedBody(offset, std::size_t{1} << low(offset));
    if (!found) return std::unexpected(found.error());
    const FndDataView bytes = found->bytes;
    if (bytes.size() < 8) return PropertyListValue(FndNumber(bigEndian(bytes)));
    const std::uint64_t bits = bigEndian(bytes.last(8));
    const auto asSigned = static_cast<std::int64_t>(bits);
    if (bytes.size() == 8) return PropertyListValue(FndNumber(asSigned));
    const std::uint64_t high = bigEndian(bytes.first(8));
    if (high == 0) return PropertyListValue(FndNumber(bits));
    if (high == UINT64_MAX && asSigned < 0) return PropertyListValue(FndNumber(asSigned));
    return damaged("an integer beyond 64 bits", offset);
  }

  Value real(std::size_t offset) {
    if (low(offset) != 2 && low(offset) != 3) {
      return damaged("a real number of an impossible size", offset);
    }
    const auto found = fixedBody(offset, std::size_t{1} << low(offset));
    if (!found) return std::unexpected(found.error());
    const std::uint64_t bits = bigEndian(found->bytes);
    const double value = found->bytes.size() == 8
                             ? std::bit_cast<double>(bits)
                             : std::bit_cast<float>(static_cast<std::uint32_t>(bits));
    return PropertyListValue(FndNumber(value));
  }

  Value date(std::size_t offset) {
    if (low(offset) != 3) return damaged("a date of an impossible size", offset);
    const auto found = fixedBody(offset, 8);
    if (!found) return std::unexpected(found.error());
    const auto value =
        FndDate::fromSecondsSinceReferenceDate(std::bit_cast<double>(bigEndian(found->bytes)));
    if (!value) return damaged("a date that is no moment", offset);
    return PropertyListValue(*value);
  }

  Value data(std::size_t offset) {
    const auto found = countedBody(offset, 1);
    if (!found) return std::unexpected(found.error());
    return PropertyListValue(FndData(found->bytes.begin(), found->bytes.end()));
  }

  Value ascii(std::size_t offset) {
    const auto found = countedBody(offset, 1);
    if (!found) return std::unexpected(found.error());
    const auto high = std::find_if(found->bytes.begin(), found->bytes.end(),
                                   [](std::uint8_t byte) { return byte >= 0x80; });
    if (high != found->bytes.end()) {
      return damaged("an ASCII string with another character",
                     found->offset + static_cast<std::size_t>(high - found->bytes.begin()));
    }
    return PropertyListValue(std::string(found->bytes.begin(), found->bytes.end()));
  }

  Value utf16(std::size_t offset) {
    const auto found = countedBody(offset, 2);
    if (!found) return std::unexpected(found.error());
    auto text = utf8FromUTF16(found->bytes);
    if (!text) return damaged("a surrogate without its partner", found->offset + text.error());
    return PropertyListValue(std::move(*text));
  }

  Value uid(std::size_t offset) {
    const auto found = fixedBody(offset, std::size_t{low(offset)} + 1);
    if (!found) return std::unexpected(found.error());
    const FndDataView bytes = found->bytes;
    const std::size_t used = std::min<std::size_t>(bytes.size(), 4);
    if (!isZero(bytes.first(bytes.size() - used))) return damaged("a UID beyond 32 bits", offset);
    return PropertyListValue(
        PropertyListUID{static_cast<std::uint32_t>(bigEndian(bytes.last(used)))});
  }

  // The objects whose `count` references stand at the front of `bytes`.
  Result<Elements> elements(std::size_t offset, FndDataView bytes, std::size_t count,
                            std::size_t depth) {
    Elements result;
    result.values.reserve(count);
    for (std::size_t i = 0; i < count; ++i) {
      const std::uint64_t index = bigEndian(bytes.subspan(i * _referenceSize, _referenceSize));
      if (index >= _objectCount) return damaged("a reference to no object", offset);
      const auto element = object(index, depth);
      if (!element) return std::unexpected(element.error());
      // Checked from below as well: a shared container may stand deeper than where it was read.
      result.height = std::max(result.height, (*element)->height);
      if (result.height >= kDeepestNesting) return damaged("it is nested too deep", offset);
      result.values.push_back(*(*element)->value);
    }
    return result;
  }

  Value array(std::size_t offset, std::size_t depth, std::size_t& height) {
    if (depth >= kDeepestNesting) return damaged("it is nested too deep", offset);
    const auto found = countedBody(offset, _referenceSize);
    if (!found) return std::unexpected(found.error());
    auto inner = elements(offset, found->bytes, found->count, depth + 1);
    if (!inner) return std::unexpected(std::move(inner.error()));
    height = inner->height + 1;
    return PropertyListValue(std::move(inner->values));
  }

  Value dictionary(std::size_t offset, std::size_t depth, std::size_t& height) {
    if (depth >= kDeepestNesting) return damaged("it is nested too deep", offset);
    const auto found = countedBody(offset, 2 * _referenceSize);
    if (!found) return std::unexpected(found.error());
    const std::size_t count = found->count;
    const auto keys = elements(offset, found->bytes, count, depth + 1);
    if (!keys) return std::unexpected(keys.error());
    auto values = elements(offset, found->bytes.subspan(count * _referenceSize), count, depth + 1);
    if (!values) return std::unexpected(std::move(values.error()));
    PropertyListValue::Dictionary result;
    for (std::size_t i = 0; i < count; ++i) {
      const std::string* key = keys->values[i].string();
      if (key == nullptr) return damaged("a key that is no string", offset);
      if (key->size() > _keyBytesLeft) return damaged("long keys stand in too many places", offset);
      _keyBytesLeft -= key->size();
      const std::size_t before = result.size();
      result.emplace_hint(result.end(), *key, std::move(values->values[i]));
      if (result.size() == before) return damaged("a key that stands twice", offset);
    }
    height = values->height + 1;
    return PropertyListValue(std::move(result));
  }

  const FndDataView _bytes;
  std::size_t _keyBytesLeft;
  std::size_t _bytesLeft = 0;  // of the objects, as long as none has been read twice
  std::size_t _offsetSize = 0;
  std::size_t _referenceSize = 0;
  std::size_t _objectCount = 0;
  std::uint64_t _topObject = 0;
  std::size_t _tableOffset = 0;
  std::vector<Slot> _slots;
};

}  // namespace

Result<PropertyListValue> valueFromBinaryPropertyList(FndDataView bytes) {
  return Reader(bytes).read();
}

}  // namespace vantrell
