#include "linux/catalog/Comparison.h"

namespace vantrell::linuxos::catalog {

namespace {

bool looksTheSame(const Entry& catalogued, const Entry& seen) {
  return catalogued.fileID == seen.fileID &&
         catalogued.changedNanoseconds == seen.changedNanoseconds &&
         catalogued.modifiedNanoseconds == seen.modifiedNanoseconds &&
         catalogued.size == seen.size &&
         catalogued.kind.without(EntryKind::kRecent) == seen.kind.without(EntryKind::kRecent);
}

/// An object keeps its type for life, whatever its generation says.
bool isSameObject(const Entry& catalogued, const Entry& seen) {
  return catalogued.object() == seen.object() &&
         (catalogued.kind.bits & EntryKind::kFileKindBits) ==
             (seen.kind.bits & EntryKind::kFileKindBits);
}

DifferenceKind differenceOf(const Entry& catalogued, const Entry& seen) {
  if (!isSameObject(catalogued, seen)) return DifferenceKind::Replaced;
  return looksTheSame(catalogued, seen) ? DifferenceKind::Confirmed : DifferenceKind::Changed;
}

}  // namespace

bool isProvenSame(const Entry& catalogued, const Entry& seen) {
  return !catalogued.kind.isRecent() && looksTheSame(catalogued, seen);
}

std::vector<Difference> compareEntries(std::span<const Entry> catalogued, std::span<Entry> seen,
                                       const GenerationOf& generationOf) {
  std::vector<Difference> differences;
  auto before = catalogued.begin();
  auto after = seen.begin();
  while (before != catalogued.end() || after != seen.end()) {
    if (after == seen.end() || (before != catalogued.end() && before->name < after->name)) {
      differences.push_back({DifferenceKind::Vanished, &*before++, nullptr});
      continue;
    }
    const bool isNew = before == catalogued.end() || after->name < before->name;
    const Entry* const old = isNew ? nullptr : &*before++;
    Entry& found = *after++;
    if (old != nullptr && isProvenSame(*old, found)) continue;
    const auto generation = generationOf(found);
    if (generation) {
      found.generation = *generation;
      const auto kind = isNew ? DifferenceKind::Appeared : differenceOf(*old, found);
      differences.push_back({kind, old, &found});
    } else if (old != nullptr) {
      differences.push_back({DifferenceKind::Vanished, old, nullptr});
    }
  }
  return differences;
}

}  // namespace vantrell::linuxos::catalog
