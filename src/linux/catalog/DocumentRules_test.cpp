#include "linux/catalog/DocumentRules.h"

#include <gtest/gtest.h>

namespace vantrell::linuxos::catalog {
namespace {

struct Row {
  Whereabouts file;
  Occupant occupant;
  Fate fate;
};

TEST(DocumentRules, EveryCombinationHasTheFateOfTheTable) {
  using enum Whereabouts;
  using enum Occupant;
  const Row rows[] = {
      {OutOfView, None, Fate::Gone},
      {OutOfView, Fresh, Fate::HandsOver},
      {OutOfView, Unclaimed, Fate::HandsOver},
      {OutOfView, Claimed, Fate::Gone},
      {MovedAside, None, Fate::Follows},
      {MovedAside, Fresh, Fate::HandsOver},
      {MovedAside, Unclaimed, Fate::Follows},
      {MovedAside, Claimed, Fate::Follows},
      {KeptElsewhere, None, Fate::Follows},
      {KeptElsewhere, Fresh, Fate::HandsOver},
      {KeptElsewhere, Unclaimed, Fate::Follows},
      {KeptElsewhere, Claimed, Fate::Follows},
      {Renamed, None, Fate::Follows},
      {Renamed, Fresh, Fate::Follows},
      {Renamed, Unclaimed, Fate::Follows},
      {Renamed, Claimed, Fate::Follows},
  };
  for (const Row& row : rows) {
    EXPECT_EQ(fateOf(row.file, row.occupant), row.fate)
        << static_cast<int>(row.file) << " " << static_cast<int>(row.occupant);
  }
}

}  // namespace
}  // namespace vantrell::linuxos::catalog
