#include "linux/catalog/Names.h"

#include <gtest/gtest.h>

namespace vantrell::linuxos::catalog {
namespace {

TEST(Names, BackupAndTemporaryNamesAreSetAside) {
  for (const char* name : {"a~", "~a", "~", "#a#", ".a", ".a.swp", "a.bak", "a.orig", "a.old",
                           "a.tmp", "a.temp", "a.sav", "a.BAK", "a.Tmp", ".bak"}) {
    EXPECT_TRUE(isSetAsideName(name)) << name;
  }
}

TEST(Names, OtherNamesAreOrdinary) {
  for (const char* name : {"a", "a.txt", "bak", "old", "#a", "a#", "#", "a~b", "a.bak.txt",
                           "a.bakery", "\xff\xfe", "a b"}) {
    EXPECT_FALSE(isSetAsideName(name)) << name;
  }
  EXPECT_FALSE(isSetAsideName(""));
}

}  // namespace
}  // namespace vantrell::linuxos::catalog
