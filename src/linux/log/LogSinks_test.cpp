#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/stat.h>
#include <syslog.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <thread>
#include <vector>

#include "linux/log/FileLogSink.h"
#include "linux/log/JournalLogSink.h"
#include "linux/log/LogText.h"
#include "linux/log/MakeLogSink.h"
#include "linux/log/StderrLogSink.h"
#include "tests/contracts/TemporaryFolder.h"

namespace vantrell::linuxos {
namespace {

using vantrell::testing::AsOrdinaryUser;
using vantrell::testing::TemporaryFolder;

class FixedClock : public Clock {
 public:
  FndDate now() override { return FndDate::fromUnixTime(1'000'000'000, 500'000'000); }
  void rest(std::chrono::microseconds) override {}
};

LogLine line(std::string_view text, LogLevel level = LogLevel::Error) {
  return {level, "com.quillon.Dochost", "vantrell", text};
}

std::string contents(const std::string& path) {
  std::ifstream file(path, std::ios::binary);
  std::ostringstream text;
  text << file.rdbuf();
  return text.str();
}

TEST(LogText, LevelsMapToSyslogPriorities) {
  EXPECT_EQ(syslogPriority(LogLevel::Debug), LOG_DEBUG);
  EXPECT_EQ(syslogPriority(LogLevel::Info), LOG_INFO);
  EXPECT_EQ(syslogPriority(LogLevel::Error), LOG_ERR);
}

TEST(LogText, ALineOfAFileHasDateLevelWriterAndText) {
  FixedClock clock;
  EXPECT_EQ(logFileLine(line("[ERROR] oh ┏0"), clock.now()),
            "2001-09-09T01:46:40.5Z error com.quillon.Dochost:vantrell [ERROR] oh ┏0\n");
}

TEST(LogText, ANameWithANewlineForgesNoLine) {
  FixedClock clock;
  const std::string text = logFileLine(line("a\nb\x1b[31m\xff"), clock.now());
  EXPECT_NE(text.find("a\\x0Ab\\x1B[31m\\xFF\n"), std::string::npos) << text;
}

TEST(JournalLogSink, FieldsCarryTextPriorityAndWriter) {
  EXPECT_EQ(journalFields(line("oh", LogLevel::Info)),
            (std::vector<std::string>{"MESSAGE=oh", "PRIORITY=6", "SYSLOG_IDENTIFIER=vantrell",
                                      "VANTRELL_SUBSYSTEM=com.quillon.Dochost",
                                      "VANTRELL_CATEGORY=vantrell"}));
}

TEST(FileLogSink, LinesAreAppendedToAFileThatOnlyTheUserMayRead) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  FileLogSink(path, clock).write(line("one"));
  FileLogSink(path, clock).write(line("two"));
  EXPECT_EQ(contents(path),
            logFileLine(line("one"), clock.now()) + logFileLine(line("two"), clock.now()));
  struct stat status;
  ASSERT_EQ(::stat(path.c_str(), &status), 0);
  EXPECT_EQ(status.st_mode & 0777U, 0600U);
}

TEST(FileLogSink, AFullFileIsKeptOnceAndANewOneBegun) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  const std::size_t size = logFileLine(line("n0"), clock.now()).size();
  FileLogSink sink(path, clock, 3 * size);
  for (int i = 0; i < 8; ++i) sink.write(line("n" + std::to_string(i)));
  EXPECT_NE(contents(path).find("n7"), std::string::npos);
  EXPECT_EQ(contents(path).find("n5"), std::string::npos);
  EXPECT_NE(contents(path + ".1").find("n3"), std::string::npos);
  EXPECT_NE(contents(path + ".1").find("n5"), std::string::npos);
  EXPECT_EQ(std::filesystem::file_size(path + ".1"), 3 * size);
  EXPECT_FALSE(std::filesystem::exists(path + ".2"));
}

TEST(FileLogSink, ALineLargerThanTheBoundIsWrittenAllTheSame) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  FileLogSink sink(path, clock, 100);
  sink.write(line(std::string(1000, 'x')));
  EXPECT_GT(std::filesystem::file_size(path), 1000U);
}

TEST(FileLogSink, TwoWritersOfOneFileRotateItTogether) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  const std::size_t size = logFileLine(line("a0"), clock.now()).size();
  FileLogSink a(path, clock, 4 * size);
  FileLogSink b(path, clock, 4 * size);
  for (int i = 0; i < 6; ++i) {
    (i % 2 == 0 ? a : b).write(line("a" + std::to_string(i)));
  }
  EXPECT_EQ(std::filesystem::file_size(path), 2 * size);
  EXPECT_EQ(std::filesystem::file_size(path + ".1"), 4 * size);
}

