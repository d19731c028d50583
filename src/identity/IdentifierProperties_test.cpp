#include <gtest/gtest.h>
#include <rapidcheck.h>

#include <set>
#include <string>
#include <vector>

#include "identity/DocIDEventPath.h"
#include "identity/FndURL+ZubFileObjectIdentifier.h"
#include "identity/ZubFileObjectIdentifier.h"
#include "tests/fakes/TestSystem.h"
#include "tests/support/RandomSeed.h"

namespace vantrell {
namespace {

class IdentifierProperties : public testing::Test {
 protected:
  IdentifierProperties() { randomSeed(); }
};

TEST_F(IdentifierProperties, AnIdentifierLeadsBackToWhereItCameFrom) {
  EXPECT_TRUE(rc::check([] {
    TestSystem system;
    const auto depths = *rc::gen::container<std::vector<int>>(12, rc::gen::inRange(0, 5));
    std::vector<std::string> paths;
    for (std::size_t i = 0; i < depths.size(); ++i) {
      std::string path;
      for (int depth = 0; depth < depths[i]; ++depth) path += "f" + std::to_string(depth) + "/";
      const bool isFile = *rc::gen::arbitrary<bool>();
      path += std::to_string(i) +
              (isFile ? ".txt" : *rc::gen::element(std::string(), std::string(".tessera")));
      isFile ? system.file(path) : system.folder(path);
      paths.push_back(system.inStorage(path));
    }
    std::vector<std::string> identifiers;
    for (const std::string& path : paths) {
      const auto identifier = itemIdentifier(FndURL::fileURLWithPath(path));
      RC_ASSERT(identifier.has_value());
      identifiers.push_back(*identifier);
    }
    for (std::size_t i = 0; i < paths.size(); ++i) {
      const auto url = fileURLWithItemIdentifier(identifiers[i]);
      RC_ASSERT(url.has_value());
      RC_ASSERT(url->path() == paths[i]);
      RC_ASSERT(itemIdentifier(*url) == identifiers[i]);
    }
    RC_ASSERT(std::set(identifiers.begin(), identifiers.end()).size() == identifiers.size());
  }));
}

TEST_F(IdentifierProperties, NumbersInIdentifiersAreReadBack) {
  EXPECT_TRUE(rc::check([](std::uint32_t number) {
    const DocumentID documentID{number};
    RC_ASSERT(ZubFileObjectIdentifier::documentIDIn(
                  ZubFileObjectIdentifier::fromDocumentID(documentID)) == documentID);
  }));
}

TEST_F(IdentifierProperties, NoTextCrashesTheParserOrLeadsOutOfTheStorage) {
  TestSystem system;
  system.tree.makeFolder("/elsewhere/a/b/c");
  system.tree.writeFile("/elsewhere/a.txt");
  system.folder("a/b");
  const std::vector<std::string> pieces = {"fid", "did", "=", "#", " ", "-", "+", "0", "1", "2",
                                           "3",   "4",   "5", "6", "7", "8", "9", "a", "\n"};
  EXPECT_TRUE(rc::check([&] {
    const auto chosen = *rc::gen::container<std::vector<std::string>>(rc::gen::elementOf(pieces));
    std::string identifier = *rc::gen::element(std::string(), std::string("fid="));
    for (const std::string& piece : chosen) identifier += piece;
    const auto url = fileURLWithItemIdentifier(identifier);
    if (url) RC_ASSERT(url->path().starts_with(TestSystem::kStorageRoot));
  }));
}

TEST_F(IdentifierProperties, ADocIDEventPathIsReadBack) {
  EXPECT_TRUE(rc::check([](std::uint32_t device, std::uint32_t document, std::uint64_t source,
                           std::uint64_t target) {
    const std::string path = "/.docid/" + std::to_string(device) + "/changed/" +
                             std::to_string(document) + "/src=" + std::to_string(source) +
                             ",dst=" + std::to_string(target);
    RC_ASSERT(parseDocIDEventPath(path) ==
              (DocIDEvent{DeviceID{device}, DocumentID{document}, FileID{source}, FileID{target}}));
  }));
}

}  // namespace
}  // namespace vantrell
