#include "support/ResourceAccess.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "platform/foundation/FndError.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using Key = FndURLResourceKey;

class ResourceAccessTest : public testing::Test {
 protected:
  TestSystem system;
  const FndURL url = system.file("a.txt", "hello");
};

TEST_F(ResourceAccessTest, EachGetterReadsAValueOfItsType) {
  EXPECT_EQ(stringResource(Key::Name, url), "a.txt");
  EXPECT_EQ(numberResource(Key::FileSize, url), FndNumber(std::uint64_t{5}));
  EXPECT_EQ(dateResource(Key::CreationDate, url), FndDate::fromUnixTime(1'700'000'000));
  EXPECT_TRUE(dataResource(Key::ContentVersion, url).has_value());
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(ResourceAccessTest, TheBooleanGetterDistinguishesTrueFalseAndNone) {
  EXPECT_EQ(boolResource(Key::IsWritable, url), true);
  EXPECT_EQ(boolResource(Key::IsDirectory, url), false);
  system.tree.withholdResource(Key::IsReadable);
  EXPECT_EQ(boolResource(Key::IsReadable, url), std::nullopt);
}

TEST_F(ResourceAccessTest, AValueOfTheWrongTypeYieldsNoneAndNoLine) {
  EXPECT_EQ(numberResource(Key::Name, url), std::nullopt);
  EXPECT_EQ(stringResource(Key::FileSize, url), std::nullopt);
  EXPECT_EQ(dateResource(Key::Name, url), std::nullopt);
  EXPECT_EQ(dataResource(Key::Name, url), std::nullopt);
  EXPECT_EQ(boolResource(Key::FileSize, url), std::nullopt);
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(ResourceAccessTest, AValueThatTheObjectHasNotYieldsNoneAndNoLine) {
  EXPECT_EQ(numberResource(Key::FileSize, system.folder("folder")), std::nullopt);
  EXPECT_TRUE(system.log.lines().empty());
}

TEST_F(ResourceAccessTest, AFailureIsAnErrorLineAndYieldsNone) {
  system.tree.faults.failNext(FakeCall::ReadResourceValues, {FndError::posix(EIO)});
  EXPECT_EQ(stringResource(Key::Name, url), std::nullopt);
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] can't get resource \"FndURLNameKey\" for "
                                     "file:///storage/Documents/a.txt; " +
                                     FndError::posix(EIO).description()});
}

TEST_F(ResourceAccessTest, ARememberedValueIsNotReadAgain) {
  EXPECT_EQ(stringResource(Key::Name, url), "a.txt");
  EXPECT_EQ(stringResource(Key::Name, url), "a.txt");
  EXPECT_EQ(system.tree.faults.calls(FakeCall::ReadResourceValues), 1U);
}

}  // namespace
}  // namespace vantrell
