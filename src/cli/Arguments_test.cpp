#include "cli/Arguments.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace vantrell::cli {
namespace {

using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

Arguments parsed(const std::vector<std::string>& words) {
  const auto outcome = parseArguments(words);
  const auto* arguments = std::get_if<Arguments>(&outcome);
  if (arguments == nullptr) {
    ADD_FAILURE() << std::get<NothingToRun>(outcome).text;
    return {};
  }
  return *arguments;
}

NothingToRun refused(const std::vector<std::string>& words) {
  const auto outcome = parseArguments(words);
  const auto* nothing = std::get_if<NothingToRun>(&outcome);
  if (nothing == nullptr) {
    ADD_FAILURE() << "accepted";
    return {};
  }
  return *nothing;
}

TEST(Arguments, LsListsTheRootWhenNothingElseIsNamed) {
  EXPECT_EQ(parsed({"ls"}).command, Command::Ls);
  EXPECT_EQ(parsed({"ls"}).operand, "root");
  EXPECT_EQ(parsed({"ls", "fid=3"}).operand, "fid=3");
  EXPECT_EQ(parsed({"ls", ""}).operand, "");
}

TEST(Arguments, EveryCommandOfOneOperandTakesIt) {
  EXPECT_EQ(parsed({"item", "x"}).command, Command::Item);
  EXPECT_EQ(parsed({"id", "x"}).command, Command::Id);
  EXPECT_EQ(parsed({"path", "x"}).command, Command::Path);
  for (const char* command : {"item", "id", "path"}) EXPECT_EQ(parsed({command, "x"}).operand, "x");
}

TEST(Arguments, GlobalOptionsAreTakenBeforeAndAfterTheCommand) {
  for (const Arguments& arguments : {parsed({"--json", "--verbose", "--storage", "/s", "ls"}),
                                     parsed({"ls", "--json", "--verbose", "--storage=/s"})}) {
    EXPECT_TRUE(arguments.json);
    EXPECT_TRUE(arguments.verbose);
    EXPECT_EQ(arguments.storage, "/s");
  }
  EXPECT_FALSE(parsed({"ls"}).json);
  EXPECT_EQ(parsed({"ls"}).storage, std::nullopt);
}

TEST(Arguments, ColorIsOneOfThreeWords) {
  EXPECT_EQ(parsed({"ls"}).color, ColorMode::Auto);
  EXPECT_EQ(parsed({"ls", "--color=always"}).color, ColorMode::Always);
  EXPECT_EQ(parsed({"ls", "--color", "never"}).color, ColorMode::Never);
  EXPECT_EQ(refused({"ls", "--color=sometimes"}).status, kStatusWrongUsage);
}

TEST(Arguments, AfterTwoDashesEverythingIsAName) {
  EXPECT_EQ(parsed({"item", "--", "--json"}).operand, "--json");
  EXPECT_FALSE(parsed({"item", "--", "--json"}).json);
}

TEST(Arguments, TagTakesAnyNumberOfLabelsAsTheyAre) {
  EXPECT_THAT(parsed({"tag", "x"}).labels, IsEmpty());
  EXPECT_THAT(parsed({"tag", "x", "a", "b c", "", "d,e"}).labels,
              ElementsAre("a", "b c", "", "d,e"));
  EXPECT_THAT(parsed({"tag", "x", "[a,b]", "ls", "root"}).labels,
              ElementsAre("[a,b]", "ls", "root"));
  EXPECT_THAT(parsed({"tag", "x", "--", "-a"}).labels, ElementsAre("-a"));
}

TEST(Arguments, AnOperandInBracketsIsAName) {
  EXPECT_EQ(parsed({"item", "[a,b]"}).operand, "[a,b]");
}

TEST(Arguments, RankTakesANumberOfSixtyFourBitsOrClear) {
  EXPECT_EQ(parsed({"rank", "x", "0"}).rank, 0U);
  EXPECT_EQ(parsed({"rank", "x", "18446744073709551615"}).rank, 18446744073709551615U);
  EXPECT_EQ(parsed({"rank", "x", "--clear"}).rank, std::nullopt);
  for (const char* wrong : {"18446744073709551616", "1.5", "0x1", "+1", " 1", "one", "", "-1"}) {
    EXPECT_EQ(refused({"rank", "x", wrong}).status, kStatusWrongUsage) << wrong;
  }
  EXPECT_EQ(refused({"rank", "x", "1", "--clear"}).status, kStatusWrongUsage);
  EXPECT_EQ(refused({"rank", "x"}).status, kStatusWrongUsage);
}

TEST(Arguments, UsedTakesADateNowOrClear) {
  const Arguments dated = parsed({"used", "x", "2026-11-21T18:53:15.25Z"});
  EXPECT_EQ(dated.usedChange, UsedChange::Date);
  EXPECT_EQ(dated.usedDate, FndDate::fromUnixTime(1795287195, 250000000));
  EXPECT_EQ(parsed({"used", "x", "now"}).usedChange, UsedChange::Now);
  EXPECT_EQ(parsed({"used", "x", "--clear"}).usedChange, UsedChange::Clear);
  EXPECT_EQ(refused({"used", "x", "yesterday"}).status, kStatusWrongUsage);
  EXPECT_EQ(refused({"used", "x", "2026-13-01T00:00:00Z"}).status, kStatusWrongUsage);
  EXPECT_EQ(refused({"used", "x", "now", "--clear"}).status, kStatusWrongUsage);
  EXPECT_EQ(refused({"used", "x"}).status, kStatusWrongUsage);
}

TEST(Arguments, WrongUsageIsRefusedWithStatusTwo) {
  const std::vector<std::vector<std::string>> wrong = {{},
                                                       {"fly"},
                                                       {"item"},
                                                       {"item", "a", "b"},
                                                       {"ls", "--fly"},
                                                       {"ls", "a", "b"},
                                                       {"--storage"},
                                                       {"ls", "--json", "--print0"},
                                                       {"doctor", "x"},
                                                       {"doctor", "--print0"}};
  for (const auto& words : wrong) {
    const NothingToRun nothing = refused(words);
    EXPECT_EQ(nothing.status, kStatusWrongUsage);
    EXPECT_FALSE(nothing.text.empty());
  }
}

TEST(Arguments, CommandsThatAreNotThereAreUnknown) {
  for (const char* command : {"anchor", "changes", "watch", "import", "mkdir", "rename", "move",
                              "rm", "trash", "untrash", "empty-trash", "apps", "search", "serve"}) {
    EXPECT_EQ(refused({command, "x"}).status, kStatusWrongUsage) << command;
  }
}

TEST(Arguments, TheReasonIsWantedAsJsonWhereverTheFlagStands) {
  EXPECT_TRUE(refused({"--json", "fly"}).json);
  EXPECT_TRUE(refused({"rank", "x", "one", "--json"}).json);
  EXPECT_FALSE(refused({"fly", "--", "--json"}).json);
}

TEST(Arguments, HelpShowsExamplesAndEveryCommand) {
  const NothingToRun help = refused({"--help"});
  EXPECT_EQ(help.status, kStatusDone);
  for (const char* word : {"Examples:", "ls", "item", "id", "path", "tag", "rank", "used", "doctor",
                           "--storage", "--json", "--print0", "Exit status"}) {
    EXPECT_THAT(help.text, HasSubstr(word));
  }
}

TEST(Arguments, HelpOfACommandIsAboutThatCommand) {
  const NothingToRun help = refused({"tag", "--help"});
  EXPECT_EQ(help.status, kStatusDone);
  EXPECT_THAT(help.text, HasSubstr("without a label it has none afterwards"));
}

TEST(Arguments, VersionIsOneLine) {
  const NothingToRun version = refused({"--version"});
  EXPECT_EQ(version.status, kStatusDone);
  EXPECT_THAT(version.text, testing::MatchesRegex("vantrell [0-9]+\\.[0-9]+\\.[0-9]+\n"));
}

}  // namespace
}  // namespace vantrell::cli
