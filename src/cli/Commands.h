#pragma once

#include "cli/Arguments.h"
#include "cli/Output.h"
#include "cli/Reporter.h"

namespace vantrell::cli {

/// Starts the host, does what the arguments ask for, and shuts the host down. Returns the
/// program's exit status; what went wrong has been reported by then.
int runCommand(const Arguments& arguments, Output& output, const Reporter& reporter);

}  // namespace vantrell::cli
