#include <cstddef>
#include <cstdint>
#include <cstdlib>

#include "platform/archive/PropertyList.h"

// What can be read can be written again, always to the same bytes. Values are compared by their
// bytes: a real that is no number is not equal to itself. What is shared may unfold to more than
// the writer takes; that alone is no finding.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  using namespace vantrell;
  const auto value = valueFromBinaryPropertyList(FndDataView(data, size));
  if (!value) return 0;
  const auto written = binaryPropertyListFromValue(*value);
  if (!written) return 0;
  const auto again = valueFromBinaryPropertyList(*written);
  if (!again) std::abort();
  const auto writtenAgain = binaryPropertyListFromValue(*again);
  if (!writtenAgain || *writtenAgain != *written) std::abort();
  return 0;
}
