#include "tests/fakes/FakeFaults.h"

namespace vantrell {

void FakeFaults::failNext(FakeCall call, std::vector<FndError> errors) {
  const std::lock_guard lock(_mutex);
  auto& waiting = _next[call];
  waiting.insert(waiting.end(), errors.begin(), errors.end());
}

void FakeFaults::failAfter(FakeCall call, std::size_t count, FndError error) {
  const std::lock_guard lock(_mutex);
  _atCount.insert_or_assign({call, _calls[call] + count + 1}, std::move(error));
}

void FakeFaults::failAt(FakeCall call, std::string path, FndError error) {
  const std::lock_guard lock(_mutex);
  _at.insert_or_assign({call, std::move(path)}, std::move(error));
}

std::size_t FakeFaults::calls(FakeCall call) const {
  const std::lock_guard lock(_mutex);
  const auto found = _calls.find(call);
  return found == _calls.end() ? 0 : found->second;
}

std::optional<FndError> FakeFaults::next(FakeCall call, const std::string& path) {
  const std::lock_guard lock(_mutex);
  const std::size_t count = ++_calls[call];
  if (const auto found = _atCount.find({call, count}); found != _atCount.end()) {
    return found->second;
  }
  if (const auto found = _at.find({call, path}); found != _at.end()) return found->second;
  auto& waiting = _next[call];
  if (waiting.empty()) return std::nullopt;
  FndError error = std::move(waiting.front());
  waiting.erase(waiting.begin());
  return error;
}

}  // namespace vantrell
