#include <gtest/gtest.h>

#include <cerrno>

#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "platform/foundation/PosixNames.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using Key = FndURLResourceKey;

std::string fid(FileID id) { return "fid=" + std::to_string(id.value); }
std::string did(DocumentID id) { return "did=" + std::to_string(id.value); }

class ItemIdentifierTest : public testing::Test {
 protected:
  // No identifier, and that line.
  void expectNone(const FndURL& url, LogLevel level, const std::string& line) {
    EXPECT_EQ(itemIdentifier(url), std::nullopt);
    EXPECT_TRUE(system.log.has(level, line)) << testing::PrintToString(system.log.texts());
  }
  std::string idOf(std::string_view relativePath) {
    return itemIdentifier(system.urlInStorage(relativePath)).value_or("none");
  }

  TestSystem system;
};

TEST_F(ItemIdentifierTest, TheStorageRootItselfYieldsTheRootContainerIdentifierNeverFid) {
  EXPECT_EQ(itemIdentifier(FndURL::fileURLWithPath(TestSystem::kStorageRoot)),
            DochostRootContainerItemIdentifier);
}

TEST_F(ItemIdentifierTest, APlainDirectoryGetsAFidIdentifier) {
  system.folder("folder");
  EXPECT_EQ(idOf("folder"), fid(system.tree.fileID(system.inStorage("folder"))));
}

TEST_F(
    ItemIdentifierTest,
    APackageDirectoryGetsADidIdentifierAPlainDirectoryAFidOneASymbolicLinkAFidOneItIsNotFollowed) {
  system.folder("doc.tessera");
  system.folder("folder");
  system.file("a.txt");
  system.tree.makeLink(system.inStorage("link"), "a.txt");
  const std::string package = idOf("doc.tessera");
  EXPECT_EQ(package, did(system.tree.documentID(system.inStorage("doc.tessera"))));
  EXPECT_NE(package, "did=0");
  EXPECT_EQ(idOf("folder"), fid(system.tree.fileID(system.inStorage("folder"))));
  EXPECT_EQ(idOf("link"), fid(system.tree.fileID(system.inStorage("link"))));
}

TEST_F(ItemIdentifierTest, WhatLiesOnAnotherVolumeInsideTheStorageHasNoIdentifier) {
  system.folder("mounted");
  system.tree.makeLink(system.inStorage("mounted/link"), "a.txt");
  system.tree.mount(system.inStorage("mounted"), DeviceID{77});
  const FndURL link = system.urlInStorage("mounted/link");
  expectNone(link, LogLevel::Debug,
             "can't compute file object identifier because \"" + link.path() +
                 "\" is not on the volume of the storage");
}

TEST_F(ItemIdentifierTest, ARegularFileIsGivenADocumentIDOnce) {
  system.file("a.txt");
  const std::string first = idOf("a.txt");
  EXPECT_EQ(first, did(system.tree.documentID(system.inStorage("a.txt"))));
  EXPECT_NE(first, "did=0");
  EXPECT_EQ(idOf("a.txt"), first);
  EXPECT_EQ(system.verstow.allocations(), 1U);
}

TEST_F(ItemIdentifierTest, AnObjectThatIsNeitherFileNorPackageGetsAFidIdentifier) {
  system.tree.makeSpecial(system.inStorage("pipe"), FileKind::Fifo);
  EXPECT_EQ(idOf("pipe"), fid(system.tree.fileID(system.inStorage("pipe"))));
}

TEST_F(ItemIdentifierTest, AnItemThatMayNotBeReadHasAnIdentifierToo) {
  const FndURL url = system.file("secret.txt");
  system.tree.setMode(url.path(), 0);
  EXPECT_TRUE(itemIdentifier(url)->starts_with("did="));
}

