#include "platform/filesystem/URLResourceValues.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

TEST(URLResourceValues, AValueIsReadOnceAndThenRemembered) {
  TestSystem system;
  const FndURL url = system.file("file.txt", "four");
  const auto size = resourceValue(url, FndURLResourceKey::FileSize);
  ASSERT_TRUE(size && *size);
  EXPECT_EQ(std::get<FndNumber>(**size), FndNumber(std::uint64_t{4}));
  system.tree.writeFile(url.path(), "four and more");
  EXPECT_EQ(*resourceValue(url, FndURLResourceKey::FileSize), *size);
  EXPECT_NE(*resourceValue(FndURL::fileURLWithPath(url.path()), FndURLResourceKey::FileSize),
            *size);
}

TEST(URLResourceValues, AKeyWithoutAValueIsNone) {
  TestSystem system;
  const FndURL url = system.file("file.txt");
  system.tree.withholdResource(FndURLResourceKey::CreationDate);
  const auto created = resourceValue(url, FndURLResourceKey::CreationDate);
  ASSERT_TRUE(created);
  EXPECT_FALSE(*created);
}

TEST(URLResourceValues, WhatIsNotThereHasNoValues) {
  TestSystem system;
  const auto missing =
      resourceValue(TestSystem::urlInStorage("missing"), FndURLResourceKey::FileSize);
  ASSERT_FALSE(missing);
  EXPECT_TRUE(missing.error().is(kFndFoundationErrorDomain, 260));
}

TEST(URLResourceValues, AURLOfAnotherSchemeIsAnInvalidArgument) {
  TestSystem system;
  const auto value =
      resourceValue(*FndURL::URLWithString("https://host/a"), FndURLResourceKey::Name);
  ASSERT_FALSE(value);
  EXPECT_TRUE(value.error().isPosix(EINVAL));
}

}  // namespace
}  // namespace vantrell
