// What the program says of itself, and of command lines that make no sense.

#include <gmock/gmock.h>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

using testing::HasSubstr;

class Usage : public VantrellTest {};

TEST_F(Usage, HelpAndVersionGoToStandardOutputAndNeedNoStorage) {
  std::filesystem::remove(storage());
  Invocation help = invocation({"--help"});
  help.folder = home();
  const Outcome shown = run(help);
  EXPECT_EQ(shown.status, 0);
  EXPECT_THAT(shown.out, HasSubstr("Examples:"));
  EXPECT_EQ(shown.err, "");
  help.words.back() = "--version";
  EXPECT_THAT(run(help).out, testing::StartsWith("vantrell "));
  EXPECT_FALSE(std::filesystem::exists(stateFolder()));
}

TEST_F(Usage, WrongUsageEndsWithStatusTwo) {
  const std::vector<std::vector<std::string>> wrong = {{},
                                                       {"fly"},
                                                       {"trash", "root"},
                                                       {"watch", "root"},
                                                       {"item"},
                                                       {"rank", "root"},
                                                       {"rank", "root", "many"},
                                                       {"used", "root", "sometime"},
                                                       {"ls", "--page", "x"}};
  for (const auto& words : wrong) {
    const Outcome outcome = vantrell(words);
    EXPECT_EQ(outcome.status, 2) << testing::PrintToString(words);
    EXPECT_EQ(outcome.out, "");
    EXPECT_THAT(outcome.err, HasSubstr("--help"));
  }
}

TEST_F(Usage, WrongUsageWithJsonIsAJsonError) {
  const Json wrong = error({"fly"}, 2);
  EXPECT_EQ(wrong["domain"], "com.quillon.vantrell");
  EXPECT_EQ(wrong["code"], 8);
}

TEST_F(Usage, WrongUsageTouchesNothing) {
  vantrell({"rank", "root", "many"});
  EXPECT_FALSE(std::filesystem::exists(stateFolder()));
}

}  // namespace
}  // namespace vantrell::integration
