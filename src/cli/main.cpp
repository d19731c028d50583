#include <fcntl.h>
#include <unistd.h>

#include <csignal>
#include <cstdio>
#include <exception>
#include <string>
#include <variant>
#include <vector>

#include "cli/Arguments.h"
#include "cli/Commands.h"

namespace {

using namespace vantrell::cli;

// A caller may have closed one of the three. The next file to be opened would get its number, and
// results would be written into that file: something that cannot be written to takes its place.
void keepStandardDescriptors() {
  for (const int descriptor : {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}) {
    if (::fcntl(descriptor, F_GETFD) < 0) (void)!::open("/dev/null", O_PATH);
  }
}

int runProgram(const std::vector<std::string>& words) {
  Output output(STDOUT_FILENO);
  const auto parsed = parseArguments(words);
  if (const auto* arguments = std::get_if<Arguments>(&parsed)) {
    return runCommand(*arguments, output, Reporter(arguments->json));
  }
  const auto& nothing = std::get<NothingToRun>(parsed);
  const Reporter reporter(nothing.json);
  if (nothing.status == kStatusDone) {
    output.append(nothing.text);
    if (output.flush()) return kStatusDone;
    return kStatusFailed;
  }
  reporter.wrongUsage(nothing.text);
  return nothing.status;
}

}  // namespace

int main(int argc, char** argv) {
  keepStandardDescriptors();
  // A reader who has seen enough is told apart from an error where the output is written; the
  // signal would end the program before the state folder is left in order.
  std::signal(SIGPIPE, SIG_IGN);
  try {
    return runProgram(argc > 1 ? std::vector<std::string>(argv + 1, argv + argc)
                               : std::vector<std::string>());
  } catch (const std::exception& exception) {
    // Nothing here throws on purpose: it is out of memory, most likely.
    std::fprintf(stderr, "vantrell: %s\n", exception.what());
    return kStatusFailed;
  }
}
