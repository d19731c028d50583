#pragma once

#include <string>

#include "platform/foundation/FndData.h"

namespace vantrell::cli {

/// The bytes in base64 (RFC 4648, section 4), with padding.
std::string base64(FndDataView bytes);

}  // namespace vantrell::cli
