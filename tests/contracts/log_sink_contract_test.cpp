#include <gtest/gtest.h>

#include <fstream>
#include <functional>
#include <memory>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

#include "linux/filesystem/SystemClock.h"
#include "linux/log/FileLogSink.h"
#include "linux/log/StderrLogSink.h"
#include "tests/contracts/TemporaryFolder.h"
#include "tests/fakes/FakeLogSink.h"

namespace vantrell::testing {
namespace {

/// A sink, and what has come out of it so far, one text a line.
class SinkEnvironment {
 public:
  virtual ~SinkEnvironment() = default;
  virtual LogSink& sink() = 0;
  /// Ends the recording.
  virtual std::vector<std::string> written() = 0;
};

std::vector<std::string> linesOf(std::istream& stream) {
  std::vector<std::string> lines;
  for (std::string line; std::getline(stream, line);) lines.push_back(line);
  return lines;
}

class FileEnvironment : public SinkEnvironment {
 public:
  LogSink& sink() override { return _sink; }
  std::vector<std::string> written() override {
    std::ifstream file(_folder.path("log"), std::ios::binary);
    return linesOf(file);
  }

 private:
  TemporaryFolder _folder;
  linuxos::SystemClock _clock;
  linuxos::FileLogSink _sink{_folder.path("log"), _clock};
};

class StderrEnvironment : public SinkEnvironment {
 public:
  StderrEnvironment() { ::testing::internal::CaptureStderr(); }
  ~StderrEnvironment() override {
    if (_captures) ::testing::internal::GetCapturedStderr();
  }
  LogSink& sink() override { return _sink; }
  std::vector<std::string> written() override {
    _captures = false;
    std::istringstream text(::testing::internal::GetCapturedStderr());
    return linesOf(text);
  }

 private:
  bool _captures = true;
  linuxos::StderrLogSink _sink;
};

class FakeSinkEnvironment : public SinkEnvironment {
 public:
  LogSink& sink() override { return _sink; }
  std::vector<std::string> written() override { return _sink.texts(); }

 private:
  FakeLogSink _sink;
};

struct SinkMaker {
  std::string name;
  std::function<std::unique_ptr<SinkEnvironment>()> make;
};

class LogSinkContract : public ::testing::TestWithParam<SinkMaker> {
 protected:
  void write(std::string_view text, LogLevel level = LogLevel::Error) {
    sink().write({level, "com.quillon.Dochost", "vantrell", text});
  }
  LogSink& sink() { return _environment->sink(); }
  std::vector<std::string> written() { return _environment->written(); }

 private:
  std::unique_ptr<SinkEnvironment> _environment = GetParam().make();
};

TEST_P(LogSinkContract, LinesComeOutWholeAndInOrder) {
  write("[DEBUG] ┏0 first", LogLevel::Debug);
  write("[INFO] second", LogLevel::Info);
  write("", LogLevel::Error);
  write("[ERROR] last");
  const auto lines = written();
  ASSERT_EQ(lines.size(), 4U);
  EXPECT_TRUE(lines[0].ends_with("[DEBUG] ┏0 first"));
  EXPECT_TRUE(lines[1].ends_with("[INFO] second"));
  EXPECT_TRUE(lines[3].ends_with("[ERROR] last"));
}

TEST_P(LogSinkContract, TheRecordedLevelIsTheLeastThatIsKept) {
  sink().setRecordedLevel(LogLevel::Info);
  EXPECT_FALSE(sink().records(LogLevel::Debug));
  EXPECT_TRUE(sink().records(LogLevel::Info));
  sink().setRecordedLevel(LogLevel::Debug);
  EXPECT_TRUE(sink().records(LogLevel::Debug));
  sink().setRecordedLevel(LogLevel::Error);
  EXPECT_FALSE(sink().records(LogLevel::Info));
}

TEST_P(LogSinkContract, ManyThreadsMayWriteAtOnce) {
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([this] {
      for (int i = 0; i < 100; ++i) write("the same text");
    });
  }
  for (std::thread& thread : threads) thread.join();
  const auto lines = written();
  EXPECT_EQ(lines.size(), 400U);
  for (const std::string& line : lines) ASSERT_TRUE(line.ends_with("the same text")) << line;
}

TEST_P(LogSinkContract, AVeryLongLineIsNoHarm) {
  write(std::string(1'000'000, 'x'));
  write("after");
  const auto lines = written();
  ASSERT_EQ(lines.size(), 2U);
  EXPECT_GE(lines[0].size(), 1'000'000U);
  EXPECT_TRUE(lines[1].ends_with("after"));
}

INSTANTIATE_TEST_SUITE_P(
    On, LogSinkContract,
    ::testing::Values(SinkMaker{"File", [] { return std::make_unique<FileEnvironment>(); }},
                      SinkMaker{"StandardError",
                                [] { return std::make_unique<StderrEnvironment>(); }},
                      SinkMaker{"Fake", [] { return std::make_unique<FakeSinkEnvironment>(); }}),
    [](const auto& instance) { return instance.param.name; });

}  // namespace
}  // namespace vantrell::testing
