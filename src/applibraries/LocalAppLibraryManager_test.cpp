#include "applibraries/LocalAppLibraryManager.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>

#include "applibraries/ZubAppLibraryManager.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

using testing::ElementsAre;
using testing::IsEmpty;
using Fields = FakeApplicationProxy::Fields;

class AppLibraryManagerTest : public testing::Test {
 protected:
  // An application whose folders are there.
  Fields application(const std::string& bundleIdentifier) {
    const std::string container = "/apps/" + bundleIdentifier;
    system.tree.makeFolder(container + "/Documents");
    Fields fields;
    fields.bundleIdentifier = bundleIdentifier;
    fields.dataContainerPath = container;
    return fields;
  }
  static std::vector<std::string> selected() {
    std::vector<std::string> identifiers;
    for (const auto& proxy : LocalAppLibraryManager::retrieveAppLibraries()) {
      identifiers.push_back(proxy->bundleIdentifier().value_or("none"));
    }
    return identifiers;
  }

  TestSystem system;
};

TEST_F(
    AppLibraryManagerTest,
    AnApplicationWhoseInfoDictionarySetsTheDocumentBrowserKeyToTrueIsSelectedEvenWhenItSupportsNeither) {
  Fields fields = application("a");
  fields.infoBooleans["XoSupportsDocumentBrowser"] = true;
  fields.supportsOpenInPlace = false;
  fields.fileSharingEnabled = false;
  system.appreg.addApplication(fields);
  EXPECT_THAT(selected(), ElementsAre("a"));
}

TEST_F(AppLibraryManagerTest, AnApplicationWithOpenInPlaceButWithoutFileSharingIsNotSelected) {
  Fields openInPlace = application("a");
  openInPlace.fileSharingEnabled = false;
  system.appreg.addApplication(openInPlace);
  Fields fileSharing = application("b");
  fileSharing.supportsOpenInPlace = false;
  fileSharing.infoBooleans["XoSupportsDocumentBrowser"] = false;
  system.appreg.addApplication(fileSharing);
  system.appreg.addApplication(application("c"));
  EXPECT_THAT(selected(), ElementsAre("c"));
}

TEST_F(AppLibraryManagerTest, RecordsComeInTheRegistrysOrderByCategory) {
  system.appreg.add(2, std::make_shared<FakeApplicationProxy>(application("system")));
  system.appreg.add(0, std::make_shared<FakeApplicationProxy>(application("z")));
  system.appreg.add(0, std::make_shared<FakeApplicationProxy>(application("a")));
  EXPECT_THAT(selected(), ElementsAre("z", "a", "system"));
}

TEST_F(AppLibraryManagerTest, ANilRecordIsAnErrorLine) {
  system.appreg.add(0, nullptr);
  system.appreg.addApplication(application("a"));
  EXPECT_THAT(selected(), ElementsAre("a"));
  EXPECT_EQ(system.log.textsAt(LogLevel::Error),
            std::vector<std::string>{"[ERROR] enumerate Application provided nil proxy"});
}

TEST_F(AppLibraryManagerTest, WhatIsNoApplicationAndWhatHasNoDataContainerIsSkippedSilently) {
  system.appreg.add(0, std::make_shared<FakeBundleProxy>(FakeBundleProxy::Fields()));
  Fields fields;
  fields.bundleIdentifier = "no container";
  system.appreg.addApplication(fields);
  EXPECT_THAT(selected(), IsEmpty());
  EXPECT_EQ(system.log.texts(),
            (std::vector<std::string>{"[DEBUG] ┏0 retrieving app libraries from appreg",
                                      "[DEBUG] bundle proxies []", "[DEBUG] ┗0"}));
}

TEST_F(AppLibraryManagerTest, EachSelectionAndTheListAreDebugLinesInASection) {
  system.appreg.addApplication(application("a"));
  Fields nameless = application("nameless");
  nameless.bundleIdentifier.reset();
  system.appreg.addApplication(nameless);
  LocalAppLibraryManager::retrieveAppLibraries();
  EXPECT_EQ(
      system.log.textsAt(LogLevel::Debug),
      (std::vector<std::string>{"[DEBUG] ┏0 retrieving app libraries from appreg", "[DEBUG] add a",
                                "[DEBUG] add <unknown>",
                                "[DEBUG] bundle proxies [<proxy a>, <proxy nil>]", "[DEBUG] ┗0"}));
}

