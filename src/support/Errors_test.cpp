#include "support/Errors.h"

#include <gtest/gtest.h>

#include <cerrno>

namespace vantrell {
namespace {

TEST(Errors, ErrorWithPOSIXCodeHasTheCodeAndNoUserInfo) {
  const FndError error = errorWithPOSIXCode(EBUSY);
  EXPECT_EQ(error.domain(), kFndPOSIXErrorDomain);
  EXPECT_EQ(error.code(), EBUSY);
  EXPECT_TRUE(error.userInfo().empty());
}

TEST(Errors, ErrorFileWriteNoPermissionIsCode513OfTheFoundation) {
  EXPECT_TRUE(errorFileWriteNoPermission().is(kFndFoundationErrorDomain, 513));
}

TEST(Errors, EveryErrorHasAnErrnoValueToBeShownWith) {
  EXPECT_EQ(posixCodeOfError(errorWithPOSIXCode(EBUSY)), EBUSY);
  EXPECT_EQ(posixCodeOfError(FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile)),
            ENOENT);
  EXPECT_EQ(posixCodeOfError(errorFileWriteNoPermission()), EACCES);
  EXPECT_EQ(posixCodeOfError(FndError::foundation(FndFoundationErrorCode::FileWriteFileExists)),
            EEXIST);
  EXPECT_EQ(posixCodeOfError(FndError::vantrell(VantrellErrorCode::DamagedData, "damaged")), EIO);
}

TEST(Errors, OnlyCode260OfTheFoundationSaysThatNothingIsThere) {
  EXPECT_TRUE(
      isNoSuchFileReadError(FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile)));
  EXPECT_FALSE(isNoSuchFileReadError(errorFileWriteNoPermission()));
  EXPECT_FALSE(isNoSuchFileReadError(errorWithPOSIXCode(260)));
}

}  // namespace
}  // namespace vantrell
