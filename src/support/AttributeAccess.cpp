#include "support/AttributeAccess.h"

#include <cerrno>

#include "platform/Services.h"
#include "support/Log.h"

namespace vantrell {

std::optional<FndData> initWithValueOfXattr_at(std::string_view name, const FndURL& url) {
  ExtendedAttributes& attributes = *platform::services().attributes;
  const Result<std::size_t> size = attributes.sizeOfAttribute(url, name);
  if (!size) {
    if (size.error().isPosix(ENODATA)) return std::nullopt;
    logFailure(size.error().isPosix(ENOENT), "can't get xattr ", name, "; ", size.error());
    return std::nullopt;
  }
  FndData value(*size);
  if (value.empty()) return value;  // a read without room would only ask for the size again
  const Result<std::size_t> copied = attributes.copyAttribute(url, name, value);
  if (!copied) {
    logFailure(copied.error().isPosix(ENOENT), "can't copy data for xattr ", name, "; ",
               copied.error());
    return std::nullopt;
  }
  value.resize(*copied);  // it may have shrunk in between
  return value;
}

Result<void> setOrRemoveXattr(OpenFile& file, std::string_view name,
                              std::optional<FndDataView> value) {
  Result<void> done = value ? file.setAttribute(name, *value) : file.removeAttribute(name);
  if (done) return done;
  const FndError& error = done.error();
  if (!value && error.isPosix(ENODATA)) return {};
  logFailure(error.isPosix(EACCES), value ? "can't set xattr \"" : "can't remove xattr \"", name,
             "\"; ", error);
  return done;
}

}  // namespace vantrell
