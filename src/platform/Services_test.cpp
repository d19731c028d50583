#include "platform/Services.h"

#include <gtest/gtest.h>

namespace vantrell::platform {
namespace {

int objectsAlive = 0;

struct Counted {
  Counted() { ++objectsAlive; }
  ~Counted() { --objectsAlive; }
  int value = 0;
};

struct Outer {
  Counted& inner = processWide<Counted>();
};

// Asks for services and for another process-wide object while it goes.
struct LastWords {
  ~LastWords() {
    services();
    processWide<Counted>().value = 1;
  }
};

TEST(Services, ProcessWideObjectsGoWithTheInstallation) {
  {
    const Installation installation = install({});
    processWide<Counted>().value = 7;
    EXPECT_EQ(processWide<Counted>().value, 7);
    EXPECT_EQ(objectsAlive, 1);
  }
  EXPECT_EQ(objectsAlive, 0);
  const Installation installation = install({});
  EXPECT_EQ(processWide<Counted>().value, 0);
}

TEST(Services, OneProcessWideObjectMayBeMadeFromAnother) {
  const Installation installation = install({});
  EXPECT_EQ(&processWide<Outer>().inner, &processWide<Counted>());
}

TEST(Services, AnObjectMadeWhileOthersGoDoesNotOutliveTheInstallation) {
  {
    const Installation installation = install({});
    processWide<LastWords>();
  }
  EXPECT_EQ(objectsAlive, 0);
}

TEST(Services, AnInstallationMovesToItsNewHolder) {
  Installation outer;
  {
    Installation inner = install({});
    outer = std::move(inner);
  }
  EXPECT_EQ(services().clock, nullptr);
  outer = Installation();
  outer = install({});
}

TEST(ServicesDeathTest, AskingWithoutAnInstallationEndsTheProcess) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  EXPECT_DEATH(services(), "no services are installed");
}

TEST(ServicesDeathTest, ASecondInstallationEndsTheProcess) {
  GTEST_FLAG_SET(death_test_style, "threadsafe");
  const Installation first = install({});
  EXPECT_DEATH({ const Installation second = install({}); }, "services are installed already");
}

}  // namespace
}  // namespace vantrell::platform
