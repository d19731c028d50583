#include "support/TracedSection.h"

#include <limits>

#include "platform/foundation/Fatal.h"

namespace vantrell {

std::int64_t SectionCounter::take() {
  return _queue.sync([this] {
    if (_next == std::numeric_limits<std::int64_t>::max()) {
      fatalError("the numbers of log sections are used up");
    }
    return _next++;
  });
}

TracedSection::~TracedSection() {
  if (_number) logDebug("┗", *_number);
}

}  // namespace vantrell
