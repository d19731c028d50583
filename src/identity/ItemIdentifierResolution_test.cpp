#include <gtest/gtest.h>

#include <cerrno>
#include <chrono>

#include "applibraries/ZubAppLibraryManager.h"
#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "platform/foundation/PosixNames.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class ResolutionTest : public testing::Test {
 protected:
  // The identifier leads nowhere, and exactly these lines say why.
  void expectNone(std::string_view identifier, LogLevel level, std::vector<std::string> lines) {
    ZubAppLibraryManager::rootURLsForAppLibraries();  // so that finding them is not in the way
    system.log.clear();
    EXPECT_EQ(fileURLWithItemIdentifier(identifier), std::nullopt) << identifier;
    EXPECT_EQ(system.log.textsAt(level), lines) << identifier;
    EXPECT_EQ(system.log.lines().size(), lines.size()) << identifier;
  }
  std::string unresolvable(std::string_view fileID) const {
    return "can't resolve path matching file ID \"" + std::string(fileID) + "\"; " +
           posixErrorDescription(ENOENT);
  }
  std::string pathOf(std::string_view identifier) {
    const auto url = fileURLWithItemIdentifier(identifier);
    return url ? url->path() : "none";
  }
  std::string identifierOf(std::string_view relativePath) {
    return itemIdentifier(system.urlInStorage(relativePath)).value_or("none");
  }

  TestSystem system;
};

TEST_F(ResolutionTest, TheRootContainerIsTheStorageRoot) {
  EXPECT_EQ(pathOf(DochostRootContainerItemIdentifier), TestSystem::kStorageRoot);
}

TEST_F(ResolutionTest, AFidIdentifierLeadsToItsFolder) {
  system.folder("a/b");
  EXPECT_EQ(pathOf(identifierOf("a/b")), system.inStorage("a/b"));
}

TEST_F(ResolutionTest, ADidIdentifierLeadsToItsDocument) {
  system.file("a/b.txt");
  EXPECT_EQ(pathOf(identifierOf("a/b.txt")), system.inStorage("a/b.txt"));
}

TEST_F(ResolutionTest, AnIdentifierSurvivesRenamesAndMoves) {
  system.file("a.txt");
  system.folder("folder");
  const std::string document = identifierOf("a.txt");
  const std::string folder = identifierOf("folder");
  system.tree.move(system.inStorage("folder"), system.inStorage("renamed"));
  system.tree.move(system.inStorage("a.txt"), system.inStorage("renamed/b.txt"));
  EXPECT_EQ(pathOf(document), system.inStorage("renamed/b.txt"));
  EXPECT_EQ(pathOf(folder), system.inStorage("renamed"));
  EXPECT_EQ(identifierOf("renamed/b.txt"), document);
}

TEST_F(ResolutionTest, ADidIdentifierSurvivesASaveThatReplacesTheFile) {
  system.file("a.txt", "old");
  const std::string document = identifierOf("a.txt");
  system.tree.saveByReplacing(system.inStorage("a.txt"), "new");
  EXPECT_EQ(identifierOf("a.txt"), document);
  EXPECT_EQ(pathOf(document), system.inStorage("a.txt"));
}

TEST_F(ResolutionTest, TheIdentifierFid12Eq3AndDidWithoutEqualsAreInvalid) {
  expectNone("fid=12=3", LogLevel::Error,
             {"invalid identifier; identifier should have 2 components, not 3"});
  expectNone("did", LogLevel::Error,
             {"invalid identifier; identifier should have 2 components, not 1"});
  expectNone("", LogLevel::Error,
             {"invalid identifier; identifier should have 2 components, not 1"});
  expectNone("===", LogLevel::Error,
             {"invalid identifier; identifier should have 2 components, not 4"});
}

TEST_F(
    ResolutionTest,
    TheIdentifierXid5LogsInvalidHostForIdentifierAndYieldsNoneFIDEquals5IsInvalidTooCaseSensitive) {
  expectNone("xid=5", LogLevel::Error, {"invalid host for identifier \"xid=5\""});
  expectNone("FID=5", LogLevel::Error, {"invalid host for identifier \"FID=5\""});
  expectNone("=5", LogLevel::Error, {"invalid host for identifier \"=5\""});
  expectNone(" fid=5", LogLevel::Error, {"invalid host for identifier \" fid=5\""});
}