TEST_F(ItemIdentifierTest, ALaterCallOnTheSameURLObjectAsksTheFileSystemForNothing) {
  const FndURL url = system.file("a.txt");
  const auto first = itemIdentifier(url);
  const std::size_t opened = system.tree.faults.calls(FakeCall::Open);
  const std::size_t read = system.tree.faults.calls(FakeCall::ReadResourceValues);
  EXPECT_EQ(itemIdentifier(url), first);
  EXPECT_EQ(system.tree.faults.calls(FakeCall::Open), opened);
  EXPECT_EQ(system.tree.faults.calls(FakeCall::ReadResourceValues), read);
}

TEST_F(ItemIdentifierTest, WhatTheFileSystemToldOfAFolderIsRememberedByTheURL) {
  system.tree.withholdResource(Key::FileResourceIdentifier);
  const FndURL url = system.folder("folder");
  const FileID fileID = system.tree.fileID(url.path());
  EXPECT_EQ(itemIdentifier(url), fid(fileID));
  EXPECT_EQ(url.cachedResourceValue(Key::FileResourceIdentifier),
            FndURL::ResourceValue(FndNumber(fileID.value)));
}

TEST_F(ItemIdentifierTest, ANewDocumentIDIsRememberedByTheURL) {
  const FndURL url = system.file("a.txt");
  itemIdentifier(url);
  const std::uint64_t documentID = system.tree.documentID(url.path()).value;
  EXPECT_EQ(url.cachedResourceValue(Key::DocumentIdentifier),
            FndURL::ResourceValue(FndNumber(documentID)));
}

TEST_F(ItemIdentifierTest, ADocumentIDThatTheURLRemembersIsTakenAsItIs) {
  const FndURL url = system.file("a.txt");
  url.setCachedResourceValue(Key::DocumentIdentifier, FndNumber(std::uint64_t{77}));
  EXPECT_EQ(itemIdentifier(url), "did=77");
  EXPECT_EQ(system.tree.faults.calls(FakeCall::Open), 0U);
}

TEST_F(ItemIdentifierTest, AnAppLibraryRootYieldsTheBundleIDAndAnItemInsideItFidOrDidLikeAnyOther) {
  const FndURL root = system.addApp("org.example.a");
  system.tree.makeFolder("/apps/org.example.a/Documents/folder");
  system.tree.writeFile("/apps/org.example.a/Documents/b.txt");
  EXPECT_EQ(itemIdentifier(root), "#org.example.a");
  EXPECT_EQ(itemIdentifier(root.URLByAppendingPathComponent("folder")),
            fid(system.tree.fileID("/apps/org.example.a/Documents/folder")));
  EXPECT_TRUE(itemIdentifier(root.URLByAppendingPathComponent("b.txt"))->starts_with("did="));
}

TEST_F(ItemIdentifierTest, AnAppLibraryWithoutABundleIdentifierYieldsNullInParentheses) {
  system.tree.makeFolder("/apps/nameless/Documents");
  system.appreg.addApplication({.dataContainerPath = "/apps/nameless"});
  EXPECT_EQ(itemIdentifier(FndURL::fileURLWithPath("/apps/nameless/Documents")), "#(null)");
}

TEST_F(ItemIdentifierTest,
       AURLOutsideTheStorageRootAndOutsideEveryAppLibraryRootYieldsNoneWithTheDebugMessage) {
  system.addApp("org.example.a");
  system.tree.writeFile("/elsewhere/a.txt");
  expectNone(FndURL::fileURLWithPath("/elsewhere/x/../a.txt"), LogLevel::Debug,
             "can't compute file object identifier because \"/elsewhere/a.txt\" is not part of "
             "Vantrell");
}

TEST_F(ItemIdentifierTest, ANeighbourWhoseNameBeginsLikeTheStorageIsNotPartOfIt) {
  system.tree.writeFile("/storage/Documents2/a.txt");
  expectNone(FndURL::fileURLWithPath("/storage/Documents2/a.txt"), LogLevel::Debug,
             "can't compute file object identifier because \"/storage/Documents2/a.txt\" is not "
             "part of Vantrell");
}

