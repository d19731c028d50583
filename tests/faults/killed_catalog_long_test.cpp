// The kill loop of the ordinary run, for long.
#include <gtest/gtest.h>

#include "KillLoop.h"

namespace vantrell::faults {
namespace {

TEST(KilledCatalogForLonger, KeepsEveryIDItTold) { killOftenAndJudge(200); }

}  // namespace
}  // namespace vantrell::faults
