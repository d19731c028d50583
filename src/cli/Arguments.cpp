#include "cli/Arguments.h"

#include <CLI/CLI.hpp>
#include <algorithm>
#include <charconv>
#include <iterator>
#include <map>

namespace vantrell::cli {
namespace {

constexpr const char* kDescription =
    "Shows the documents below a folder as items whose identifiers stay the same when a file is\n"
    "renamed, moved or saved by replacing it.";

constexpr const char* kFooter = R"(
An ITEM is an identifier (did=12, fid=345, #org.example.App, root) or a path. A name that
looks like an identifier or an option is written with "./" or after "--".

Examples:
  vantrell ls                          the documents folder
  vantrell ls ~/Documents/Letters      one folder, by its path
  vantrell --json ls root              one JSON object a line
  vantrell id report.odt               the identifier that stays
  vantrell path did=3412               where that document is now
  vantrell tag report.odt Work Urgent  set its tags
  vantrell ls --print0 | xargs -0 -n1 file

Exit status: 0 done, 1 the operation failed, 2 wrong usage.)";

constexpr const char* kTagFooter = R"(
The labels replace the tags the item has; without a label it has none afterwards.
A label that begins with "-" is written after "--".)";

// What the parser fills in, before numbers and dates are read.
struct Words {
  Arguments arguments;
  std::string color = "auto";
  std::string rank;
  std::string date;
  bool clear = false;
};

void addGlobalOptions(CLI::App& app, Words& words) {
  app.add_option("--storage", words.arguments.storage,
                 "The folder whose documents are meant (default: the documents folder)")
      ->type_name("DIR");
  auto* json = app.add_flag("--json", words.arguments.json, "One JSON object a line");
  app.add_flag("--verbose", words.arguments.verbose, "Log to standard error");
  app.add_option("--color", words.color, "auto, always or never")
      ->type_name("WHEN")
      ->check(CLI::IsMember({"auto", "always", "never"}));
  app.add_flag("--print0", words.arguments.print0,
               "Only paths (identifiers for id), raw, each with a NUL byte behind it")
      ->excludes(json);
  app.set_version_flag("--version", "vantrell " VANTRELL_VERSION);
}

CLI::App* addCommand(CLI::App& app, const char* name, const char* description) {
  CLI::App* command = app.add_subcommand(name, description);
  command->fallthrough();
  return command;
}

CLI::Option* addOperand(CLI::App* command, Words& words, const char* name, const char* help) {
  return command->add_option(name, words.arguments.operand, help)->required();
}

using Commands = std::map<const CLI::App*, Command>;

Commands addCommands(CLI::App& app, Words& words) {
  Commands commands;
  CLI::App* ls = addCommand(app, "ls", "List what is directly in a folder");
  addOperand(ls, words, "CONTAINER", "Folder: identifier, path, or root")->required(false);
  CLI::App* item = addCommand(app, "item", "Show the record of an item");
  addOperand(item, words, "ITEM", "Identifier or path");
  CLI::App* id = addCommand(app, "id", "Show the identifier of what is at a path");
  addOperand(id, words, "PATH", "Path");
  CLI::App* path = addCommand(app, "path", "Show where an item is now");
  addOperand(path, words, "ITEM", "Identifier or path");
  CLI::App* tag = addCommand(app, "tag", "Replace the tags of an item");
  addOperand(tag, words, "ITEM", "Identifier or path");
  tag->add_option("LABEL", words.arguments.labels, "Tags, in order");
  tag->footer(kTagFooter);
  CLI::App* rank = addCommand(app, "rank", "Set or clear the favourite rank of an item");
  addOperand(rank, words, "ITEM", "Identifier or path");
  rank->add_option("N", words.rank, "Rank, from 0 to 18446744073709551615");
  rank->add_flag("--clear", words.clear, "Take the rank away");
  CLI::App* used = addCommand(app, "used", "Set or clear when an item was last used");
  addOperand(used, words, "ITEM", "Identifier or path");
  used->add_option("DATE", words.date, "RFC 3339 (2026-11-21T18:53:15Z), or now");
  used->add_flag("--clear", words.clear, "Take the date away");
  CLI::App* doctor = addCommand(app, "doctor", "Tell what is recorded, where, and what is wrong");
  commands = {{ls, Command::Ls},     {item, Command::Item},    {id, Command::Id},
              {path, Command::Path}, {tag, Command::Tag},      {rank, Command::Rank},
              {used, Command::Used}, {doctor, Command::Doctor}};
  return commands;
}

// The reason why the words make no sense, empty when they do.
std::string readRank(Words& words) {
  if (words.clear == !words.rank.empty()) return "rank takes either N or --clear";
  if (words.clear) return "";
  std::uint64_t value = 0;
  const char* end = words.rank.data() + words.rank.size();
  const auto [stop, error] = std::from_chars(words.rank.data(), end, value);
  if (error != std::errc() || stop != end) return "\"" + words.rank + "\" is no rank";
  words.arguments.rank = value;
  return "";
}

std::string readDate(Words& words) {
  if (words.clear == !words.date.empty()) return "used takes either DATE or --clear";
  if (words.clear) return "";
  words.arguments.usedChange = words.date == "now" ? UsedChange::Now : UsedChange::Date;
  if (words.date == "now") return "";
  words.arguments.usedDate = FndDate::fromRFC3339(words.date);
  return words.arguments.usedDate ? "" : "\"" + words.date + "\" is no RFC 3339 date";
}

std::string readValues(Words& words) {
  Arguments& arguments = words.arguments;
  if (words.color == "always") arguments.color = ColorMode::Always;
  if (words.color == "never") arguments.color = ColorMode::Never;
  switch (arguments.command) {
    case Command::Rank:
      return readRank(words);
    case Command::Used:
      return readDate(words);
    case Command::Doctor:
      return arguments.print0 ? "doctor has nothing for --print0" : "";
    default:
      return "";
  }
}

// Wrong usage may keep the parser from ever reading --json, and the reason is wanted in that
// form all the same.
bool asksForJson(const std::vector<std::string>& words) {
  const auto end = std::find(words.begin(), words.end(), "--");
  return std::find(words.begin(), end, "--json") != end;
}

// The parser takes "[a,b]" for a list of two values. A NUL byte, which no word can have, hides
// the closing bracket from it.
std::string protectedWord(std::string word) {
  if (word.starts_with('[') && word.ends_with(']')) word += '\0';
  return word;
}

void unprotect(std::string& word) {
  if (word.ends_with('\0')) word.pop_back();
}

void parse(CLI::App& app, const std::vector<std::string>& words, Arguments& arguments) {
  std::vector<std::string> reversed;  // as the parser wants them
  std::transform(words.rbegin(), words.rend(), std::back_inserter(reversed), protectedWord);
  app.parse(std::move(reversed));
  unprotect(arguments.operand);
  for (std::string& label : arguments.labels) unprotect(label);
  if (arguments.storage) unprotect(*arguments.storage);
}

}  // namespace

std::variant<Arguments, NothingToRun> parseArguments(const std::vector<std::string>& given) {
  Words words;
  words.arguments.operand = "root";  // what `ls` lists when nothing else is named
  CLI::App app(kDescription, "vantrell");
  app.footer(kFooter);
  app.require_subcommand(1);
  const auto wrong = [&given](std::string reason) {
    return NothingToRun{kStatusWrongUsage, std::move(reason), asksForJson(given)};
  };
  try {
    addGlobalOptions(app, words);
    const Commands commands = addCommands(app, words);
    parse(app, given, words.arguments);
    words.arguments.command = commands.at(app.get_subcommands().front());
  } catch (const CLI::CallForHelp&) {
    return NothingToRun{kStatusDone, app.help(), false};
  } catch (const CLI::CallForVersion& version) {
    return NothingToRun{kStatusDone, std::string(version.what()) + "\n", false};
  } catch (const CLI::Error& error) {
    return wrong(error.what());
  }
  if (std::string reason = readValues(words); !reason.empty()) return wrong(std::move(reason));
  return words.arguments;
}

}  // namespace vantrell::cli
