#include "linux/filesystem/LinuxExtendedAttributes.h"

#include <gtest/gtest.h>
#include <sys/xattr.h>

#include <array>
#include <cerrno>

#include "tests/contracts/TemporaryFolder.h"

namespace vantrell::linuxos {
namespace {

// Both ways of reading run on every kernel that has both.
class LinuxExtendedAttributesTest : public ::testing::TestWithParam<AttributeReading> {
 protected:
  static FndURL url(const std::string& path) { return FndURL::fileURLWithPath(path); }
  static void set(const std::string& path, const std::string& name, const std::string& value) {
    ASSERT_EQ(::setxattr(path.c_str(), name.c_str(), value.data(), value.size(), 0), 0);
  }
  std::string read(const std::string& path, std::string_view name) {
    const auto size = _attributes.sizeOfAttribute(url(path), name);
    if (!size) return size.error().description();
    FndData value(*size);
    const auto copied = _attributes.copyAttribute(url(path), name, value);
    if (!copied) return copied.error().description();
    return std::string(value.begin(), value.begin() + static_cast<std::ptrdiff_t>(*copied));
  }
  LinuxExtendedAttributes& attributes() { return _attributes; }
  const vantrell::testing::TemporaryFolder& folder() const { return _folder; }

 private:
  vantrell::testing::TemporaryFolder _folder;
  LinuxExtendedAttributes _attributes{GetParam()};
};

TEST_P(LinuxExtendedAttributesTest, ReadsFromTheUsersNamespace) {
  const std::string path = folder().writeFile("file");
  set(path, "user.com.quillon.x#PS", "value");
  EXPECT_EQ(read(path, "com.quillon.x#PS"), "value");
  EXPECT_NE(read(path, "user.com.quillon.x#PS"), "value");
}

TEST_P(LinuxExtendedAttributesTest, ReadsAFoldersAttributes) {
  const std::string path = folder().makeFolder("sub");
  set(path, "user.a", "1");
  EXPECT_EQ(read(path, "a"), "1");
}

TEST_P(LinuxExtendedAttributesTest, AnEmptyValueHasSizeZero) {
  const std::string path = folder().writeFile("file");
  set(path, "user.a", "");
  EXPECT_EQ(*attributes().sizeOfAttribute(url(path), "a"), 0U);
  EXPECT_EQ(*attributes().copyAttribute(url(path), "a", {}), 0U);
}

TEST_P(LinuxExtendedAttributesTest, NoSuchAttributeIsENODATA) {
  const std::string path = folder().writeFile("file");
  EXPECT_TRUE(attributes().sizeOfAttribute(url(path), "a").error().isPosix(ENODATA));
  std::array<std::uint8_t, 4> buffer;
  EXPECT_TRUE(attributes().copyAttribute(url(path), "a", buffer).error().isPosix(ENODATA));
}

TEST_P(LinuxExtendedAttributesTest, NoSuchFileIsENOENT) {
  const auto size = attributes().sizeOfAttribute(url(folder().path("none")), "a");
  EXPECT_TRUE(size.error().isPosix(ENOENT));
}

TEST_P(LinuxExtendedAttributesTest, ALinkAtTheEndIsNotFollowed) {
  const std::string path = folder().writeFile("file");
  set(path, "user.a", "1");
  const std::string link = folder().makeLink("link", path);
  EXPECT_TRUE(attributes().sizeOfAttribute(url(link), "a").error().isPosix(ENODATA));
}

TEST_P(LinuxExtendedAttributesTest, ALinkInThePathIsRefused) {
  folder().makeFolder("real");
  set(folder().writeFile("real/file"), "user.a", "1");
  folder().makeLink("link", folder().path("real"));
  const auto size = attributes().sizeOfAttribute(url(folder().path("link/file")), "a");
  EXPECT_TRUE(size.error().isPosix(ELOOP)) << size.error().description();
}

TEST_P(LinuxExtendedAttributesTest, AValueThatHasGrownIsNotCutOff) {
  const std::string path = folder().writeFile("file");
  set(path, "user.a", "12345");
  std::array<std::uint8_t, 4> buffer;
  EXPECT_TRUE(attributes().copyAttribute(url(path), "a", buffer).error().isPosix(ERANGE));
  EXPECT_TRUE(attributes().copyAttribute(url(path), "a", {}).error().isPosix(ERANGE));
}

TEST_P(LinuxExtendedAttributesTest, OddNamesOfFilesAreReadLikeAnyOther) {
  for (const std::string& name : {std::string(255, 'n'), std::string("\xff\xfe bad"),
                                  std::string("new\nline"), std::string("%2F")}) {
    const std::string path = folder().writeFile(name);
    set(path, "user.a", "1");
    EXPECT_EQ(read(path, "a"), "1") << name;
  }
}

TEST_P(LinuxExtendedAttributesTest, ANameThatNoAttributeCanHaveIsRefused) {
  const std::string path = folder().writeFile("file");
  for (const std::string& name : {std::string(), std::string("a\0b", 3)}) {
    EXPECT_TRUE(attributes().sizeOfAttribute(url(path), name).error().isPosix(EINVAL));
  }
}

TEST_P(LinuxExtendedAttributesTest, AURLOfAnotherSchemeIsRefused) {
  const auto web = FndURL::URLWithString("https://example.org/file");
  EXPECT_TRUE(attributes().sizeOfAttribute(*web, "a").error().isPosix(EINVAL));
}

std::vector<AttributeReading> readingsOfThisKernel() {
  if (bestAttributeReading() == AttributeReading::ThroughProc) {
    return {AttributeReading::ThroughProc};
  }
  return {AttributeReading::RelativeCall, AttributeReading::ThroughProc};
}

INSTANTIATE_TEST_SUITE_P(Reading, LinuxExtendedAttributesTest,
                         ::testing::ValuesIn(readingsOfThisKernel()), [](const auto& param) {
                           return param.param == AttributeReading::RelativeCall ? "RelativeCall"
                                                                                : "ThroughProc";
                         });

}  // namespace
}  // namespace vantrell::linuxos
