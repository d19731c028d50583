#include "platform/foundation/FndUUID.h"

#include <random>

namespace vantrell {
namespace {

constexpr std::string_view kHexDigits = "0123456789ABCDEF";
constexpr std::size_t kTextLength = 36;

constexpr bool isDashPosition(std::size_t position) {
  return position == 8 || position == 13 || position == 18 || position == 23;
}

int hexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  return -1;
}

}  // namespace

FndUUID FndUUID::random() {
  std::random_device source;
  Bytes bytes;
  for (auto& byte : bytes) byte = static_cast<std::uint8_t>(source());
  bytes[6] = static_cast<std::uint8_t>((bytes[6] & 0x0f) | 0x40);  // version 4
  bytes[8] = static_cast<std::uint8_t>((bytes[8] & 0x3f) | 0x80);  // the RFC's variant
  return FndUUID(bytes);
}

std::optional<FndUUID> FndUUID::fromString(std::string_view text) {
  if (text.size() != kTextLength) return std::nullopt;
  Bytes bytes{};
  std::size_t digit = 0;
  for (std::size_t i = 0; i < text.size(); ++i) {
    if (isDashPosition(i)) {
      if (text[i] != '-') return std::nullopt;
      continue;
    }
    const int value = hexValue(text[i]);
    if (value < 0) return std::nullopt;
    bytes[digit / 2] = static_cast<std::uint8_t>(bytes[digit / 2] << 4 | value);
    ++digit;
  }
  return FndUUID(bytes);
}

std::string FndUUID::description() const {
  std::string text;
  text.reserve(kTextLength);
  for (const std::uint8_t byte : _bytes) {
    if (isDashPosition(text.size())) text += '-';
    text += kHexDigits[byte >> 4];
    text += kHexDigits[byte & 15];
  }
  return text;
}

}  // namespace vantrell
