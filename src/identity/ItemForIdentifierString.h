#pragma once

#include <memory>
#include <string_view>

#include "items/LocalItem.h"

namespace vantrell {

/// A fresh record of the item with that identifier, of any form; null when there is none, or
/// when no record can be made of it. Asked for the temporary local folder it makes the folder.
///
/// Threads: any.
std::shared_ptr<const LocalItem> itemForIdentifierString(std::string_view identifier);

}  // namespace vantrell
