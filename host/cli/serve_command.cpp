#include "host/cli/serve_command.h"

#include "host/cimxml/server.h"
#include "host/cli/install_options.h"
#include "host/cli/output.h"
#include "host/cli/report.h"
#include "host/cli/serve_clock.h"
#include "host/cli/stdout_capture.h"
#include "host/cli/stop_signals.h"
#include "host/rig/rig.h"

#include <fmt/format.h>
#include <unistd.h>

#include <optional>

namespace velkhost::cli {
namespace {

constexpr int kStillAtWork = 1;

std::optional<cimxml::Credentials> credentials_of(const ServeOptions &options) {
    if (options.user.has_value() != options.password_file.has_value()) {
        throw UsageError("--user and --password-file go together");
    }
    if (!options.user) {
        return std::nullopt;
    }
    if (options.user->find(':') != std::string::npos) {
        throw UsageError("a user's name has no \":\" in it");
    }
    return cimxml::Credentials{*options.user, cimxml::read_password(*options.password_file)};
}

cimxml::ListenAddress address_of(const ServeOptions &options) {
    try {
        const auto address = cimxml::ListenAddress::parse(options.listen);
        if (!address.is_loopback() && !options.user) {
            throw UsageError(
                fmt::format("{} can be reached from other machines: that takes --user "
                            "and --password-file",
                            address.text()));
        }
        return address;
    } catch (const cimxml::ListenError &error) {
        throw UsageError(error.what());
    }
}

class ServeRun {
  public:
    ServeRun(const ServeOptions &options, Output &output)
        : options_(options),
          output_(output),
          credentials_(credentials_of(options)),
          address_(address_of(options)),
          rig_({.folder = options.root,
                .scenario_file = options.scenario,
                .virtual_clock = options.virtual_clock}),
          libraries_output_(rig_.folder().inside(kBrokerOutput)),
          endpoint_(rig_.broker(), credentials_),
          clock_(options.virtual_clock, options.speed) {
        server_.emplace(endpoint_, cimxml::ServerOptions{.address = address_});
    }

    int run();

  private:
    [[nodiscard]] bool at_work() const { return server_->active() > 0 || rig_.busy(); }
    void come_to_an_end();
    void report(bool left_at_work);
    [[noreturn]] void end_process();

    const ServeOptions &options_;
    Output &output_;
    const StopSignals signals_;
    const std::optional<cimxml::Credentials> credentials_;
    const cimxml::ListenAddress address_;
    rig::Rig rig_;
    StdoutCapture libraries_output_;
    cimxml::Endpoint endpoint_;
    ServeClock clock_;
    std::optional<cimxml::Server> server_;
};

int ServeRun::run() {
    output_.write(fmt::format("velkhost: listening on http://{}{}\n", server_->address().text(),
                              cimxml::Endpoint::kPath));
    signals_.unblock();
    while (StopSignals::count() == 0) {
        clock_.tick(at_work());
    }
    come_to_an_end();
    if (at_work()) {
        report(true);
        end_process();
    }
    const auto answered = server_->answered();
    server_.reset();
    rig_.shut_down();
    output_.write(
        fmt::format("velkhost: ended after {} request{}\n", answered, answered == 1 ? "" : "s"));
    report(false);
    return rig_.findings().empty() ? 0 : kHostTrouble;
}

// What is under way may end; time goes on for it.
void ServeRun::come_to_an_end() {
    constexpr std::int64_t kMillis = 1000;
    const std::int64_t deadline = cimxml::machine_ms() + options_.grace_s * kMillis;
    server_->close();
    while (at_work() && StopSignals::count() < 2 && cimxml::machine_ms() < deadline) {
        clock_.tick(true);
    }
}

void ServeRun::report(bool left_at_work) {
    if (left_at_work) {
        output_.write(rig_.busy() ? "velkhost: ended while packages were being installed\n"
                                  : "velkhost: ended while a request was being answered\n");
    }
    for (const std::string &finding : rig_.findings()) {
        output_.write(fmt::format("velkhost: the broker found: {}\n", finding));
    }
    for (const std::string &fault : rig_.unfired_faults()) {
        output_.write(fmt::format("velkhost: a fault never struck: {}\n", fault));
    }
}

// Threads are at work on all of it: nothing can be taken from under them.
void ServeRun::end_process() {
    if (rig_.folder().is_temporary()) {
        rig::remove_folder(rig_.folder().path());
    }
    _exit(rig_.findings().empty() ? kStillAtWork : kHostTrouble);
}

}  // namespace

int run_serve(const ServeOptions &options) {
    const OwnStdout own_stdout;
    Output output(own_stdout.fd());
    return ServeRun(options, output).run();
}

}  // namespace velkhost::cli
