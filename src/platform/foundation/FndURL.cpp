#include "platform/foundation/FndURL.h"

#include <algorithm>
#include <array>
#include <utility>

#include "platform/foundation/UnicodeText.h"

namespace vantrell {
namespace {

constexpr std::string_view kFileScheme = "file://";
constexpr std::string_view kFileSchemeWithoutHost = "file:/";
constexpr std::string_view kHexDigits = "0123456789ABCDEF";

// Calls `each` with every component of `path` that is neither empty nor ".".
template <class Each>
void forEachComponent(std::string_view path, const Each& each) {
  while (!path.empty()) {
    const std::size_t slash = std::min(path.find('/'), path.size());
    const std::string_view component = path.substr(0, slash);
    if (!component.empty() && component != ".") each(component);
    path.remove_prefix(std::min(slash + 1, path.size()));
  }
}

bool isLetter(char c) { return (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z'); }

bool isLetterOrDigitOr(std::string_view others, char c) {
  return isLetter(c) || (c >= '0' && c <= '9') || others.find(c) != std::string_view::npos;
}

bool isUnreserved(char c) { return isLetterOrDigitOr("-._~/!$&'()*+,;=:@", c); }

bool hasScheme(std::string_view text) {
  const std::size_t colon = text.find(':');
  if (colon == std::string_view::npos || !isLetter(text.front())) return false;
  const std::string_view scheme = text.substr(0, colon);
  return std::all_of(scheme.begin(), scheme.end(),
                     [](char c) { return isLetterOrDigitOr("+-.", c); });
}

int hexValue(char c) {
  if (c >= '0' && c <= '9') return c - '0';
  if (c >= 'A' && c <= 'F') return c - 'A' + 10;
  if (c >= 'a' && c <= 'f') return c - 'a' + 10;
  return -1;
}

std::string percentDecoded(std::string_view text) {
  std::string bytes;
  for (std::size_t i = 0; i < text.size(); ++i) {
    const bool escape = text[i] == '%' && i + 2 < text.size() && hexValue(text[i + 1]) >= 0 &&
                        hexValue(text[i + 2]) >= 0;
    bytes +=
        escape ? static_cast<char>(hexValue(text[i + 1]) * 16 + hexValue(text[i + 2])) : text[i];
    if (escape) i += 2;
  }
  return bytes;
}

// U+0000 to U+001F, U+007F to U+009F: a terminal obeys the upper ones as well.
bool isControl(std::string_view character) {
  const auto lead = static_cast<unsigned char>(character.front());
  if (character.size() == 1) return lead < 0x20 || lead == 0x7f;
  return lead == 0xc2 && static_cast<unsigned char>(character[1]) < 0xa0;
}

}  // namespace

std::string_view resourceKeyName(FndURLResourceKey key) {
  static constexpr std::array<std::string_view, 14> kNames = {"FndURLParentDirectoryURLKey",
                                                              "FndURLNameKey",
                                                              "FndURLLocalizedNameKey",
                                                              "FndURLTypeIdentifierKey",
                                                              "FndURLFileSizeKey",
                                                              "FndURLCreationDateKey",
                                                              "FndURLContentModificationDateKey",
                                                              "FndURLIsReadableKey",
                                                              "FndURLIsWritableKey",
                                                              "FndURLIsDirectoryKey",
                                                              "FndURLIsPackageKey",
                                                              "FndURLFileResourceIdentifierKey",
                                                              "FndURLDocumentIdentifierKey",
                                                              "FndURLContentVersionKey"};
  return kNames[static_cast<std::size_t>(key)];
}

FndURL FndURL::fileURLWithPath(std::string_view path) {
  auto object = std::make_shared<Object>();
  std::string& clean = object->path;
  clean.reserve(path.size() + 1);
  forEachComponent(path, [&clean, &object](std::string_view component) {
    clean += '/';
    clean += component;
    if (component == "..") object->hasParentReference = true;
  });
  if (clean.empty()) clean = "/";
  return FndURL(std::move(object));
}

std::optional<FndURL> FndURL::URLWithString(std::string_view text) {
  if (text.starts_with(kFileSchemeWithoutHost)) {
    const bool hasHost = text.starts_with(kFileScheme);  // what stands there is ours
    const std::size_t slash = text.find('/', hasHost ? kFileScheme.size() : 0);
    if (slash == std::string_view::npos) return std::nullopt;
    const std::string path = percentDecoded(text.substr(slash));
    if (path.find('\0') != std::string::npos) return std::nullopt;  // no path has that byte
    return fileURLWithPath(path);
  }
  if (!hasScheme(text)) return std::nullopt;
  auto object = std::make_shared<Object>();
  object->text = text;
  return FndURL(std::move(object));
}

std::string FndURL::standardizedPath() const {
  std::vector<std::string_view> kept;
  forEachComponent(path(), [&kept](std::string_view component) {
    if (component != "..") {
      kept.push_back(component);
    } else if (!kept.empty()) {
      kept.pop_back();
    }
  });
  std::string result;
  for (const std::string_view component : kept) {
    result += '/';
    result += component;
  }
  if (result.empty()) result = "/";
  return result;
}

std::string_view FndURL::lastPathComponent() const {
  const std::string_view text = isFileURL() ? path() : _object->text;
  const std::size_t slash = text.rfind('/');
  if (slash == std::string_view::npos || text.size() == 1) return text;
  return text.substr(slash + 1);
}

std::vector<std::string> FndURL::pathComponents() const {
  std::vector<std::string> components;
  if (!isFileURL()) return components;
  components.emplace_back("/");
  forEachComponent(path(), [&components](std::string_view c) { components.emplace_back(c); });
  return components;
}

FndURL FndURL::URLByAppendingPathComponent(std::string_view component) const {
  std::string joined;
  joined.reserve(path().size() + component.size() + 1);
  joined += path();
  joined += '/';
  joined += component;
  return fileURLWithPath(joined);
}

FndURL FndURL::URLByDeletingLastPathComponent() const {
  const std::string_view text = path();
  const std::size_t slash = text.rfind('/');
  return fileURLWithPath(slash == std::string_view::npos ? "/" : text.substr(0, slash));
}

std::string FndURL::description() const {
  if (!isFileURL()) return _object->text;
  std::string text(kFileScheme);
  for (const char c : path()) {
    if (isUnreserved(c)) {
      text += c;
    } else {
      const auto byte = static_cast<unsigned char>(c);
      text += '%';
      text += kHexDigits[byte >> 4];
      text += kHexDigits[byte & 15];
    }
  }
  return text;
}

std::optional<FndURL::ResourceValue> FndURL::cachedResourceValue(FndURLResourceKey key) const {
  const MutexLock lock(_object->mutex);
  for (const auto& [known, value] : _object->values) {
    if (known == key) return value;
  }
  return std::nullopt;
}

void FndURL::setCachedResourceValue(FndURLResourceKey key, ResourceValue value) const {
  const MutexLock lock(_object->mutex);
  for (auto& [known, old] : _object->values) {
    if (known != key) continue;
    old = std::move(value);
    return;
  }
  _object->values.emplace_back(key, std::move(value));
}

bool operator==(const FndURL& a, const FndURL& b) {
  return a._object == b._object || (a.path() == b.path() && a._object->text == b._object->text);
}

bool operator<(const FndURL& a, const FndURL& b) {
  if (a.isFileURL() != b.isFileURL()) return a.isFileURL();
  return a.isFileURL() ? a.path() < b.path() : a._object->text < b._object->text;
}

std::string displayText(std::string_view bytes) {
  std::string shown;
  shown.reserve(bytes.size());
  while (!bytes.empty()) {
    const auto byte = static_cast<unsigned char>(bytes.front());
    std::size_t length = utf8SequenceLength(bytes);
    if (length == 0 || isControl(bytes.substr(0, length))) {
      shown += "\\x";
      shown += kHexDigits[byte >> 4];
      shown += kHexDigits[byte & 15];
      length = 1;
    } else {
      shown += bytes.substr(0, length);
    }
    bytes.remove_prefix(length);
  }
  return shown;
}

}  // namespace vantrell
