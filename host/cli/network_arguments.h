// The arguments of `velkhost network`.
#pragma once

#include "host/cli/network_options.h"

#include <string>

// NOLINTNEXTLINE(readability-identifier-naming): as the library calls it
namespace CLI {
class App;
}  // namespace CLI

namespace velkhost::cli {

class NetworkArguments {
  public:
    explicit NetworkArguments(CLI::App &app);

    // Whether the command line names the command.
    [[nodiscard]] bool parsed() const;

    [[nodiscard]] NetworkOptions options() const;

  private:
    CLI::App *command_;
    std::string scenario_;
    std::string root_;
    std::string configure_ = "no";
    std::string clock_ = "virtual";
    bool json_ = false;
};

}  // namespace velkhost::cli
