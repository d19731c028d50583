#include "platform/foundation/Fatal.h"

#include <cstdio>
#include <cstdlib>

namespace vantrell {

void fatalError(std::string_view message) {
  std::fprintf(stderr, "vantrell: fatal error: %.*s\n", static_cast<int>(message.size()),
               message.data());
  std::abort();
}

}  // namespace vantrell