TEST_F(ResolutionTest, TheIdentifierFidAbcReadsAsFileID0AndFailsInThePathLookupNotInTheParser) {
  expectNone("fid=abc", LogLevel::Debug, {unresolvable("0")});
  EXPECT_EQ(system.tree.faults.calls(FakeCall::PathForFileID), 1U);
}

TEST_F(ResolutionTest, AnIdentifierOfTheHashFormGivenToFileURLWithItemIdentifierIsInvalid) {
  system.addApp("org.example.a");
  expectNone("#org.example.a", LogLevel::Error,
             {"invalid identifier; identifier should have 2 components, not 1"});
}

TEST_F(ResolutionTest, NumbersAreReadLeniently) {
  system.folder("folder");
  const std::string number = std::to_string(system.tree.fileID(system.inStorage("folder")).value);
  for (const std::string& form : {number, " \t\n" + number, "+" + number, "000" + number,
                                  number + "abc", number + " 7", " +" + number + "-1"}) {
    EXPECT_EQ(pathOf("fid=" + form), system.inStorage("folder")) << form;
  }
}

TEST_F(ResolutionTest, ATextWithoutLeadingDigitsReadsAs0) {
  for (const std::string_view form : {"", " ", "-", "+", "+-1", "--1", "x1", "- 1"}) {
    expectNone("fid=" + std::string(form), LogLevel::Debug, {unresolvable("0")});
  }
}

TEST_F(ResolutionTest, ANumberBeyond64BitsReadsAsTheNearestOneThatThereIs) {
  expectNone("fid=99999999999999999999999", LogLevel::Debug, {unresolvable("9223372036854775807")});
  expectNone("fid=18446744073709551617", LogLevel::Debug, {unresolvable("9223372036854775807")});
  expectNone("fid=-99999999999999999999999", LogLevel::Debug,
             {unresolvable("-9223372036854775808")});
}

TEST_F(ResolutionTest, ANegativeNumberIsShownAsOne) {
  expectNone("fid=-5", LogLevel::Debug, {unresolvable("-5")});
}

TEST_F(ResolutionTest, ADocumentNumberBeyond32BitsIsADocumentThatIsNotThere) {
  for (const std::string number : {"4294967296", "-1", "4294967297"}) {
    expectNone("did=" + number, LogLevel::Error,
               {"can't resolve doc ID \"" + number + "\"; " + posixErrorDescription(ENOENT)});
  }
  EXPECT_EQ(system.verstow.resolutions(), 0U);
}

TEST_F(ResolutionTest, ADocumentThatIsGoneIsAnErrorLine) {
  expectNone("did=5", LogLevel::Error,
             {"can't resolve doc ID \"5\"; " + posixErrorDescription(ENOENT)});
  EXPECT_TRUE(system.clock.rests().empty());
}

TEST_F(
    ResolutionTest,
    ADocumentIDThatStaysUnresolvableWithErrnoEBUSYIsTriedSixTimesWithFive1MillisecondRestsThenLoggedAfterFiveAttempts) {
  system.verstow.failResolutions({EBUSY, EBUSY, EBUSY, EBUSY, EBUSY, EBUSY, EBUSY});
  const std::string again = "doc ID resolution failed with errno(" + std::to_string(EBUSY) +
                            "), let's try again after resting";
  expectNone("did=5", LogLevel::Debug,
             {again, again, again, again, again, "can't resolve doc ID \"5\" after five attempts"});
  EXPECT_EQ(system.verstow.resolutions(), 6U);
  EXPECT_EQ(system.clock.rests(),
            std::vector<std::chrono::microseconds>(5, std::chrono::milliseconds(1)));
}

