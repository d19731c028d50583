#include "support/Log.h"

#include <gtest/gtest.h>

#include <thread>
#include <vector>

#include "platform/foundation/FndURL.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {
namespace {

class LogTest : public testing::Test {
 protected:
  FakeLogLine only() const {
    const auto lines = system.log.lines();
    EXPECT_EQ(lines.size(), 1U);
    return lines.empty() ? FakeLogLine{} : lines.front();
  }

  TestSystem system;
};

TEST_F(LogTest, ADebugLineCarriesItsPrefixAndLevel) {
  logDebug("text");
  EXPECT_EQ(only(),
            (FakeLogLine{LogLevel::Debug, "com.quillon.Dochost", "vantrell", "[DEBUG] text"}));
}

TEST_F(LogTest, AnInfoLineCarriesItsPrefixAndLevel) {
  logInfo("text");
  EXPECT_EQ(only(),
            (FakeLogLine{LogLevel::Info, "com.quillon.Dochost", "vantrell", "[INFO] text"}));
}

TEST_F(LogTest, AnErrorLineCarriesItsPrefixAndLevel) {
  logError("text");
  EXPECT_EQ(only(),
            (FakeLogLine{LogLevel::Error, "com.quillon.Dochost", "vantrell", "[ERROR] text"}));
}

TEST_F(LogTest, TheLogObjectWritesLinesWithoutAPrefix) {
  logObject().write(LogLevel::Error, "text");
  EXPECT_EQ(only(), (FakeLogLine{LogLevel::Error, "com.quillon.Dochost", "vantrell", "text"}));
}

TEST_F(LogTest, TheFrameworksDefaultLogIsAnotherCategory) {
  dh_default_log().write(LogLevel::Error, "[ERROR] text");
  EXPECT_EQ(only().text, "[ERROR] text");
  EXPECT_NE(only().category, "vantrell");
}

TEST_F(LogTest, ALineIsPutTogetherFromPiecesOfEveryKind) {
  const std::string text = "b";
  logDebug("a", text, std::string_view("c"), 7, std::uint64_t{18446744073709551615ULL}, -3,
           FndURL::fileURLWithPath("/x y"), FndError::posix(2), [] { return "lazy"; });
  EXPECT_EQ(only().text,
            "[DEBUG] abc718446744073709551615-3file:///x%20y"
            "No such file or directory (FndPOSIXErrorDomain 2)lazy");
}

TEST_F(LogTest, ALineBelowTheRecordedLevelIsNotPutTogether) {
  system.log.setRecordedLevel(LogLevel::Error);
  bool asked = false;
  const auto piece = [&asked] {
    asked = true;
    return "piece";
  };
  logDebug(piece);
  logInfo(piece);
  EXPECT_FALSE(asked);
  EXPECT_TRUE(system.log.lines().empty());
  logError(piece);
  EXPECT_TRUE(asked);
  EXPECT_EQ(only().text, "[ERROR] piece");
}

TEST_F(LogTest, AFailureThatIsExpectedIsADebugLineAndAnyOtherAnErrorLine) {
  logFailure(true, "expected");
  logFailure(false, "unexpected");
  EXPECT_EQ(system.log.textsAt(LogLevel::Debug), std::vector<std::string>{"[DEBUG] expected"});
  EXPECT_EQ(system.log.textsAt(LogLevel::Error), std::vector<std::string>{"[ERROR] unexpected"});
}

TEST_F(LogTest, AFileNameCannotForgeALine) {
  logDebug("name: ", "a\n[ERROR] forged\xff");
  EXPECT_EQ(only().text, "[DEBUG] name: a\\x0A[ERROR] forged\\xFF");
}

TEST_F(LogTest, AnyThreadMayLog) {
  std::vector<std::jthread> threads;
  for (int i = 0; i < 16; ++i) {
    threads.emplace_back([i] {
      for (int n = 0; n < 50; ++n) logDebug("thread ", i);
    });
  }
  threads.clear();
  EXPECT_EQ(system.log.lines().size(), 800U);
}

}  // namespace
}  // namespace vantrell
