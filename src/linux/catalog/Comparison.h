#pragma once

#include <cstdint>
#include <functional>
#include <optional>
#include <span>
#include <string>
#include <vector>

#include "linux/catalog/EntryKind.h"
#include "platform/foundation/Identifiers.h"

namespace vantrell::linuxos::catalog {

/// One object on the storage volume, told from a later one that got the same number.
struct ObjectID {
  FileID fileID;
  std::uint64_t generation = 0;
  auto operator<=>(const ObjectID&) const = default;
};

/// One name in a folder and what stood there when it was looked at.
struct Entry {
  std::string name;
  FileID fileID;
  EntryKind kind;
  /// Known for every catalogued entry; for one just seen, once somebody had to ask for it.
  std::uint64_t generation = 0;
  std::uint64_t size = 0;
  std::int64_t modifiedNanoseconds = 0;  ///< since 1970
  std::int64_t changedNanoseconds = 0;   ///< ctime, since 1970

  ObjectID object() const { return {fileID, generation}; }
};

enum class DifferenceKind : std::uint8_t {
  Appeared,  ///< only `after`
  Vanished,  ///< only `before`
  Replaced,  ///< another object under the same name
  Changed,   ///< the same object with another ctime, size, mtime or kind
  Confirmed  ///< nothing differs, but the catalogued row could not be trusted without asking
};

/// What one name is after a look, against what it was.
///
/// Lifetime: borrows the entries that were compared.
struct Difference {
  DifferenceKind kind;
  const Entry* before;  ///< null when the name appeared
  const Entry* after;   ///< null when the name vanished
};

/// Asks the disk for the generation of an entry just seen; none when it is gone by now.
using GenerationOf = std::function<std::optional<std::uint64_t>(const Entry&)>;

/// Compares names that were catalogued with names just seen; both in byte order of the names, and
/// both for the same range of names. Asks for the generation only where the catalogued row does
/// not prove that the object is the same, and writes it into the seen entry.
std::vector<Difference> compareEntries(std::span<const Entry> catalogued, std::span<Entry> seen,
                                       const GenerationOf& generationOf);

/// True when everything that a look sees without asking for the generation is as catalogued, and
/// the catalogued row is old enough to be trusted.
bool isProvenSame(const Entry& catalogued, const Entry& seen);

}  // namespace vantrell::linuxos::catalog
