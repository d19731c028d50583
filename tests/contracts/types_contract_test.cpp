#include "tests/contracts/ContractTest.h"

namespace vantrell::testing {
namespace {

class TypeRegistryContract : public ContractTest {
 protected:
  std::string typeOf(std::string_view name, FileKind kind) {
    return system().types().typeIdentifierForName(name, kind);
  }
  bool conforms(std::string_view type, std::string_view supertype) {
    return system().types().typeConformsTo(type, supertype);
  }
};

TEST_P(TypeRegistryContract, KindsAreToldApartWhateverTheName) {
  EXPECT_EQ(typeOf("a.txt", FileKind::Directory), kFolderTypeIdentifier);
  EXPECT_EQ(typeOf("a.txt", FileKind::SymbolicLink), kSymbolicLinkTypeIdentifier);
  EXPECT_EQ(typeOf("a.pouch", FileKind::SymbolicLink), kSymbolicLinkTypeIdentifier);
  for (const FileKind kind :
       {FileKind::Fifo, FileKind::Socket, FileKind::CharacterDevice, FileKind::BlockDevice}) {
    EXPECT_TRUE(typeOf("a.txt", kind).starts_with("inode/"));
  }
}

TEST_P(TypeRegistryContract, FilesHaveTypesByTheirNames) {
  EXPECT_EQ(typeOf("a.txt", FileKind::RegularFile), "text/plain");
  EXPECT_EQ(typeOf("a.md", FileKind::RegularFile), "text/markdown");
  EXPECT_EQ(typeOf("a.unknown", FileKind::RegularFile), kDataTypeIdentifier);
  EXPECT_EQ(typeOf("", FileKind::RegularFile), kDataTypeIdentifier);
}

TEST_P(TypeRegistryContract, AFolderWithADeclaredExtensionIsAPackage) {
  EXPECT_EQ(typeOf("a.pouch", FileKind::Directory), "org.example.pouch");
  EXPECT_EQ(typeOf("pouch", FileKind::Directory), kFolderTypeIdentifier);
}

TEST_P(TypeRegistryContract, PackagesConformToThePackageTypeAndNotToFolders) {
  EXPECT_TRUE(conforms("org.example.pouch", kPackageTypeIdentifier));
  EXPECT_FALSE(conforms("org.example.pouch", kFolderTypeIdentifier));
  EXPECT_FALSE(conforms(kFolderTypeIdentifier, kPackageTypeIdentifier));
}

TEST_P(TypeRegistryContract, ATypeConformsToItselfAndToAllAboveIt) {
  EXPECT_TRUE(conforms("text/markdown", "text/markdown"));
  EXPECT_TRUE(conforms("text/markdown", "text/plain"));
  EXPECT_TRUE(conforms("text/markdown", kDataTypeIdentifier));
  EXPECT_FALSE(conforms("text/plain", "text/markdown"));
  EXPECT_FALSE(conforms(kFolderTypeIdentifier, kDataTypeIdentifier));
  EXPECT_TRUE(conforms("any/unknown", "any/unknown"));
}

TEST_P(TypeRegistryContract, AnAliasCountsAsWhatItStandsFor) {
  EXPECT_TRUE(conforms("text/x-alias", "text/plain"));
  EXPECT_TRUE(conforms("text/markdown", "text/x-alias"));
  EXPECT_TRUE(conforms("text/x-alias", "text/markdown"));
}

TEST_P(TypeRegistryContract, ATypeWithoutADescriptionIsItsOwn) {
  EXPECT_EQ(system().types().descriptionOfType("any/unknown"), "any/unknown");
}

VANTRELL_CONTRACT(TypeRegistryContract);

}  // namespace
}  // namespace vantrell::testing
