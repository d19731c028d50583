#pragma once

#include <sys/types.h>

#include <map>
#include <optional>
#include <string>
#include <vector>

namespace vantrell::integration {

/// How a program ended, and what it wrote.
struct Outcome {
  int status = -1;  ///< the exit status; 128 and the number of the signal that ended it
  std::string out;
  std::string err;
};

/// How to run a program.
struct Invocation {
  std::vector<std::string> words;  ///< the program, found along PATH, and its arguments
  std::map<std::string, std::string> environment;  ///< changes to this process's; "" takes away
  std::string folder;                              ///< to run in; empty: this one
  std::optional<uid_t> user{};                     ///< to run as; the caller must be the superuser
  std::optional<std::string> outputFile{};  ///< standard output goes there, and `out` stays empty
};

/// Runs the program with nothing on standard input and waits for its end.
Outcome run(const Invocation& invocation);

/// A program that is running; it is ended when this goes.
class RunningProgram {
 public:
  /// Standard output can be read through `output()`; standard error is thrown away.
  explicit RunningProgram(const Invocation& invocation);
  ~RunningProgram();
  RunningProgram(const RunningProgram&) = delete;
  RunningProgram& operator=(const RunningProgram&) = delete;

  pid_t pid() const { return _pid; }
  int output() const { return _output; }
  /// Closes the reading end, as `head` does when it has seen enough.
  void closeOutput();
  /// Waits for the end; as `Outcome::status`.
  int wait();
  /// The most memory that it had at once, in kilobytes; known once `wait` has returned.
  long peakKilobytes() const { return _peakKilobytes; }

 private:
  pid_t _pid = -1;
  int _output = -1;
  long _peakKilobytes = 0;
};

}  // namespace vantrell::integration
