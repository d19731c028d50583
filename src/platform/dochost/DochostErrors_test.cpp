#include "platform/dochost/DochostErrors.h"

#include <gtest/gtest.h>

#include "platform/dochost/DochostExtension.h"
#include "tests/fakes/FakeItem.h"

namespace vantrell {
namespace {

TEST(DochostErrors, TheFrameworksErrorsCarryTheirCodesAndWhatTheyAreAbout) {
  const FndError missing = dochostErrorForNonExistentItem("fid=12");
  EXPECT_TRUE(missing.is(kDochostErrorDomain, -1001));
  EXPECT_EQ(*missing.info<std::string>(kDochostErrorItemIdentifierKey), "fid=12");
  EXPECT_EQ(missing.message(), "There is no item \"fid=12\".");
  EXPECT_TRUE(dochostErrorSyncAnchorExpired().is(kDochostErrorDomain, -1002));
}

TEST(DochostErrors, ACollisionCarriesTheItemThatStandsInTheWay) {
  const auto item = std::make_shared<FakeItem>(FakeItem::Fields{});
  const FndError collision = dochostErrorForCollisionWithItem(item);
  EXPECT_TRUE(collision.is(kDochostErrorDomain, -1003));
  EXPECT_EQ(*collision.info<DochostItemRef>(kDochostErrorCollidingItemKey), item);
  EXPECT_EQ(collision.message(), "\"a.txt\" already exists.");
}

// Asks each request of an extension that implements none.
TEST(DochostExtension, WhatIsNotImplementedCompletesOnceAsUnsupported) {
  DochostExtension extension;
  const FndURL url = FndURL::fileURLWithPath("/a");
  int completed = 0;
  const auto item = [&completed] {
    return [&completed](const DochostItemRef& none, std::optional<FndError> error) {
      EXPECT_EQ(none, nullptr);
      EXPECT_TRUE(error && error->is(kDochostErrorDomain, -1004));
      ++completed;
    };
  };
  const auto plain = [&completed] {
    return [&completed](std::optional<FndError> error) {
      EXPECT_TRUE(error && error->is(kDochostErrorDomain, -1004));
      ++completed;
    };
  };
  extension.providePlaceholderAtURL_completionHandler(url, plain());
  extension.startProvidingItemAtURL_completionHandler(url, plain());
  extension.importDocumentAtURL_toParentItemIdentifier_completionHandler(url, "p", item());
  extension.createDirectoryWithName_inParentItemIdentifier_completionHandler("n", "p", item());
  extension.renameItemWithIdentifier_toName_completionHandler("i", "n", item());
  extension.reparentItemWithIdentifier_toParentItemWithIdentifier_newName_completionHandler(
      "i", "p", std::nullopt, item());
  extension.deleteItemWithIdentifier_completionHandler("i", plain());
  extension.trashItemWithIdentifier_completionHandler("i", item());
  extension.untrashItemWithIdentifier_toParentItemIdentifier_completionHandler("i", std::nullopt,
                                                                               item());
  extension.setLastUsedDate_forItemIdentifier_completionHandler(std::nullopt, "i", item());
  extension.setTagData_forItemIdentifier_completionHandler(std::nullopt, "i", item());
  extension.setFavoriteRank_forItemIdentifier_completionHandler(std::nullopt, "i", item());
  extension._refreshInstalledAppsWithCompletionHandler(plain());
  EXPECT_EQ(completed, 13);
  EXPECT_FALSE(extension.itemForIdentifier_error("i"));
  EXPECT_FALSE(extension.enumeratorForContainerItemIdentifier_error("i"));
  EXPECT_FALSE(extension._urlForItemWithPersistentIdentifier("i"));
}

}  // namespace
}  // namespace vantrell
