#pragma once

#include <optional>
#include <string_view>

#include "platform/foundation/FndURL.h"

namespace vantrell {

// Where a trashed item came from: the path that it had, relative to the root of the library that
// holds it (its app library, else the storage root). UTF-8, no leading "/", no "." or "..".
//
// Threads: any.

/// The put-back URL of the item at `url`; none when none is stored, and when what is stored is
/// no such path or leads out of the library through a link.
std::optional<FndURL> putBackURLOfItemAt(const FndURL& url);

/// The root of the library that holds `url`: an app library's, else the storage root; none for
/// what lies in neither.
std::optional<FndURL> libraryRootOfItemAt(const FndURL& url);

}  // namespace vantrell
