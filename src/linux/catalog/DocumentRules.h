#pragma once

#include <cstdint>

namespace vantrell::linuxos::catalog {

/// Where a document's file is after a look that did not find it at the document's home.
enum class Whereabouts : std::uint8_t {
  OutOfView,      ///< nowhere that is catalogued
  MovedAside,     ///< only under set-aside names that are new to it
  KeptElsewhere,  ///< under a name that it had before, and no new ordinary one
  Renamed,        ///< under an ordinary name that is new to it, perhaps under others too
};

/// What stands at the document's home after the look.
enum class Occupant : std::uint8_t {
  None,       ///< nothing, or something that is no document
  Fresh,      ///< an object never catalogued but under set-aside names, free to be taken
  Unclaimed,  ///< an object that had an ordinary name and stands for no document of its own
  Claimed,    ///< an object that stands for another document
};

enum class Fate : std::uint8_t {
  Follows,    ///< the home goes to where the file is
  HandsOver,  ///< the document goes on with what stands at its home
  Gone,       ///< until the same object comes back into view
};

/// The table in docs/guarantees.md, but for what the names of its words need to be looked up.
constexpr Fate fateOf(Whereabouts file, Occupant occupant) {
  switch (file) {
    case Whereabouts::OutOfView:
      return occupant == Occupant::Fresh || occupant == Occupant::Unclaimed ? Fate::HandsOver
                                                                            : Fate::Gone;
    case Whereabouts::MovedAside:
    case Whereabouts::KeptElsewhere:
      return occupant == Occupant::Fresh ? Fate::HandsOver : Fate::Follows;
    case Whereabouts::Renamed:
      break;
  }
  return Fate::Follows;
}

}  // namespace vantrell::linuxos::catalog
