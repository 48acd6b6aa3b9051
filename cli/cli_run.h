#pragma once
// Runs one parsed command: port set-up, the module session where the command
// needs one, the result on standard output and the exit status.

#include "cli/cli_args.h"

namespace kv::cli {

enum ExitStatus { ExitSuccess = 0, ExitFailure = 1, ExitUsage = 2 };

int RunCommand(const CliRequest& request);

}  // namespace kv::cli
