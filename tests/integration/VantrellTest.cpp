#include "VantrellTest.h"

#include <unistd.h>

#include <cstdlib>
#include <fstream>
#include <iterator>
#include <sstream>

namespace vantrell::integration {
namespace fs = std::filesystem;

namespace {

// Folders that a test has made unreadable would outlive it.
void removeTree(const fs::path& folder) {
  std::error_code error;
  fs::remove_all(folder, error);
  if (!error) return;
  run({{"chmod", "-R", "u+rwx", folder}, {}, ""});
  fs::remove_all(folder, error);
}

}  // namespace

void VantrellTest::SetUp() {
  std::string pattern = fs::temp_directory_path() / "vantrell-it-XXXXXX";
  ASSERT_NE(::mkdtemp(pattern.data()), nullptr) << pattern;
  _home = fs::canonical(pattern);
  fs::create_directory(storage());
}

void VantrellTest::TearDown() { removeTree(_home); }

std::string VantrellTest::write(const std::string& relativePath, std::string_view content) {
  const fs::path target = storage() / relativePath;
  fs::create_directories(target.parent_path());
  std::ofstream file(target, std::ios::binary);
  file << content;
  EXPECT_TRUE(file.flush()) << target;
  return target;
}

std::string VantrellTest::makeFolder(const std::string& relativePath) {
  fs::create_directories(storage() / relativePath);
  return storage() / relativePath;
}

std::string VantrellTest::contentOf(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  return {std::istreambuf_iterator<char>(file), std::istreambuf_iterator<char>()};
}

Invocation VantrellTest::invocation(const Words& words) const {
  Words all = {VANTRELL_PROGRAM};
  all.insert(all.end(), words.begin(), words.end());
  return {all,
          {{"HOME", _home},
           {"XDG_STATE_HOME", _home / "state"},
           {"XDG_CONFIG_HOME", _home / "config"},
           {"XDG_DATA_HOME", _home / "data"},
           {"XDG_DATA_DIRS", ""},
           {"NO_COLOR", ""},
           {"VANTRELL_MODULE", ""}},
          storage()};
}

std::vector<Json> VantrellTest::objects(Words words) const {
  words.insert(words.begin(), "--json");
  const Outcome outcome = vantrell(words);
  EXPECT_EQ(outcome.status, 0) << testing::PrintToString(words) << outcome.err;
  EXPECT_EQ(outcome.err, "");
  std::vector<Json> result;
  for (const std::string& line : linesIn(outcome.out)) {
    result.push_back(Json::parse(line, nullptr, false));
    EXPECT_TRUE(result.back().is_object()) << line;
  }
  return result;
}

Json VantrellTest::object(Words words) const {
  const std::vector<Json> all = objects(std::move(words));
  EXPECT_EQ(all.size(), 1U);
  return all.empty() ? Json::object() : all.front();
}

Json VantrellTest::error(Words words, int status) const {
  words.insert(words.begin(), "--json");
  const Outcome outcome = vantrell(words);
  EXPECT_EQ(outcome.status, status) << testing::PrintToString(words) << outcome.err;
  EXPECT_EQ(outcome.out, "");
  Json object = Json::parse(outcome.err, nullptr, false);
  EXPECT_TRUE(object.is_object()) << outcome.err;
  for (const char* key : {"domain", "code", "message"}) {
    EXPECT_TRUE(object.contains(key)) << outcome.err;
  }
  return object.is_object() ? object : Json::object();
}

std::string VantrellTest::identifierOf(const std::string& path) const {
  return object({"id", "--", path}).value("itemIdentifier", "");
}

std::string VantrellTest::pathOf(const std::string& identifier) const {
  return object({"path", identifier}).value("path", "");
}

void VantrellTest::tool(const Words& words) const {
  const Outcome outcome =
      run({words, {{"HOME", _home}, {"GIT_CONFIG_GLOBAL", "/dev/null"}}, storage()});
  EXPECT_EQ(outcome.status, 0) << testing::PrintToString(words) << outcome.out << outcome.err;
}

std::vector<std::string> linesIn(const std::string& text) {
  std::vector<std::string> lines;
  std::istringstream stream(text);
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

}  // namespace vantrell::integration
