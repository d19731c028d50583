#include "tests/fakes/FakeLogSink.h"

#include <algorithm>
#include <chrono>

namespace vantrell {

void FakeLogSink::write(const LogLine& line) {
  const std::lock_guard lock(_mutex);
  _lines.push_back({line.level, std::string(line.subsystem), std::string(line.category),
                    std::string(line.text)});
  _grown.notify_all();
}

bool FakeLogSink::waitForLineEndingWith(std::string_view end) {
  std::unique_lock lock(_mutex);
  return _grown.wait_for(lock, std::chrono::seconds(30), [this, end] {
    return std::ranges::any_of(_lines,
                               [end](const FakeLogLine& line) { return line.text.ends_with(end); });
  });
}

std::vector<FakeLogLine> FakeLogSink::lines() const {
  const std::lock_guard lock(_mutex);
  return _lines;
}

std::vector<std::string> FakeLogSink::texts() const {
  std::vector<std::string> texts;
  for (FakeLogLine& line : lines()) texts.push_back(std::move(line.text));
  return texts;
}

std::vector<std::string> FakeLogSink::textsAt(LogLevel level) const {
  std::vector<std::string> texts;
  for (FakeLogLine& line : lines()) {
    if (line.level == level) texts.push_back(std::move(line.text));
  }
  return texts;
}

bool FakeLogSink::has(LogLevel level, std::string_view text) const {
  const std::lock_guard lock(_mutex);
  return std::ranges::any_of(
      _lines, [&](const FakeLogLine& line) { return line.level == level && line.text == text; });
}

void FakeLogSink::clear() {
  const std::lock_guard lock(_mutex);
  _lines.clear();
}

}  // namespace vantrell
