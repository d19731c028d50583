// A folder of a million entries.

#include <fcntl.h>
#include <gmock/gmock.h>
#include <unistd.h>

#include <array>
#include <cstdio>

#include "VantrellTest.h"

namespace vantrell::integration {
namespace {

constexpr int kEntries = 1'000'000;

class LargeFolder : public VantrellTest {
 protected:
  void fill(const std::string& folder, int count) {
    makeFolder(folder);
    const int descriptor = ::open(path(folder).c_str(), O_PATH | O_CLOEXEC);
    for (int i = 0; i < count; ++i) {
      const std::string name = "entry" + std::to_string(i);
      const int file = ::openat(descriptor, name.c_str(), O_WRONLY | O_CREAT | O_CLOEXEC, 0600);
      ASSERT_GE(file, 0) << name;
      ::close(file);
    }
    ::close(descriptor);
  }

  struct Listing {
    int status = -1;
    int lines = 0;
    long peakKilobytes = 0;
  };

  // Lists the folder and counts the lines as they come, keeping none.
  Listing list(const std::string& folder) {
    Listing listing;
    RunningProgram program(invocation({"--json", "ls", folder}));
    std::array<char, 65536> buffer;
    for (ssize_t count; (count = ::read(program.output(), buffer.data(), buffer.size())) > 0;) {
      for (ssize_t i = 0; i < count; ++i)
        listing.lines += buffer[static_cast<std::size_t>(i)] == '\n';
    }
    listing.status = program.wait();
    listing.peakKilobytes = program.peakKilobytes();
    return listing;
  }
};

TEST_F(LargeFolder, AMillionEntriesAreListedInFlatMemory) {
  fill("small", 20'000);
  fill("large", kEntries);
  ASSERT_EQ(vantrell({"ls", "small", "--print0"}).status, 0);  // everything is looked at once
  const Listing small = list("small");
  const Listing large = list("large");
  EXPECT_EQ(small.status, 0);
  EXPECT_EQ(large.status, 0);
  EXPECT_EQ(small.lines, 20'000);
  EXPECT_EQ(large.lines, kEntries);
  std::printf("peak memory: %ld kB for 20,000 entries, %ld kB for 1,000,000\n", small.peakKilobytes,
              large.peakKilobytes);
  // Both commands look at the same storage when they start; what is over is the listing's.
  EXPECT_LT(large.peakKilobytes - small.peakKilobytes, 8 * 1024);
}

}  // namespace
}  // namespace vantrell::integration
