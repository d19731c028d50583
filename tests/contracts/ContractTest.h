#pragma once

#include <gtest/gtest.h>

#include <cerrno>
#include <memory>
#include <optional>
#include <stdexcept>
#include <string>

#include "tests/contracts/Environment.h"

namespace vantrell::testing {

inline constexpr std::int64_t kNoSuchFile = 260;

/// Runs a suite on every version of the services.
class ContractTest : public ::testing::TestWithParam<EnvironmentMaker> {
 protected:
  Environment& system() { return *_environment; }
  FndURL url(const std::string& path) { return _environment->url(path); }

  std::unique_ptr<OpenFile> open(const std::string& path, OpenMode mode) {
    auto file = system().fileSystem().open(url(path), mode);
    if (!file) throw std::runtime_error(path + ": " + file.error().description());
    return *std::move(file);
  }
  FileID fileID(const std::string& path) {
    return open(path, OpenMode::EventOnly)->identity()->fileID;
  }
  Result<void> setAttribute(const std::string& path, std::string_view name,
                            const std::string& value) {
    return open(path, OpenMode::ReadWrite)
        ->setAttribute(name, {reinterpret_cast<const std::uint8_t*>(value.data()), value.size()});
  }
  Result<std::string> attribute(const std::string& path, std::string_view name) {
    const auto size = system().attributes().sizeOfAttribute(url(path), name);
    if (!size) return std::unexpected(size.error());
    FndData value(*size);
    const auto copied = system().attributes().copyAttribute(url(path), name, value);
    if (!copied) return std::unexpected(copied.error());
    return std::string(value.begin(), value.begin() + static_cast<std::ptrdiff_t>(*copied));
  }
  DocumentID allocate(const std::string& path) {
    system().verstow().prepare();
    const auto file = open(path, OpenMode::EventOnly);
    const auto documentID = system().verstow().getOrAllocateDocumentID(*file);
    if (!documentID) throw std::runtime_error(path + ": " + documentID.error().description());
    return *documentID;
  }

 private:
  std::unique_ptr<Environment> _environment = GetParam().make();
};

inline bool isNoSuchFile(const FndError& error) {
  return error.is(kFndFoundationErrorDomain, kNoSuchFile);
}

/// Instantiates a suite derived from `ContractTest` on every version.
#define VANTRELL_CONTRACT(Suite)                                                                \
  INSTANTIATE_TEST_SUITE_P(On, Suite, ::testing::ValuesIn(::vantrell::testing::environments()), \
                           [](const auto& instance) { return instance.param.name; })

}  // namespace vantrell::testing
