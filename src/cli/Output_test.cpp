#include "cli/Output.h"

#include <fcntl.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <array>
#include <cerrno>
#include <csignal>

#include "linux/FileDescriptor.h"

namespace vantrell::cli {
namespace {

using linuxos::FileDescriptor;

class OutputTest : public testing::Test {
 protected:
  void SetUp() override {
    std::signal(SIGPIPE, SIG_IGN);
    std::array<int, 2> ends;
    ASSERT_EQ(::pipe2(ends.data(), O_CLOEXEC), 0);
    _reader = FileDescriptor(ends[0]);
    _writer = FileDescriptor(ends[1]);
  }

  std::string readSome() {
    std::array<char, 100> buffer;
    const ssize_t count = ::read(_reader.get(), buffer.data(), buffer.size());
    return count < 0 ? "" : std::string(buffer.data(), static_cast<std::size_t>(count));
  }

  FileDescriptor _reader;
  FileDescriptor _writer;
};

TEST_F(OutputTest, WhatIsCollectedIsWrittenOnce) {
  Output output(_writer.get());
  output.append("one ");
  output.append("two");
  ASSERT_TRUE(output.flush());
  ASSERT_TRUE(output.flush());
  _writer = FileDescriptor();
  EXPECT_EQ(readSome(), "one two");
  EXPECT_EQ(readSome(), "");
}

TEST_F(OutputTest, AReaderWhoHasGoneIsNoError) {
  Output output(_writer.get());
  _reader = FileDescriptor();
  EXPECT_TRUE(output.isWanted());
  output.append("unheard");
  EXPECT_TRUE(output.flush());
  EXPECT_FALSE(output.isWanted());
  output.append("more");
  EXPECT_TRUE(output.flush());
}

TEST_F(OutputTest, AFullDiskIsAnError) {
  const FileDescriptor full(::open("/dev/full", O_WRONLY | O_CLOEXEC));
  ASSERT_TRUE(full);
  Output output(full.get());
  output.append("text");
  const auto written = output.flush();
  ASSERT_FALSE(written);
  EXPECT_TRUE(written.error().isPosix(ENOSPC));
}

TEST_F(OutputTest, APipeIsNoTerminal) { EXPECT_FALSE(Output(_writer.get()).isTerminal()); }

}  // namespace
}  // namespace vantrell::cli