TEST_F(ItemIdentifierTest, AURLThatIsNoFileURLIsAnErrorLine) {
  expectNone(*FndURL::URLWithString("https://example.org/a"), LogLevel::Error,
             "can't compute file object identifier if not a file URL");
}

TEST_F(ItemIdentifierTest, AFileThatIsNotThereIsADebugLine) {
  const FndURL url = system.urlInStorage("gone.txt");
  expectNone(url, LogLevel::Debug,
             "can't get resource value for FndURLDocumentIdentifierKey; " +
                 FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile).description());
  EXPECT_TRUE(system.log.textsAt(LogLevel::Error).empty());
}

TEST_F(ItemIdentifierTest, ADocumentIDThatCannotBeReadIsAnErrorLine) {
  const FndURL url = system.file("a.txt");
  url.setCachedResourceValue(Key::IsDirectory, false);
  system.tree.faults.failNext(FakeCall::ReadResourceValues, {FndError::posix(EIO)});
  expectNone(url, LogLevel::Error,
             "can't get resource value for FndURLDocumentIdentifierKey; " +
                 FndError::posix(EIO).description());
}

class FolderURL : public ItemIdentifierTest {
 protected:
  FolderURL() {
    url.setCachedResourceValue(Key::IsDirectory, true);
    url.setCachedResourceValue(Key::IsPackage, false);
  }
  const FndURL url = system.folder("folder");
};

TEST_F(FolderURL, AFileIDThatCannotBeReadIsAnErrorLine) {
  system.tree.faults.failNext(FakeCall::ReadResourceValues, {FndError::posix(EIO)});
  expectNone(
      url, LogLevel::Error,
      "can't get resource value for _kKorURLFileIDKey; " + FndError::posix(EIO).description());
}

TEST_F(FolderURL, AFolderThatIsGoneByNowIsADebugLine) {
  system.tree.remove(url.path());
  expectNone(url, LogLevel::Debug,
             "can't get resource value for _kKorURLFileIDKey; " +
                 FndError::foundation(FndFoundationErrorCode::FileReadNoSuchFile).description());
}

TEST_F(ItemIdentifierTest, ADocumentNumberBeyond32BitsYieldsNone) {
  const FndURL url = system.file("a.txt");
  url.setCachedResourceValue(Key::DocumentIdentifier, FndNumber(std::uint64_t{1} << 32));
  EXPECT_EQ(itemIdentifier(url), std::nullopt);
}

#ifdef VANTRELL_ASSERTIONS
using ItemIdentifierDeathTest = ItemIdentifierTest;

TEST_F(ItemIdentifierDeathTest, AFileIDThatIsNoNumberEndsADevelopmentBuild) {
  const FndURL url = system.folder("folder");
  url.setCachedResourceValue(Key::FileResourceIdentifier, std::string("text"));
  EXPECT_DEATH(itemIdentifier(url),
               "unexpected class for file ID \\(expected: FndNumber, actual: FndString\\)");
}

TEST_F(ItemIdentifierDeathTest, ADocumentIDThatIsNoNumberEndsADevelopmentBuild) {
  const FndURL url = system.file("a.txt");
  url.setCachedResourceValue(Key::DocumentIdentifier, FndData{1});
  EXPECT_DEATH(itemIdentifier(url),
               "unexpected class for doc ID \\(expected: FndNumber, actual: FndData\\)");
}
#else
TEST_F(ItemIdentifierTest, AValueOfAnotherTypeYieldsNone) {
  const FndURL folder = system.folder("folder");
  folder.setCachedResourceValue(Key::FileResourceIdentifier, std::string("text"));
  EXPECT_EQ(itemIdentifier(folder), std::nullopt);
  const FndURL file = system.file("a.txt");
  file.setCachedResourceValue(Key::DocumentIdentifier, FndData{1});
  EXPECT_EQ(itemIdentifier(file), std::nullopt);
}
#endif

