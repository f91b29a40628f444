// The command line of velkhost.
#pragma once

namespace velkhost::cli {

// Does what the arguments ask for; the exit code.
int run_command_line(int argc, char **argv);

}  // namespace velkhost::cli
