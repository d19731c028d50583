#pragma once

#include <gtest/gtest.h>

#include <memory>
#include <string>

#include "platform/dochost/DochostErrors.h"
#include "provider/LocalDochost.h"
#include "tests/fakes/TestSystem.h"

namespace vantrell {

/// The extension on a system of fakes. Lines of the start are in the log; tests look for theirs.
class ProviderTest : public testing::Test {
 protected:
  bool hasLine(LogLevel level, const std::string& text) const {
    return system.log.has(level, text);
  }

  /// True when a section with that text was opened, and closed under the same number.
  bool hasSection(const std::string& text) const {
    const std::string opening = "[DEBUG] ┏";
    for (const std::string& line : system.log.textsAt(LogLevel::Debug)) {
      if (!line.starts_with(opening)) continue;
      const std::size_t space = line.find(' ', opening.size());
      const std::string number = line.substr(opening.size(), space - opening.size());
      if (line.substr(space + 1) == text) return hasLine(LogLevel::Debug, "[DEBUG] ┗" + number);
    }
    return false;
  }

  static void expectNoSuchItem(const FndError& error, std::string_view identifier) {
    EXPECT_TRUE(error.is(kDochostErrorDomain, -1001)) << error.description();
    const auto* named = error.info<std::string>(kDochostErrorItemIdentifierKey);
    ASSERT_NE(named, nullptr);
    EXPECT_EQ(*named, identifier);
  }

  TestSystem system;
  std::unique_ptr<LocalDochost> extension = std::make_unique<LocalDochost>();
};

}  // namespace vantrell
