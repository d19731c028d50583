#include "identity/DocIDEventPath.h"

#include <charconv>

namespace vantrell {
namespace {

// Takes `literal` off the front of `text`.
bool skip(std::string_view& text, std::string_view literal) {
  if (!text.starts_with(literal)) return false;
  text.remove_prefix(literal.size());
  return true;
}

// Takes a number off the front of `text`.
template <class Number>
bool take(std::string_view& text, Number& number) {
  const auto read = std::from_chars(text.data(), text.data() + text.size(), number);
  if (read.ec != std::errc()) return false;
  text.remove_prefix(static_cast<std::size_t>(read.ptr - text.data()));
  return true;
}

}  // namespace

std::optional<DocIDEvent> parseDocIDEventPath(std::string_view path) {
  DocIDEvent event;
  const bool read = skip(path, "/.docid/") && take(path, event.device.value) &&
                    skip(path, "/changed/") && take(path, event.documentID.value) &&
                    skip(path, "/src=") && take(path, event.source.value) && skip(path, ",dst=") &&
                    take(path, event.destination.value);
  if (!read || !path.empty()) return std::nullopt;
  return event;
}

}  // namespace vantrell
