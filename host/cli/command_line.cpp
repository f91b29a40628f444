#include "host/cli/command_line.h"

#include "host/cli/install_command.h"
#include "host/cli/network_arguments.h"
#include "host/cli/network_command.h"
#include "host/cli/report.h"
#include "host/cli/serve_arguments.h"
#include "host/cli/serve_command.h"

#include <fmt/format.h>
#include <CLI/CLI.hpp>

#include <csignal>
#include <cstdio>

namespace velkhost::cli {
namespace {

constexpr const char *kFooter = R"(Exit codes:
  0    every package succeeded (code 50, or 59: nothing left to do)
  1    a package was not installed, or the limit was reached
  2    the command line is wrong
  3    the request was refused
  4    the host could not be set up, a fault of the scenario never struck, or
       the broker found its objects misused
  130  ended by Ctrl-C; nothing is left behind (143: SIGTERM, 129: SIGHUP)

With the virtual clock pauses take no time but are counted: hours pass in a
blink, and every run of a scenario is the same.)";

// The arguments that need more than CLI11's own conversions.
struct Raw {
    std::vector<std::string> uris;
    std::string scenario;
    std::string options;
    std::string update_args;
    std::string clock = "virtual";
    std::string root;
    std::string limit = "24h";
};

class CommandLine {
  public:
    CommandLine() {
        app_.require_subcommand(1);
        app_.set_version_flag("--version", "velkhost " VELKHOST_VERSION);
        app_.footer("`velkhost COMMAND --help` tells the rest.");
        app_.add_subcommand("help", "Show this help");
        add_install();
    }

    int run(int argc, char **argv);

  private:
    void add_install();
    InstallOptions install_options();

    int run_parsed();

    CLI::App app_{"A stand-in host for libvelkprovider.so: runs installation requests on it."};
    CLI::App *install_ = nullptr;
    CLI::Option *options_ = nullptr;
    CLI::Option *update_args_ = nullptr;
    CLI::Option *root_ = nullptr;
    CLI::Option *scenario_ = nullptr;
    Raw raw_;
    InstallOptions parsed_;
    ServeArguments serve_{app_};
    NetworkArguments network_{app_};
};

void CommandLine::add_install() {
    install_ = app_.add_subcommand("install", "Install packages and show how it goes");
    install_->footer(kFooter);
    install_->add_option("URI", raw_.uris, "Locations of package descriptors, or paths of files")
        ->required();
    scenario_ = install_->add_option("--scenario", raw_.scenario,
                                     "What the host has and how it behaves (TOML)");
    options_ = install_->add_option("--options", raw_.options,
                                    "InstallOptions: numbers with commas between them; 32768 "
                                    "asks for synchronous, 32769 for asynchronous installation");
    update_args_ = install_->add_option("--update-args", raw_.update_args,
                                        "UpdateArgs, such as \"--backup --no-reboot\"");
    install_->add_option("--clock", raw_.clock, "The host's clock: virtual or real")
        ->capture_default_str()
        ->check(CLI::IsMember({"virtual", "real"}));
    root_ = install_->add_option("--root", raw_.root,
                                 "Run folder to use and keep (default: a new temporary one)");
    install_
        ->add_option("--limit", raw_.limit, "Longest time to wait for the end, on the host's clock")
        ->capture_default_str();
    install_
        ->add_option("--pace", parsed_.pace_ms,
                     "Milliseconds for which a terminal shows each change at least")
        ->check(CLI::Range(0, 10'000));
    install_->add_flag("--discard", parsed_.discard, "Remove the temporary run folder at the end");
    install_->add_flag("--json", parsed_.json, "One JSON document instead of everything else");
    install_->add_flag("--log", parsed_.log, "Show the library's debug log at the end");
}

InstallOptions CommandLine::install_options() {
    InstallOptions result = parsed_;
    for (const std::string &uri : raw_.uris) {
        result.uris.push_back(location_of(uri));
    }
    if (scenario_->count() > 0) {
        result.scenario = raw_.scenario;
    }
    if (options_->count() > 0) {
        result.options = parse_option_numbers(raw_.options);
    }
    if (update_args_->count() > 0) {
        result.update_args = raw_.update_args;
    }
    if (root_->count() > 0) {
        result.root = raw_.root;
    }
    result.virtual_clock = raw_.clock == "virtual";
    result.limit = parse_duration(raw_.limit);
    return result;
}

int CommandLine::run_parsed() {
    if (serve_.parsed()) {
        return run_serve(serve_.options());
    }
    if (network_.parsed()) {
        Interrupt interrupt;
        return run_network(network_.options(), interrupt);
    }
    if (!install_->parsed()) {
        app_.clear();  // else it is the help of the command "help"
        fmt::print("{}", app_.help());
        return 0;
    }
    const InstallOptions options = install_options();
    Interrupt interrupt;
    return run_install(options, interrupt);
}

int CommandLine::run(int argc, char **argv) {
    try {
        app_.parse(argc, argv);
        return run_parsed();
    } catch (const CLI::ParseError &error) {
        return app_.exit(error) == 0 ? 0 : kUsage;
    } catch (const UsageError &error) {
        fmt::print(stderr, "velkhost: {}\n", error.what());
        return kUsage;
    }
}

}  // namespace

int run_command_line(int argc, char **argv) {
    std::signal(SIGPIPE, SIG_IGN);  // a reader that has gone shows as an error of the write
    try {
        return CommandLine().run(argc, argv);
    } catch (const std::exception &error) {
        fmt::print(stderr, "velkhost: {}\n", error.what());
        return kHostTrouble;
    }
}

}  // namespace velkhost::cli
