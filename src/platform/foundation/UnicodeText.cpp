#include "platform/foundation/UnicodeText.h"

#include <cstdint>

namespace vantrell {
namespace {

constexpr std::uint32_t kFirstSupplementary = 0x10000;
constexpr std::uint32_t kFirstHighSurrogate = 0xd800;
constexpr std::uint32_t kFirstLowSurrogate = 0xdc00;
constexpr std::uint32_t kSurrogateBits = 0x3ff;

bool isHighSurrogate(std::uint32_t unit) { return (unit & 0xfc00) == kFirstHighSurrogate; }
bool isLowSurrogate(std::uint32_t unit) { return (unit & 0xfc00) == kFirstLowSurrogate; }

// The code point of a well-formed sequence.
std::uint32_t codePoint(std::string_view sequence) {
  const auto lead = static_cast<unsigned char>(sequence.front());
  if (sequence.size() == 1) return lead;
  std::uint32_t value = lead & (0x7fU >> sequence.size());
  for (const char c : sequence.substr(1)) {
    value = value << 6 | (static_cast<unsigned char>(c) & 0x3fU);
  }
  return value;
}

void appendUnit(FndData& text, std::uint32_t unit) {
  text.push_back(static_cast<std::uint8_t>(unit >> 8));
  text.push_back(static_cast<std::uint8_t>(unit));
}

void appendUTF8(std::string& text, std::uint32_t value) {
  const auto trail = [value](unsigned shift) {
    return static_cast<char>(0x80 | (value >> shift & 0x3f));
  };
  if (value < 0x80) {
    text += static_cast<char>(value);
  } else if (value < 0x800) {
    text += {static_cast<char>(0xc0 | value >> 6), trail(0)};
  } else if (value < kFirstSupplementary) {
    text += {static_cast<char>(0xe0 | value >> 12), trail(6), trail(0)};
  } else {
    text += {static_cast<char>(0xf0 | value >> 18), trail(12), trail(6), trail(0)};
  }
}

}  // namespace

std::size_t utf8SequenceLength(std::string_view bytes) {
  const auto at = [&bytes](std::size_t i) { return static_cast<unsigned char>(bytes[i]); };
  const unsigned char lead = at(0);
  if (lead < 0x80) return 1;
  const std::size_t length = lead >= 0xf0 ? 4 : lead >= 0xe0 ? 3 : 2;
  if (lead < 0xc2 || lead > 0xf4 || bytes.size() < length) return 0;
  for (std::size_t i = 1; i < length; ++i) {
    if ((at(i) & 0xc0) != 0x80) return 0;
  }
  if (lead == 0xe0 && at(1) < 0xa0) return 0;  // overlong
  if (lead == 0xed && at(1) > 0x9f) return 0;  // a surrogate
  if (lead == 0xf0 && at(1) < 0x90) return 0;  // overlong
  if (lead == 0xf4 && at(1) > 0x8f) return 0;  // beyond U+10FFFF
  return length;
}

std::optional<FndData> utf16FromUTF8(std::string_view text) {
  FndData units;
  units.reserve(text.size() * 2);
  while (!text.empty()) {
    const std::size_t length = utf8SequenceLength(text);
    if (length == 0) return std::nullopt;
    const std::uint32_t value = codePoint(text.substr(0, length));
    if (value < kFirstSupplementary) {
      appendUnit(units, value);
    } else {
      const std::uint32_t rest = value - kFirstSupplementary;
      appendUnit(units, kFirstHighSurrogate | rest >> 10);
      appendUnit(units, kFirstLowSurrogate | (rest & kSurrogateBits));
    }
    text.remove_prefix(length);
  }
  return units;
}

std::expected<std::string, std::size_t> utf8FromUTF16(FndDataView text) {
  const auto unitAt = [text](std::size_t i) -> std::uint32_t {
    return static_cast<std::uint32_t>(text[i]) << 8 | text[i + 1];
  };
  std::string utf8;
  utf8.reserve(text.size() / 2);
  for (std::size_t i = 0; i + 1 < text.size(); i += 2) {
    std::uint32_t value = unitAt(i);
    if (isLowSurrogate(value)) return std::unexpected(i);
    if (isHighSurrogate(value)) {
      if (i + 3 >= text.size() || !isLowSurrogate(unitAt(i + 2))) return std::unexpected(i);
      const std::uint32_t low = unitAt(i + 2) & kSurrogateBits;
      value = kFirstSupplementary + ((value & kSurrogateBits) << 10 | low);
      i += 2;
    }
    appendUTF8(utf8, value);
  }
  return utf8;
}

}  // namespace vantrell
