#pragma once

#include <span>
#include <string>

#include "platform/dochost/DochostItem.h"
#include "platform/types/TypeRegistry.h"

namespace vantrell::cli {

/// Items as lines for people: identifier, kind, size, date of modification, name and tags.
///
/// Columns are aligned within a page and never get narrower on a later one, so that a listing
/// needs no more than a page in memory.
///
/// Threads: use each from one thread at a time.
/// Lifetime: borrows `types`, which must outlive it.
class ItemTable {
 public:
  ItemTable(const TypeRegistry& types, bool withColor) : _types(types), _withColor(withColor) {}

  std::string linesOf(std::span<const DochostItemRef> page);

 private:
  struct Row;
  Row rowOf(const DochostItem& item) const;
  std::string lineOf(const Row& row) const;

  const TypeRegistry& _types;
  const bool _withColor;
  std::size_t _identifierWidth = 0;
  std::size_t _sizeWidth = 0;
};

/// A number of bytes for people: "999 B", "1.0 kB", "12.3 MB".
std::string textOfByteCount(std::uint64_t bytes);

}  // namespace vantrell::cli
