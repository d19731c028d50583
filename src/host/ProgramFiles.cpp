#include "host/ProgramFiles.h"

#include <cstdlib>
#include <filesystem>
#include <system_error>

namespace vantrell::host {
namespace {

std::string installedOrBuilt(const char* fromProgram, const char* inTree) {
  std::error_code error;
  const auto program = std::filesystem::read_symlink("/proc/self/exe", error);
  const auto installed = (program.parent_path() / fromProgram).lexically_normal();
  return std::filesystem::exists(installed, error) ? installed.native() : inTree;
}

}  // namespace

std::string extensionModulePath() {
  const char* named = std::getenv("VANTRELL_MODULE");
  if (named != nullptr && *named != '\0') return named;
  return installedOrBuilt(VANTRELL_MODULE_FROM_PROGRAM, VANTRELL_MODULE_IN_TREE);
}

std::string packageTypeFolder() {
  return installedOrBuilt(VANTRELL_PACKAGE_TYPES_FROM_PROGRAM, VANTRELL_PACKAGE_TYPES_IN_TREE);
}

}  // namespace vantrell::host
