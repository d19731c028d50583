// The same scenarios as the ordinary run, many more of them.
#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>

#include "IdentityRun.h"
#include "TestStorage.h"

namespace vantrell::properties {
namespace {

constexpr std::chrono::seconds kDuration{90};

TEST(IdentityForLonger, SurvivesAnythingDoneBetweenTwoLooks) {
  documentsKeepTheirIdentity(TestStorage::defaultParent(), kDuration);
}

// Another file system, with other file numbers and no disk to wait for.
TEST(IdentityForLonger, SurvivesAnythingDoneBetweenTwoLooksInMemory) {
  if (::access("/dev/shm", W_OK) != 0) GTEST_SKIP() << "/dev/shm cannot be written";
  documentsKeepTheirIdentity("/dev/shm", kDuration);
}

}  // namespace
}  // namespace vantrell::properties