TEST(FileLogSink, ALogThatCannotBeWrittenIsTriedAgain) {
  const TemporaryFolder folder;
  FixedClock clock;
  FileLogSink sink(folder.path("sub/vantrell.log"), clock);
  sink.write(line("lost"));
  folder.makeFolder("sub");
  sink.write(line("kept"));
  const std::string text = contents(folder.path("sub/vantrell.log"));
  EXPECT_EQ(text.find("lost"), std::string::npos);
  EXPECT_NE(text.find("kept"), std::string::npos);
}

TEST(FileLogSink, AFullVolumeLosesLinesAndNothingElse) {
  FixedClock clock;
  const TemporaryFolder folder;
  folder.makeLink("vantrell.log", "/dev/full");
  FileLogSink throughLink(folder.path("vantrell.log"), clock);
  throughLink.write(line("not through a link"));
  FileLogSink full("/dev/full", clock);
  full.write(line("lost"));
  full.write(line("lost"));
  EXPECT_TRUE(std::filesystem::is_symlink(folder.path("vantrell.log")));
  EXPECT_TRUE(std::filesystem::is_character_file("/dev/full"));
}

TEST(FileLogSink, AWriteThatFailsLosesItsLineAndNothingElse) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  FileLogSink sink(path, clock);
  sink.write(line("before"));
  rlimit whole{};
  ASSERT_EQ(::getrlimit(RLIMIT_FSIZE, &whole), 0);
  const rlimit small{std::filesystem::file_size(path), whole.rlim_max};
  const auto oldHandler = std::signal(SIGXFSZ, SIG_IGN);
  ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &small), 0);
  sink.write(line("lost"));
  ASSERT_EQ(::setrlimit(RLIMIT_FSIZE, &whole), 0);
  std::signal(SIGXFSZ, oldHandler);
  sink.write(line("after"));
  EXPECT_EQ(contents(path),
            logFileLine(line("before"), clock.now()) + logFileLine(line("after"), clock.now()));
}

TEST(FileLogSink, AFifoInItsPlaceDoesNotBlock) {
  FixedClock clock;
  const TemporaryFolder folder;
  FileLogSink sink(folder.makeFifo("vantrell.log"), clock);
  sink.write(line("lost"));
  EXPECT_TRUE(std::filesystem::is_fifo(folder.path("vantrell.log")));
}

TEST(FileLogSink, AFileThatWasRemovedIsBegunAnew) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  FileLogSink sink(path, clock);
  sink.write(line("one"));
  ASSERT_TRUE(std::filesystem::remove(path));
  sink.write(line("two"));
  EXPECT_EQ(contents(path), logFileLine(line("two"), clock.now()));
}

TEST(FileLogSink, LinesOfManyThreadsStayWhole) {
  const TemporaryFolder folder;
  FixedClock clock;
  const std::string path = folder.path("vantrell.log");
  FileLogSink sink(path, clock);
  std::vector<std::thread> threads;
  for (int t = 0; t < 4; ++t) {
    threads.emplace_back([&sink] {
      for (int i = 0; i < 200; ++i) sink.write(line("same"));
    });
  }
  for (std::thread& thread : threads) thread.join();
  std::istringstream lines(contents(path));
  int count = 0;
  for (std::string text; std::getline(lines, text); ++count) {
    ASSERT_EQ(text + "\n", logFileLine(line("same"), clock.now()));
  }
  EXPECT_EQ(count, 800);
}

TEST(StderrLogSink, WritesTheTextAndNothingElse) {
  ::testing::internal::CaptureStderr();
  StderrLogSink().write(line("[ERROR] oh\nno"));
  EXPECT_EQ(::testing::internal::GetCapturedStderr(), "[ERROR] oh\\x0Ano\n");
}

TEST(MakeLogSink, StandardErrorIsBeforeTheJournalAndThatBeforeAFile) {
  const TemporaryFolder folder;
  const std::string socket = folder.makeSocket("socket");
  LogSinkChoice choice{
      .toStandardError = true, .stateFolder = folder.path(), .journalSocket = socket};
  EXPECT_EQ(logSinkKind(choice), LogSinkKind::StandardError);
  choice.toStandardError = false;
  EXPECT_EQ(logSinkKind(choice), LogSinkKind::Journal);
  choice.journalSocket = folder.path("none");
  EXPECT_EQ(logSinkKind(choice), LogSinkKind::File);
  choice.journalSocket = folder.writeFile("file");  // no socket: nobody listens
  EXPECT_EQ(logSinkKind(choice), LogSinkKind::File);
}

TEST(MakeLogSink, TheFileIsInTheStateFolder) {
  const TemporaryFolder folder;
  FixedClock clock;
  const LogSinkChoice choice{.stateFolder = folder.path(), .journalSocket = folder.path("none")};
  makeLogSink(choice, clock)->write(line("hello"));
  EXPECT_NE(contents(folder.path("vantrell.log")).find("hello"), std::string::npos);
}

}  // namespace
}  // namespace vantrell::linuxos
