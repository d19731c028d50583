#pragma once

#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>
#include <string>
#include <string_view>
#include <vector>

#include "Program.h"

namespace vantrell::integration {

using Json = nlohmann::json;

/// The real program on a storage of its own, with its own home and state, below a temporary
/// folder that goes with the test.
class VantrellTest : public testing::Test {
 protected:
  using Words = std::vector<std::string>;

  void SetUp() override;
  void TearDown() override;

  const std::filesystem::path& home() const { return _home; }
  std::filesystem::path storage() const { return _home / "Documents"; }
  std::filesystem::path stateFolder() const { return _home / "state/vantrell"; }
  std::filesystem::path database() const { return stateFolder() / "vantrell.db"; }

  /// Writes a file below the storage, with the folders that lead to it, and gives its path.
  std::string write(const std::string& relativePath, std::string_view content);
  std::string makeFolder(const std::string& relativePath);
  std::string path(const std::string& relativePath) const { return storage() / relativePath; }
  static std::string contentOf(const std::string& path);

  /// How the program is run here: on this storage, in the storage folder.
  Invocation invocation(const Words& words) const;
  Outcome vantrell(const Words& words) const { return run(invocation(words)); }
  /// The one object that the command prints with --json. A failure of the test without one.
  Json object(Words words) const;
  /// All objects that the command prints with --json.
  std::vector<Json> objects(Words words) const;
  /// The error object that the command prints with --json when it fails with `status`.
  Json error(Words words, int status = 1) const;

  std::string identifierOf(const std::string& path) const;
  std::string pathOf(const std::string& identifier) const;

  /// Runs another program in the storage folder and expects it to succeed.
  void tool(const Words& words) const;

 private:
  std::filesystem::path _home;
};

/// The lines of `text`, without their ends.
std::vector<std::string> linesIn(const std::string& text);

}  // namespace vantrell::integration
