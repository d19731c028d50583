#include "platform/foundation/FndError.h"

#include <gtest/gtest.h>

#include <cerrno>

#include "platform/foundation/PosixNames.h"

namespace vantrell {
namespace {

TEST(FndError, APOSIXErrorSaysWhatTheSystemSays) {
  const FndError error = FndError::posix(ENOENT);
  EXPECT_TRUE(error.isPosix(ENOENT));
  EXPECT_FALSE(error.isPosix(EACCES));
  EXPECT_EQ(error.message(), "No such file or directory");
  EXPECT_EQ(error.description(), "No such file or directory (FndPOSIXErrorDomain 2)");
}

TEST(FndError, AMessageOfItsOwnComesFirst) {
  const FndError error = FndError::posix(ENOENT, {{"message", std::any(std::string("gone"))}});
  EXPECT_EQ(error.description(), "gone (FndPOSIXErrorDomain 2)");
  EXPECT_EQ(FndError::vantrell(VantrellErrorCode::NotInTrash, "put back what?").description(),
            "put back what? (com.quillon.vantrell 4)");
}

TEST(FndError, TheFoundationsCodesHaveTheirNumbersAndTexts) {
  const FndError error = FndError::foundation(FndFoundationErrorCode::FileWriteNoPermission);
  EXPECT_TRUE(error.is(kFndFoundationErrorDomain, 513));
  EXPECT_EQ(error.message(), "Writing is not permitted here.");
  EXPECT_EQ(FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile).code(), 260);
  EXPECT_EQ(FndError::foundation(FndFoundationErrorCode::FileWriteFileExists).code(), 516);
  EXPECT_EQ(FndError("domain", 1).message(), "The operation could not be completed.");
}

TEST(FndError, UserInfoIsGivenOnlyInItsOwnType) {
  const FndError error("domain", 1, {{"count", std::any(7)}});
  EXPECT_EQ(*error.info<int>("count"), 7);
  EXPECT_EQ(error.info<std::string>("count"), nullptr);
  EXPECT_EQ(error.info<int>("other"), nullptr);
}

TEST(PosixNames, AnErrorIsDescribedByNameAndText) {
  EXPECT_EQ(posixErrorDescription(EACCES), "EACCES: Permission denied");
  EXPECT_EQ(posixErrorName(ENODATA), "ENODATA");
  EXPECT_EQ(posixErrorName(0), "");
  EXPECT_EQ(posixErrorDescription(EDOM), posixErrorText(EDOM));
}

}  // namespace
}  // namespace vantrell
