#include "tests/support/RawPropertyList.h"

namespace vantrell {
namespace {

constexpr std::string_view kMagic = "bplist00";
constexpr std::uint8_t kAscii = 0x50;
constexpr std::uint8_t kArray = 0xa0;
constexpr std::uint8_t kDictionary = 0xd0;

void append(FndData& bytes, const FndData& more) {
  bytes.insert(bytes.end(), more.begin(), more.end());
}

int hexValue(char c) { return c <= '9' ? c - '0' : (c | 0x20) - 'a' + 10; }

}  // namespace

FndData bigEndianBytes(std::uint64_t value, std::size_t size) {
  FndData bytes(size, 0);
  for (std::size_t i = 0; i < size && i < 8; ++i) {
    bytes[size - 1 - i] = static_cast<std::uint8_t>(value >> (8 * i));
  }
  return bytes;
}

FndData bytesFromHex(std::string_view digits) {
  FndData bytes;
  bool isLow = false;
  for (const char c : digits) {
    if (c == ' ' || c == '\n') continue;
    if (!isLow) bytes.push_back(0);
    bytes.back() = static_cast<std::uint8_t>(bytes.back() << 4 | hexValue(c));
    isLow = !isLow;
  }
  return bytes;
}

std::uint64_t RawPropertyList::add(FndData object) {
  _offsets.push_back(kMagic.size() + _objects.size());
  append(_objects, object);
  return _offsets.size() - 1;
}

std::uint64_t RawPropertyList::addString(std::string_view ascii) {
  FndData object;
  appendCounted(object, kAscii, ascii.size());
  object.insert(object.end(), ascii.begin(), ascii.end());
  return add(std::move(object));
}

std::uint64_t RawPropertyList::addArray(const References& elements) {
  FndData object;
  appendCounted(object, kArray, elements.size());
  for (const std::uint64_t element : elements) {
    append(object, bigEndianBytes(element, _referenceSize));
  }
  return add(std::move(object));
}

std::uint64_t RawPropertyList::addDictionary(const References& keys, const References& values) {
  FndData object;
  appendCounted(object, kDictionary, keys.size());
  for (const std::uint64_t key : keys) append(object, bigEndianBytes(key, _referenceSize));
  for (const std::uint64_t value : values) append(object, bigEndianBytes(value, _referenceSize));
  return add(std::move(object));
}

std::uint64_t RawPropertyList::addAgain(std::uint64_t object) {
  _offsets.push_back(_offsets[static_cast<std::size_t>(object)]);
  return _offsets.size() - 1;
}

void RawPropertyList::claimSizes(std::uint8_t offsetSize, std::uint8_t referenceSize) {
  _claimedSizes = Sizes{offsetSize, referenceSize};
}

void RawPropertyList::appendCounted(FndData& object, std::uint8_t type, std::uint64_t count) const {
  if (count < 15) {
    object.push_back(static_cast<std::uint8_t>(type | count));
    return;
  }
  object.push_back(type | 0x0f);
  object.push_back(0x13);
  append(object, bigEndianBytes(count, 8));
}

FndData RawPropertyList::bytes() const {
  FndData file(kMagic.begin(), kMagic.end());
  append(file, _objects);
  const std::uint64_t tableOffset = file.size();
  for (const std::uint64_t offset : _offsets) append(file, bigEndianBytes(offset, _offsetSize));
  file.insert(file.end(), 6, 0);
  const Sizes truth{static_cast<std::uint8_t>(_offsetSize),
                    static_cast<std::uint8_t>(_referenceSize)};
  const Sizes sizes = _claimedSizes.value_or(truth);
  file.push_back(sizes.offset);
  file.push_back(sizes.reference);
  append(file, bigEndianBytes(_claimedCount.value_or(_offsets.size()), 8));
  append(file, bigEndianBytes(_top, 8));
  append(file, bigEndianBytes(_claimedTableOffset.value_or(tableOffset), 8));
  return file;
}

}  // namespace vantrell
