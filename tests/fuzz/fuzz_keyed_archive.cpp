#include <cstddef>
#include <cstdint>
#include <cstdlib>

#include "platform/archive/KeyedArchive.h"

namespace {

using namespace vantrell;

Result<ArchiveValue> unarchived(FndDataView bytes) {
  return unarchivedObjectOfClasses(
      bytes,
      {ArchiveClass::Null, ArchiveClass::Number, ArchiveClass::String, ArchiveClass::Date,
       ArchiveClass::Data, ArchiveClass::List, ArchiveClass::Dictionary, ArchiveClass::Record});
}

}  // namespace

// What can be read can be written again, always to the same bytes, and read again.
extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const auto value = unarchived(FndDataView(data, size));
  if (!value) return 0;
  const auto written = archivedDataWithRootObject(*value);
  if (!written) std::abort();
  const auto again = unarchived(*written);
  if (!again) std::abort();
  const auto writtenAgain = archivedDataWithRootObject(*again);
  if (!writtenAgain || *writtenAgain != *written) std::abort();
  return 0;
}
