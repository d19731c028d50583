#include "enumeration/FSDirectoryEnumerator.h"

#include <memory>

#include "items/LocalItem.h"
#include "platform/Services.h"
#include "support/Errors.h"
#include "support/Log.h"

namespace vantrell {
namespace {

// What goes on over all the roots of one call.
struct Progress {
  std::uint64_t counter = 0;
  bool keepGoing = true;
};

std::uint8_t baseOptions(bool recursively) {
  constexpr std::uint8_t kAlways = kSkipsHiddenFiles | kSkipsPackageDescendants;
  return recursively ? kAlways : static_cast<std::uint8_t>(kAlways | kSkipsSubdirectoryDescendants);
}

std::unique_ptr<DirectoryEnumerator> openRoot(const FSDirectoryEnumerator& scanner,
                                              const FndURL& root) {
  std::optional<std::uint8_t> options;
  if (scanner.directoryEnumerationOptionsFor) {
    options = scanner.directoryEnumerationOptionsFor(root);
  }
  auto entries = platform::services().fileSystem->enumerateDirectory(
      root, LocalItem::urlKeys(), options.value_or(baseOptions(scanner.recursively)),
      scanner.errorHandler);
  if (entries) return std::move(*entries);
  logError("can't create file enumerator at ", root.path());
  return nullptr;
}

Result<void> listRoot(const FSDirectoryEnumerator& scanner, DirectoryEnumerator& entries,
                      const FSDirectoryEnumerator::Handler& handler, Progress& progress) {
  while (const std::optional<FndURL> entry = entries.next()) {
    if (progress.counter < scanner.offset) {
      ++progress.counter;
      continue;
    }
    if (progress.counter - scanner.offset >= scanner.limit) {
      progress.keepGoing = false;
      return {};
    }
    ++progress.counter;
    const Result<bool> answer = handler(*entry);
    if (!answer) return std::unexpected(answer.error());
    progress.keepGoing = *answer;
  }
  return {};
}

}  // namespace

Result<std::uint64_t> FSDirectoryEnumerator::enumerate(const Handler& handler) const {
  if (limit == 0) return 0;
  Progress progress;
  for (const FndURL& root : urls) {
    const auto entries = openRoot(*this, root);
    if (entries != nullptr) {
      if (const auto listed = listRoot(*this, *entries, handler, progress); !listed) {
        return std::unexpected(listed.error());
      }
    }
    if (!progress.keepGoing) break;
  }
  return progress.counter;
}

bool standardDirectoryErrorHandler(const FndURL& url, const FndError& error) {
  logFailure(isNoSuchFileReadError(error), "can't enumerate ", url.path(), "; ", error);
  return true;
}

}  // namespace vantrell
