// The arguments of `velkhost serve`.
#pragma once

#include "host/cli/serve_options.h"

namespace CLI {
class App;
class Option;
}  // namespace CLI

namespace velkhost::cli {

class ServeArguments {
  public:
    explicit ServeArguments(CLI::App &app);

    // Whether the command line names the command.
    [[nodiscard]] bool parsed() const;

    [[nodiscard]] ServeOptions options() const;

  private:
    CLI::App *command_;
    ServeOptions options_;
    std::string scenario_;
    std::string root_;
    std::string user_;
    std::string password_file_;
    std::string clock_ = "virtual";
};

}  // namespace velkhost::cli
