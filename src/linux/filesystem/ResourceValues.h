#pragma once

#include <optional>
#include <string>

#include "linux/filesystem/Access.h"
#include "linux/filesystem/ObjectStatus.h"
#include "platform/foundation/FndURL.h"

namespace vantrell::linuxos {

/// Everything that one look at an object tells, from which its resource values are made.
struct ObjectView {
  const ObjectStatus& status;
  std::string typeIdentifier;
  bool isPackage = false;
  ObjectAccess access;    ///< needed for IsReadable and IsWritable only
  DocumentID documentID;  ///< 0 when none is known
};

/// The value of `key` for the object at `url`; none when the object has no such value.
/// `parent` is the URL of its folder.
std::optional<FndURL::ResourceValue> makeResourceValue(FndURLResourceKey key, const FndURL& url,
                                                       const FndURL& parent,
                                                       const ObjectView& view);

/// 16 bytes that change whenever the content does: the modification time in nanoseconds since
/// 1970, then the size in bytes, both as unsigned 64-bit little-endian numbers (the time modulo
/// 2^64).
FndData contentVersion(const ObjectStatus& status);

}  // namespace vantrell::linuxos
