#include "host/cli/serve_arguments.h"

#include <CLI/CLI.hpp>

namespace velkhost::cli {
namespace {

constexpr const char *kFooter = R"(Exit codes:
  0  told to end by a signal, with nothing left to do
  1  told to end while an installation was still at work
  2  the command line is wrong
  4  the host could not be set up, the address cannot be listened on, or the
     broker found its objects misused

The first signal (Ctrl-C, SIGTERM, SIGHUP) lets what is under way end within
the grace; the second one does not.

A virtual clock goes with the machine's while nothing happens. While a request
is answered or packages are installed, pauses are leapt over.)";

std::optional<std::string> if_given(const std::string &text) {
    return text.empty() ? std::nullopt : std::optional(text);
}

}  // namespace

ServeArguments::ServeArguments(CLI::App &app)
    : command_(
          app.add_subcommand("serve", "Serve the host to WBEM clients, by CIM-XML over HTTP")) {
    command_->footer(kFooter);
    command_
        ->add_option("--listen", options_.listen,
                     "Address and port; port 0 is one that is free, and is told")
        ->capture_default_str();
    command_->add_option("--scenario", scenario_, "What the host has and how it behaves (TOML)");
    command_->add_option("--clock", clock_, "The host's clock: virtual or real")
        ->capture_default_str()
        ->check(CLI::IsMember({"virtual", "real"}));
    command_
        ->add_option("--speed", options_.speed,
                     "Seconds that a virtual clock leaps in one of the machine's, at most")
        ->capture_default_str()
        ->check(CLI::Range(std::int64_t{1}, std::int64_t{1'000'000}));
    command_->add_option("--user", user_, "Ask clients for this name and a password");
    command_->add_option("--password-file", password_file_,
                         "File whose first line is the password; nobody else may read it");
    command_->add_option("--root", root_, "Run folder to use and keep (default: a temporary one)");
    command_
        ->add_option("--grace", options_.grace_s,
                     "Seconds for what is under way when a signal comes")
        ->capture_default_str()
        ->check(CLI::Range(0, 3600));
}

bool ServeArguments::parsed() const {
    return command_->parsed();
}

ServeOptions ServeArguments::options() const {
    ServeOptions result = options_;
    result.scenario = if_given(scenario_);
    result.root = if_given(root_);
    result.user = if_given(user_);
    result.password_file = if_given(password_file_);
    result.virtual_clock = clock_ == "virtual";
    return result;
}

}  // namespace velkhost::cli
