#pragma once

#include <chrono>
#include <cstdint>
#include <string>
#include <vector>

namespace vantrell::faults {

/// How a writer came to its end.
struct WriterEnd {
  std::string reports;     ///< every line it wrote, the last one perhaps cut off
  bool wasKilled = false;  ///< by SIGKILL
  int exitStatus = 0;      ///< when it was not
};

/// What a writer works on.
struct WriterWork {
  std::string root;
  std::string state;
  std::uint64_t seed = 0;
};

/// Runs a `CatalogWriter` without end in a process of its own, which the kernel kills after that
/// time of its life, wherever it is then.
WriterEnd runWriterUntilKilled(const WriterWork& work, std::chrono::microseconds lifetime);

/// The same, but it is killed once it has written that many reports; it goes on meanwhile.
WriterEnd runWriterForReports(const WriterWork& work, std::size_t reports);

/// Runs a program to its end and collects what it writes on its standard output.
WriterEnd runProgram(const std::vector<std::string>& arguments);

}  // namespace vantrell::faults
