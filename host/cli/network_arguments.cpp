#include "host/cli/network_arguments.h"

#include <CLI/CLI.hpp>

namespace velkhost::cli {
namespace {

constexpr const char *kFooter = R"(Exit codes:
  0    the table is shown
  1    there is no usable table, or nobody configured the network in time
  2    the command line is wrong
  4    the host could not be set up
  130  ended by Ctrl-C; nothing is left behind (143: SIGTERM, 129: SIGHUP)

A mapping that cannot be used is deleted, so that the host makes another.)";

std::optional<std::string> if_given(const std::string &text) {
    return text.empty() ? std::nullopt : std::optional(text);
}

}  // namespace

NetworkArguments::NetworkArguments(CLI::App &app)
    : command_(app.add_subcommand("network", "Show the table of the in-band network's nodes")) {
    command_->footer(kFooter);
    command_->add_option("--scenario", scenario_, "What the host has and how it behaves (TOML)");
    command_->add_option("--root", root_, "Run folder to use and keep (default: a temporary one)");
    command_
        ->add_option("--configure", configure_,
                     "Have the network configured anew before: no, if-old (the table is 15 "
                     "minutes old), or always")
        ->capture_default_str()
        ->check(CLI::IsMember({"no", "if-old", "always"}));
    command_->add_option("--clock", clock_, "The host's clock: virtual or real")
        ->capture_default_str()
        ->check(CLI::IsMember({"virtual", "real"}));
    command_->add_flag("--json", json_, "One JSON document instead of everything else");
}

bool NetworkArguments::parsed() const {
    return command_->parsed();
}

NetworkOptions NetworkArguments::options() const {
    NetworkOptions result;
    result.scenario = if_given(scenario_);
    result.root = if_given(root_);
    result.virtual_clock = clock_ == "virtual";
    result.json = json_;
    if (configure_ != "no") {
        result.configure = configure_ == "always" ? Configure::kAlways : Configure::kIfOld;
    }
    return result;
}

}  // namespace velkhost::cli