TEST_F(ResolutionTest, EveryPassingFailureIsTriedAgain) {
  system.file("a.txt");
  const std::string document = identifierOf("a.txt");
  system.verstow.failResolutions({EAGAIN, EBUSY, ESTALE});
  EXPECT_EQ(pathOf(document), system.inStorage("a.txt"));
  EXPECT_EQ(system.verstow.resolutions(), 4U);
  EXPECT_EQ(system.clock.rests().size(), 3U);
}

TEST_F(ResolutionTest, TheSixthCallMaySucceed) {
  system.file("a.txt");
  const std::string document = identifierOf("a.txt");
  system.verstow.failResolutions({EBUSY, EBUSY, EBUSY, EBUSY, EBUSY});
  EXPECT_EQ(pathOf(document), system.inStorage("a.txt"));
}

TEST_F(ResolutionTest, AFailureThatWillNotPassEndsTheTries) {
  system.verstow.failResolutions({EBUSY, EIO});
  system.log.clear();
  EXPECT_EQ(fileURLWithItemIdentifier("did=5"), std::nullopt);
  EXPECT_TRUE(
      system.log.has(LogLevel::Error, "can't resolve doc ID \"5\"; " + posixErrorDescription(EIO)));
  EXPECT_EQ(system.verstow.resolutions(), 2U);
}

TEST_F(ResolutionTest, AStorageRootWithoutDeviceIsAnErrorLine) {
  system.tree.faults.failNext(FakeCall::DeviceID, {FndError::posix(EIO)});
  expectNone("fid=5", LogLevel::Error,
             {"can't get device ID for \"" + std::string(TestSystem::kStorageRoot) + "\"; " +
              posixErrorDescription(EIO)});
  system.tree.faults.failNext(FakeCall::DeviceID, {FndError::posix(EIO)});
  EXPECT_EQ(fileURLWithFileIdentifier(FileID{5}), std::nullopt);
}

TEST_F(ResolutionTest, AFileIDLeadsToItsFile) {
  const FndURL url = system.file("a.txt");
  EXPECT_EQ(fileURLWithFileIdentifier(system.tree.fileID(url.path())), url);
}

TEST_F(ResolutionTest, AFileIDOnAnotherVolumeLeadsNowhere) {
  const FndURL url = system.file("a.txt");
  const FileID fileID = system.tree.fileID(url.path());
  EXPECT_EQ(_fileURLWithFileIdentifier_deviceIdentifier(fileID, FakeTree::kDevice), url);
  EXPECT_EQ(_fileURLWithFileIdentifier_deviceIdentifier(fileID, DeviceID{9}), std::nullopt);
  EXPECT_TRUE(system.log.has(LogLevel::Debug, "can't resolve path matching file ID \"" +
                                                  std::to_string(fileID.value) + "\"; " +
                                                  posixErrorDescription(ENODEV)));
}

TEST_F(ResolutionTest, NoIdentifierLeadsOutOfTheStorageAndTheAppLibraries) {
  system.addApp("org.example.a");
  for (const std::string path : {"/elsewhere/folder", "/storage/Documents2", "/apps/org.example.a",
                                 "/apps/org.example.a/Library"}) {
    system.tree.makeFolder(path);
    const std::string number = std::to_string(system.tree.fileID(path).value);
    expectNone("fid=" + number, LogLevel::Debug, {unresolvable(number)});
  }
}

TEST_F(ResolutionTest, APathThatClimbsOutOfTheStorageLeadsNowhere) {
  system.tree.makeFolder("/elsewhere");
  system.volumes.setPath(FileID{99}, "/storage/Documents/../../elsewhere");
  expectNone("fid=99", LogLevel::Debug, {unresolvable("99")});
}

TEST_F(ResolutionTest, AnIdentifierLeadsIntoAnAppLibraryAndToItsRoot) {
  system.addApp("org.example.a");
  const std::string root = "/apps/org.example.a/Documents";
  system.tree.makeFolder(root + "/folder");
  for (const std::string& path : {root, root + "/folder"}) {
    EXPECT_EQ(pathOf("fid=" + std::to_string(system.tree.fileID(path).value)), path);
  }
}

}  // namespace
}  // namespace vantrell
