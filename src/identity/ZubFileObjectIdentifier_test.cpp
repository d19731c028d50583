#include "identity/ZubFileObjectIdentifier.h"

#include <gtest/gtest.h>

#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using Identifier = ZubFileObjectIdentifier;

TEST(ZubFileObjectIdentifier, AFileIDIsFormattedInDecimal) {
  EXPECT_EQ(Identifier::fromFileID(FileID{0}), "fid=0");
  EXPECT_EQ(Identifier::fromFileID(FileID{18446744073709551615ULL}), "fid=18446744073709551615");
}

TEST(ZubFileObjectIdentifier, ADocumentIDIsFormattedInDecimal) {
  EXPECT_EQ(Identifier::fromDocumentID(DocumentID{7}), "did=7");
  EXPECT_EQ(Identifier::fromDocumentID(DocumentID{4294967295U}), "did=4294967295");
}

TEST(ZubFileObjectIdentifier, TheDocumentIDInAnIdentifierIsReadBack) {
  EXPECT_EQ(Identifier::documentIDIn("did=4294967295"), DocumentID{4294967295U});
  EXPECT_EQ(Identifier::documentIDIn("fid=5"), std::nullopt);
  EXPECT_EQ(Identifier::documentIDIn("did="), std::nullopt);
  EXPECT_EQ(Identifier::documentIDIn("did=4294967296"), std::nullopt);
  EXPECT_EQ(Identifier::documentIDIn("did=5x"), std::nullopt);
}

TEST(ZubFileObjectIdentifier, TheBundleIdentifierInAnIdentifierIsReadBack) {
  EXPECT_EQ(Identifier::bundleIdentifierIn("#com.quillon.tessera"), "com.quillon.tessera");
  EXPECT_EQ(Identifier::bundleIdentifierIn("#"), "");
  EXPECT_EQ(Identifier::bundleIdentifierIn("did=5"), std::nullopt);
}

TEST(ZubFileObjectIdentifier, ARecordWithoutABundleIdentifierGetsNullInParentheses) {
  EXPECT_EQ(appLibraryIdentifier(FakeApplicationProxy({.bundleIdentifier = "org.example.a"})),
            "#org.example.a");
  EXPECT_EQ(appLibraryIdentifier(FakeApplicationProxy(FakeApplicationProxy::Fields())), "#(null)");
}

TEST(ZubFileObjectIdentifier, AnAppLibrarysRootFindsItsApplication) {
  TestSystem system;
  const FndURL root = system.addApp("org.example.a");
  EXPECT_EQ(Identifier::fromAppLibraryDataContainerURL(root), "#org.example.a");
  EXPECT_TRUE(system.log.lines().empty());
}

TEST(ZubFileObjectIdentifier, AFolderOfNoApplicationIsAnErrorLineInTheFrameworksLog) {
  TestSystem system;
  EXPECT_EQ(Identifier::fromAppLibraryDataContainerURL(FndURL::fileURLWithPath("/a b")),
            std::nullopt);
  ASSERT_EQ(system.log.lines().size(), 1U);
  const FakeLogLine line = system.log.lines().front();
  EXPECT_EQ(line.level, LogLevel::Error);
  EXPECT_EQ(line.text, "[ERROR] can't find bundle proxy at file:///a%20b");
  EXPECT_NE(line.category, "vantrell");
}

}  // namespace
}  // namespace vantrell
