#include "host/cli/command_line.h"

int main(int argc, char **argv) {
    return velkhost::cli::run_command_line(argc, argv);
}
