#pragma once

#include <optional>
#include <span>
#include <string>

#include "platform/foundation/FndURL.h"
#include "platform/types/TypeRegistry.h"
#include "tests/fakes/FakeTree.h"

namespace vantrell {

/// Puts the values of `keys` for the object into the URL's cache.
void cacheFakeResources(const FakeTree& tree, const TypeRegistry& types, const FakeNode& node,
                        const FndURL& url, std::span<const FndURLResourceKey> keys);

/// True for a directory that is one document by its name.
bool isFakePackage(const TypeRegistry& types, const FakeNode& node, std::string_view name);

}  // namespace vantrell