TEST_F(AppLibraryManagerTest, TheMapsLeadFromIdentifiersToItemsAndFromRootsToRecords) {
  system.appreg.addApplication(application("a"));
  system.appreg.addApplication(application("b"));
  const LocalAppLibraryManager& manager = LocalAppLibraryManager::sharedManager();
  const auto libraries = manager.appLibrariesByItemIDs();
  const auto proxies = manager.bundleProxiesByRootURLs();
  ASSERT_EQ(libraries->size(), 2U);
  EXPECT_EQ(libraries->at("#b")->fileURL(), FndURL::fileURLWithPath("/apps/b/Documents"));
  ASSERT_EQ(proxies->size(), 2U);
  EXPECT_EQ(proxies->at(FndURL::fileURLWithPath("/apps/a/Documents"))->bundleIdentifier(), "a");
  EXPECT_THAT(*ZubAppLibraryManager::rootURLsForAppLibraries(),
              ElementsAre(FndURL::fileURLWithPath("/apps/a/Documents"),
                          FndURL::fileURLWithPath("/apps/b/Documents")));
}

TEST_F(AppLibraryManagerTest, ALaterRecordWithTheSameKeyReplacesTheEarlierOne) {
  Fields fields = application("a");
  fields.localizedName = "First";
  system.appreg.addApplication(fields);
  fields.localizedName = "Second";
  system.appreg.addApplication(fields);
  const auto libraries = LocalAppLibraryManager::sharedManager().appLibrariesByItemIDs();
  ASSERT_EQ(libraries->size(), 1U);
  EXPECT_EQ(libraries->at("#a")->filename(), "Second");
}

TEST_F(AppLibraryManagerTest, ARecordThatGivesNoItemIsADebugLine) {
  Fields fields = application("a");
  fields.dataContainerPath = "/apps/gone";
  system.appreg.addApplication(fields);
  system.appreg.addApplication(application("b"));
  EXPECT_EQ(LocalAppLibraryManager::sharedManager().appLibrariesByItemIDs()->size(), 1U);
  EXPECT_TRUE(system.log.has(LogLevel::Debug,
                             "[DEBUG] can't create app library from bundle proxy <proxy a>"));
}

TEST_F(AppLibraryManagerTest, ALibraryOnAnotherVolumeIsLeftOutWithAnErrorLine) {
  system.appreg.addApplication(application("a"));
  system.tree.mount("/apps/a/Documents", DeviceID{77});
  EXPECT_THAT(*ZubAppLibraryManager::rootURLsForAppLibraries(), IsEmpty());
  EXPECT_TRUE(system.log.has(LogLevel::Error,
                             "[ERROR] app library at file:///apps/a/Documents is left out: it is "
                             "not on the storage's volume"));
}

TEST_F(AppLibraryManagerTest, TheLibraryThatContainsAURLIsFound) {
  system.appreg.addApplication(application("a"));
  const auto& manager = LocalAppLibraryManager::sharedManager();
  const auto bundleOf = [&manager](std::string_view path) {
    return manager.bundleIdentifierOfLibraryContaining(FndURL::fileURLWithPath(path));
  };
  EXPECT_EQ(bundleOf("/apps/a/Documents/x/y"), "a");
  EXPECT_EQ(bundleOf("/apps/a/Documents"), std::nullopt);
  EXPECT_EQ(bundleOf("/apps/a/Documents2"), std::nullopt);
  EXPECT_EQ(bundleOf("/storage/Documents/x"), std::nullopt);
}

TEST_F(AppLibraryManagerTest, TheSharedManagerIsMadeOnceForAnInstallation) {
  system.appreg.addApplication(application("a"));
  const auto first = &LocalAppLibraryManager::sharedManager();
  system.appreg.addApplication(application("b"));
  EXPECT_EQ(&LocalAppLibraryManager::sharedManager(), first);
  EXPECT_EQ(ZubAppLibraryManager::rootURLsForAppLibraries()->size(), 1U);
}

TEST(AppLibraryManagerWithoutRegistry, HoldsNothing) {
  FakeLogSink log;
  platform::Services services;
  services.log = &log;
  const platform::Installation installation = platform::install(services);
  EXPECT_THAT(*ZubAppLibraryManager::rootURLsForAppLibraries(), IsEmpty());
}

}  // namespace
}  // namespace vantrell
