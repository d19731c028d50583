#include <gtest/gtest.h>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "items/LocalAppLibraryItem.h"
#include "tests/support/ProviderTest.h"

namespace vantrell {
namespace {

class LookupTest : public ProviderTest {
 protected:
  const FndURL url = system.file("a.txt");
  const std::string identifier = *itemIdentifier(system.urlInStorage("a.txt"));
  bool saysFound() const {
    for (const std::string& line : system.log.textsAt(LogLevel::Debug)) {
      if (line.starts_with("[DEBUG] found <LocalItem:0x") &&
          line.find(" " + identifier + " name:\"a.txt\"") != std::string::npos) {
        return true;
      }
    }
    return false;
  }
};

TEST_F(LookupTest, AnItemIsFoundByItsIdentifier) {
  const auto item = extension->itemForIdentifier_error(identifier);
  ASSERT_TRUE(item);
  EXPECT_EQ((*item)->itemIdentifier(), identifier);
  EXPECT_TRUE(hasSection("fetching item's properties for \"" + identifier + "\""));
  EXPECT_TRUE(saysFound());
}

TEST_F(LookupTest, AnItemThatIsNotThereIsAnErrorLineAndTheFrameworksError) {
  const auto item = extension->itemForIdentifier_error("did=999");
  ASSERT_FALSE(item);
  expectNoSuchItem(item.error(), "did=999");
  EXPECT_TRUE(hasSection("fetching item's properties for \"did=999\""));
  EXPECT_TRUE(hasLine(LogLevel::Error, "[ERROR] item lookup failed for identifier \"did=999\""));
}

TEST_F(LookupTest, AURLIsFoundByItsIdentifier) {
  EXPECT_EQ(extension->_urlForItemWithPersistentIdentifier(identifier), url);
  EXPECT_TRUE(hasSection("fetching URL for \"" + identifier + "\""));
  EXPECT_TRUE(saysFound());
}

TEST_F(LookupTest, AURLThatIsNotFoundIsAnErrorLineWithIdentifierAndCode) {
  EXPECT_EQ(extension->_urlForItemWithPersistentIdentifier("fid=999"), std::nullopt);
  EXPECT_TRUE(hasSection("fetching URL for \"fid=999\""));
  EXPECT_TRUE(
      hasLine(LogLevel::Error, "[ERROR] can't find URL matching identifier fid=999; -1001"));
}

TEST_F(LookupTest, AnIdentifierIsFoundByTheURL) {
  EXPECT_EQ(extension->_persistentIdentifierForItemAt(url), identifier);
  EXPECT_TRUE(hasSection("fetching item identifier for \"file:///storage/Documents/a.txt\""));
  EXPECT_TRUE(hasLine(LogLevel::Debug, "[DEBUG] found " + identifier));
}

TEST_F(LookupTest, AURLThatHoldsNoItemHasNoIdentifier) {
  EXPECT_EQ(extension->_persistentIdentifierForItemAt(system.urlInStorage("gone")), std::nullopt);
  EXPECT_EQ(extension->_persistentIdentifierForItemAt(FndURL::fileURLWithPath("/elsewhere")),
            std::nullopt);
}

TEST_F(LookupTest, TheStorageRootsIdentifierIsTheRootContainerThoughItIsNamedDocuments) {
  EXPECT_EQ(
      extension->_persistentIdentifierForItemAt(FndURL::fileURLWithPath(TestSystem::kStorageRoot)),
      DochostRootContainerItemIdentifier);
}

TEST_F(LookupTest, AFolderNamedDocumentsThatBelongsToNoApplicationIsAnItemLikeAnyOther) {
  const FndURL folder = system.folder("x/Documents");
  EXPECT_EQ(extension->_persistentIdentifierForItemAt(folder), *itemIdentifier(folder));
}

TEST(LookupInAppLibrary, TheDocumentsFolderOfAnApplicationIsItsLibrary) {
  TestSystem system;
  const FndURL root = system.addApp("org.example.a");
  LocalDochost extension;
  EXPECT_EQ(extension._persistentIdentifierForItemAt(root), "#org.example.a");
  const auto item = extension.itemForIdentifier_error("#org.example.a");
  ASSERT_TRUE(item);
  EXPECT_EQ((*item)->fileURL(), root);
  EXPECT_EQ(extension._urlForItemWithPersistentIdentifier("#org.example.a"), root);
}

TEST_F(LookupTest, TheItemAtAURLIsItsRecord) {
  const auto item = extension->itemAtURL(url);
  ASSERT_TRUE(item);
  EXPECT_EQ((*item)->itemIdentifier(), identifier);
  EXPECT_EQ((*item)->fileURL(), url);
}

TEST(ItemAtURL, AnAppLibrarysRootGoesThroughTheItemLookup) {
  TestSystem system;
  const FndURL root = system.addApp("org.example.a", "Example");
  LocalDochost extension;
  const auto item = extension.itemAtURL(root);
  ASSERT_TRUE(item);
  EXPECT_NE(dynamic_cast<const LocalAppLibraryItem*>(item->get()), nullptr);
  EXPECT_EQ((*item)->filename(), "Example");
}

TEST_F(LookupTest, AURLWithoutIdentifierIsAnErrorLine) {
  EXPECT_FALSE(extension->itemAtURL(system.urlInStorage("gone")));
  EXPECT_TRUE(hasLine(LogLevel::Error,
                      "[ERROR] identifier lookup failed for URL "
                      "\"file:///storage/Documents/gone\""));
}

TEST_F(LookupTest, AURLOfWhichNoRecordCanBeMadeIsAnErrorLine) {
  // It is there for the identifier, and its type is gone for the record.
  const FndURL folder = system.folder("folder");
  const std::size_t before = system.tree.faults.calls(FakeCall::ReadResourceValues);
  LocalItem::init(FndURL::fileURLWithPath(folder.path()));
  const std::size_t reads = system.tree.faults.calls(FakeCall::ReadResourceValues) - before;
  const FndError gone = FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile);
  for (std::size_t later = reads; later < reads + 20; ++later) {
    system.tree.faults.failAfter(FakeCall::ReadResourceValues, later, gone);
  }
  EXPECT_FALSE(extension->itemAtURL(folder));
  EXPECT_TRUE(hasLine(LogLevel::Error,
                      "[ERROR] can't create item for URL \"file:///storage/Documents/folder\""));
}

class EnumeratorFactoryTest : public ProviderTest {
 protected:
  void expectNotHereYet(std::string_view container) {
    const auto made = extension->enumeratorForContainerItemIdentifier_error(container);
    ASSERT_FALSE(made);
    EXPECT_TRUE(made.error().is(kVantrellErrorDomain,
                                static_cast<std::int64_t>(VantrellErrorCode::NotHereYet)));
    EXPECT_FALSE(made.error().message().empty());
    EXPECT_TRUE(hasSection("enumerator for " + std::string(container)));
  }
};

TEST_F(EnumeratorFactoryTest, ItSaysThatEnumeratorsAreNotHereYet) {
  expectNotHereYet(DochostRootContainerItemIdentifier);
  expectNotHereYet(DochostWorkingSetContainerItemIdentifier);
  expectNotHereYet(DochostAllDirectoriesContainerItemIdentifier);
  expectNotHereYet(*itemIdentifier(system.folder("folder")));
}

TEST_F(EnumeratorFactoryTest,
       AnEnumeratorForAnIdentifierThatResolvesToNoURLFailsWithTheNonExistentItemError) {
  const auto made = extension->enumeratorForContainerItemIdentifier_error("fid=999");
  ASSERT_FALSE(made);
  expectNoSuchItem(made.error(), "fid=999");
  EXPECT_TRUE(hasSection("enumerator for fid=999"));
  EXPECT_TRUE(
      hasLine(LogLevel::Error, "[ERROR] can't find URL matching identifier fid=999; -1001"));
}

}  // namespace
}  // namespace vantrell
