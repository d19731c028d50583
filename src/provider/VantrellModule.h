#pragma once

#include "platform/dochost/DochostExtension.h"

/// The module's one exported routine: creates the extension, which the caller owns. The services
/// must be installed, and must stay so until the extension has been destroyed.
extern "C" [[gnu::visibility("default")]] vantrell::DochostExtension* vantrellCreateExtension();

namespace vantrell {

/// The routine's name in the module, and its type, for who looks it up there.
inline constexpr char kVantrellCreateExtensionSymbol[] = "vantrellCreateExtension";
using VantrellCreateExtension = decltype(&vantrellCreateExtension);

}  // namespace vantrell
