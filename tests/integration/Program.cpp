#include "Program.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <stdexcept>

namespace vantrell::integration {
namespace {

struct Pipe {
  Pipe() {
    std::array<int, 2> ends;
    if (::pipe2(ends.data(), O_CLOEXEC) != 0) throw std::runtime_error("no pipe");
    reader = ends[0];
    writer = ends[1];
  }
  int reader;
  int writer;
};

void becomeUser(uid_t user) {
  if (::setgid(static_cast<gid_t>(user)) != 0 || ::setuid(user) != 0) ::_exit(126);
}

// Runs in the child, after fork: the test programs have one thread at that point.
[[noreturn]] void become(const Invocation& invocation, int out, int err) {
  const int in = ::open("/dev/null", O_RDONLY);
  ::dup2(in, 0);
  ::dup2(out, 1);
  ::dup2(err, 2);
  if (!invocation.folder.empty() && ::chdir(invocation.folder.c_str()) != 0) ::_exit(126);
  for (const auto& [name, value] : invocation.environment) {
    if (value.empty()) {
      ::unsetenv(name.c_str());
    } else {
      ::setenv(name.c_str(), value.c_str(), 1);
    }
  }
  if (invocation.user) becomeUser(*invocation.user);
  std::vector<char*> words;
  for (const std::string& word : invocation.words) words.push_back(const_cast<char*>(word.c_str()));
  words.push_back(nullptr);
  ::execvp(words.front(), words.data());
  ::_exit(127);
}

pid_t start(const Invocation& invocation, int out, int err) {
  const pid_t child = ::fork();
  if (child < 0) throw std::runtime_error("no fork");
  if (child == 0) become(invocation, out, err);
  return child;
}

// Appends what can be read now; false at the end.
bool readInto(std::string& text, int descriptor) {
  std::array<char, 65536> buffer;
  const ssize_t count = ::read(descriptor, buffer.data(), buffer.size());
  if (count <= 0) return false;
  text.append(buffer.data(), static_cast<std::size_t>(count));
  return true;
}

void readBoth(Outcome& outcome, int out, int err) {
  std::array<pollfd, 2> sources = {{{out, POLLIN, 0}, {err, POLLIN, 0}}};
  int open = 2;
  while (open > 0 && ::poll(sources.data(), sources.size(), -1) >= 0) {
    for (pollfd& source : sources) {
      if (source.revents == 0) continue;
      if (readInto(source.fd == out ? outcome.out : outcome.err, source.fd)) continue;
      source.fd = -1;
      --open;
    }
  }
}

int endOf(pid_t child, rusage& usage) {
  int status = 0;
  if (::wait4(child, &status, 0, &usage) != child) throw std::runtime_error("no child");
  return WIFEXITED(status) ? WEXITSTATUS(status) : 128 + WTERMSIG(status);
}

}  // namespace

Outcome run(const Invocation& invocation) {
  const Pipe out;
  const Pipe err;
  int target = out.writer;
  if (invocation.outputFile) {
    target = ::open(invocation.outputFile->c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600);
    if (target < 0) throw std::runtime_error("cannot write " + *invocation.outputFile);
    ::close(out.writer);
  }
  const pid_t child = start(invocation, target, err.writer);
  ::close(target);
  ::close(err.writer);
  Outcome outcome;
  readBoth(outcome, out.reader, err.reader);
  ::close(out.reader);
  ::close(err.reader);
  rusage usage;
  outcome.status = endOf(child, usage);
  return outcome;
}

RunningProgram::RunningProgram(const Invocation& invocation) {
  const Pipe out;
  const int nowhere = ::open("/dev/null", O_WRONLY | O_CLOEXEC);
  _pid = start(invocation, out.writer, nowhere);
  ::close(out.writer);
  ::close(nowhere);
  _output = out.reader;
}

RunningProgram::~RunningProgram() {
  closeOutput();
  if (_pid < 0) return;
  ::kill(_pid, SIGKILL);
  wait();
}

void RunningProgram::closeOutput() {
  if (_output >= 0) ::close(_output);
  _output = -1;
}

int RunningProgram::wait() {
  rusage usage;
  const int status = endOf(_pid, usage);
  _peakKilobytes = usage.ru_maxrss;
  _pid = -1;
  return status;
}

}  // namespace vantrell::integration
