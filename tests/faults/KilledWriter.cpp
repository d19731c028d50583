#include "KilledWriter.h"

#include <fcntl.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <csignal>
#include <cstdlib>
#include <ctime>
#include <functional>
#include <limits>

#include "CatalogWriter.h"
#include "linux/FileDescriptor.h"

namespace vantrell::faults {
namespace {

using linuxos::FileDescriptor;

/// From now on, in real time: a process that waits for the disk is killed as well.
void arrangeDeath(std::chrono::microseconds lifetime) {
  sigevent event{};
  event.sigev_notify = SIGEV_SIGNAL;
  event.sigev_signo = SIGKILL;
  timer_t timer{};
  itimerspec time{};
  time.it_value.tv_sec = lifetime.count() / 1'000'000;
  time.it_value.tv_nsec = lifetime.count() % 1'000'000 * 1000 + 1;
  if (::timer_create(CLOCK_MONOTONIC, &event, &timer) != 0) std::abort();
  if (::timer_settime(timer, 0, &time, nullptr) != 0) std::abort();
}

/// All that can be read; `heard` is told after each piece.
std::string readToEnd(int fd, const std::function<void(const std::string&)>& heard) {
  std::string text;
  std::array<char, 4096> buffer{};
  while (true) {
    const ssize_t count = ::read(fd, buffer.data(), buffer.size());
    if (count <= 0) return text;
    text.append(buffer.data(), static_cast<std::size_t>(count));
    heard(text);
  }
}

/// Runs `child` in a process of its own, with the descriptor that its reports go to, until it
/// ends, or until there are that many reports.
WriterEnd inChild(const std::function<void(int)>& child,
                  std::size_t enoughReports = std::numeric_limits<std::size_t>::max()) {
  std::array<int, 2> ends{};
  if (::pipe2(ends.data(), O_CLOEXEC) != 0) std::abort();
  const FileDescriptor readEnd(ends[0]);
  FileDescriptor writeEnd(ends[1]);
  const pid_t process = ::fork();
  if (process < 0) std::abort();
  if (process == 0) {
    child(writeEnd.get());
    ::_exit(127);
  }
  writeEnd = FileDescriptor();
  WriterEnd end;
  end.reports = readToEnd(readEnd.get(), [&](const std::string& text) {
    const auto reports = static_cast<std::size_t>(std::ranges::count(text, '\n'));
    if (reports >= enoughReports) ::kill(process, SIGKILL);
  });
  int status = 0;
  if (::waitpid(process, &status, 0) != process) std::abort();
  end.wasKilled = WIFSIGNALED(status) && WTERMSIG(status) == SIGKILL;
  end.exitStatus = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
  return end;
}

void workWithoutEnd(const WriterWork& work, int reports) {
  CatalogWriter writer(work.root, work.state, reports, work.seed);
  ::_exit(writer.work(std::numeric_limits<int>::max()) ? 0 : 1);
}

}  // namespace

WriterEnd runWriterUntilKilled(const WriterWork& work, std::chrono::microseconds lifetime) {
  return inChild([&](int reports) {
    arrangeDeath(lifetime);
    workWithoutEnd(work, reports);
  });
}

WriterEnd runWriterForReports(const WriterWork& work, std::size_t reports) {
  return inChild([&](int descriptor) { workWithoutEnd(work, descriptor); }, reports);
}

WriterEnd runProgram(const std::vector<std::string>& arguments) {
  return inChild([&](int reports) {
    std::vector<char*> words;
    for (const std::string& argument : arguments) {
      words.push_back(const_cast<char*>(argument.c_str()));
    }
    words.push_back(nullptr);
    if (::dup2(reports, STDOUT_FILENO) < 0) return;
    ::execvp(words.front(), words.data());
  });
}

}  // namespace vantrell::faults