// A file of which nothing but its document ID is to be found out.
class KnownFileURL : public ItemIdentifierTest {
 protected:
  KnownFileURL() { url.setCachedResourceValue(Key::IsDirectory, false); }
  const FndURL url = system.file("a.txt");
  const std::string path = url.path();
};

TEST_F(KnownFileURL, APackageFlagThatCannotBeReadIsAnErrorLine) {
  // The read of the document ID finds none; only then is the flag asked for.
  system.tree.faults.failAfter(FakeCall::ReadResourceValues, 1, FndError::posix(EIO));
  expectNone(url, LogLevel::Error,
             "can't get resource FndURLIsPackageKey for \"" + path + "\"; " +
                 FndError::posix(EIO).description());
}

TEST_F(KnownFileURL, AFileThatCannotBeOpenedIsAnErrorLine) {
  system.tree.faults.failAt(FakeCall::Open, path, FndError::posix(EMFILE));
  expectNone(url, LogLevel::Error,
             "can't open file at \"" + path + "\"; " + posixErrorDescription(EMFILE));
}

TEST_F(KnownFileURL, AnObjectThatCannotBeLookedAtIsAnErrorLine) {
  system.tree.faults.failAt(FakeCall::Identity, path, FndError::posix(EIO));
  expectNone(url, LogLevel::Error,
             "can't get attribute list for \"" + path + "\"; " + posixErrorDescription(EIO));
}

TEST_F(KnownFileURL, ADocumentThatGetsNoIDIsAnErrorLine) {
  system.verstow.refuseAllocations(ENOSPC);
  expectNone(url, LogLevel::Error, "can't get permanent storage for \"" + path + "\"");
}

TEST_F(ItemIdentifierTest, TheDeviceOfAPathIsThatOfItsVolume) {
  system.file("a.txt");
  EXPECT_EQ(deviceID(system.urlInStorage("a.txt")), FakeTree::kDevice);
  EXPECT_EQ(deviceIDWithError(system.urlInStorage("a.txt")), FakeTree::kDevice);
}

TEST_F(ItemIdentifierTest, TheDeviceOfAnItemThatMayNotBeReadIsKnown) {
  const FndURL url = system.file("a.txt");
  system.tree.setMode(url.path(), 0);
  EXPECT_EQ(deviceID(url), FakeTree::kDevice);
}

TEST_F(ItemIdentifierTest, AFailureToGetTheDeviceIsAPOSIXErrorAnd0) {
  const FndURL gone = system.urlInStorage("gone");
  EXPECT_EQ(deviceID(gone), DeviceID{});
  ASSERT_FALSE(deviceIDWithError(gone));
  EXPECT_TRUE(deviceIDWithError(gone).error().isPosix(ENOENT));

  const FndURL url = system.file("a.txt");
  system.tree.faults.failNext(FakeCall::DeviceID, {FndError::posix(EIO)});
  const auto failed = deviceIDWithError(url);
  ASSERT_FALSE(failed);
  EXPECT_TRUE(failed.error().isPosix(EIO));
}

TEST_F(ItemIdentifierTest, ADevice0IsAFailure) {
  const FndURL url = system.file("a.txt");
  system.tree.mount(url.path(), DeviceID{0});
  ASSERT_FALSE(deviceIDWithError(url));
  EXPECT_TRUE(deviceIDWithError(url).error().isPosix(ENODEV));
}

TEST_F(ItemIdentifierTest, AURLThatIsNoFileURLHasNoDevice) {
  const auto device = deviceIDWithError(*FndURL::URLWithString("https://example.org/"));
  ASSERT_FALSE(device);
  EXPECT_TRUE(device.error().isPosix(EINVAL));
}

}  // namespace
}  // namespace vantrell
