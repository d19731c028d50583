#include "host/ExtensionModule.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <stdlib.h>

#include "host/ProgramFiles.h"

namespace vantrell::host {
namespace {

using testing::AllOf;
using testing::HasSubstr;

TEST(ExtensionModule, TheBuiltModuleIsFoundAndLoads) {
  ::unsetenv("VANTRELL_MODULE");
  EXPECT_THAT(extensionModulePath(), HasSubstr("libvantrell.so"));
  const auto module = ExtensionModule::load(extensionModulePath());
  EXPECT_TRUE(module) << module.error().description();
}

TEST(ExtensionModule, TheEnvironmentNamesAnotherOne) {
  ::setenv("VANTRELL_MODULE", "/nowhere/other.so", 1);
  EXPECT_EQ(extensionModulePath(), "/nowhere/other.so");
  ::setenv("VANTRELL_MODULE", "", 1);
  EXPECT_THAT(extensionModulePath(), HasSubstr("libvantrell.so"));
}

TEST(ExtensionModule, OneThatIsMissingIsToldWithTheLoadersReason) {
  const auto module = ExtensionModule::load("/nowhere/other.so");
  ASSERT_FALSE(module);
  EXPECT_TRUE(module.error().is(kVantrellErrorDomain, 9));
  EXPECT_THAT(module.error().message(),
              AllOf(HasSubstr("/nowhere/other.so"), HasSubstr("No such file")));
}

TEST(ExtensionModule, ALibraryWithoutTheEntryRoutineIsRefused) {
  const auto module = ExtensionModule::load("libm.so.6");
  ASSERT_FALSE(module);
  EXPECT_THAT(module.error().message(), HasSubstr("vantrellCreateExtension"));
}

}  // namespace
}  // namespace vantrell::host
