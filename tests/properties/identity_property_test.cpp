// Documents keep their identity through whatever is done to their files between two looks.
#include <gtest/gtest.h>
#include <unistd.h>

#include <chrono>

#include "IdentityRun.h"
#include "TestStorage.h"

namespace vantrell::properties {
namespace {

constexpr std::chrono::seconds kDuration{10};

TEST(Identity, SurvivesAnythingDoneBetweenTwoLooks) {
  documentsKeepTheirIdentity(TestStorage::defaultParent(), kDuration);
}

// Another file system, with other file numbers and no disk to wait for.
TEST(Identity, SurvivesAnythingDoneBetweenTwoLooksInMemory) {
  if (::access("/dev/shm", W_OK) != 0) GTEST_SKIP() << "/dev/shm cannot be written";
  documentsKeepTheirIdentity("/dev/shm", kDuration);
}

}  // namespace
}  // namespace vantrell::properties
