#include "host/cli/network_command.h"

#include "host/cli/guarded_rig.h"
#include "host/cli/network_report.h"
#include "host/cli/output.h"
#include "host/cli/stdout_capture.h"
#include "host/rig/shim_session.h"
#include "host/rig/text_file.h"

namespace velkhost::cli {
namespace {

// "Mon Mar  2 08:00:00 2026 " in front of what the library says.
constexpr std::size_t kDateLength = 25;

// The last thing that the library said in its debug log.
std::string last_words(const rig::RunFolder &folder) {
    std::string log = rig::read_text_file(folder.inside("/tmp/velkdebug.txt")).value_or("");
    log.erase(log.find_last_not_of(" \n") + 1);
    const std::string line = log.substr(log.rfind('\n') + 1);
    return line.size() > kDateLength ? line.substr(kDateLength) : line;
}

class NetworkRun {
  public:
    NetworkRun(const NetworkOptions &options, Interrupt &interrupt)
        : options_(options),
          rig_({.folder = options.root,
                .scenario_file = options.scenario,
                .virtual_clock = options.virtual_clock},
               interrupt) {}

    NetworkReport execute();

  private:
    [[nodiscard]] ConfigureReport configure(const rig::NetworkCalls &library) const;

    const NetworkOptions &options_;
    GuardedRig rig_;
};

ConfigureReport NetworkRun::configure(const rig::NetworkCalls &library) const {
    const std::int64_t begin = rig::host_now_us();
    const bool done = library.configure(options_.configure == Configure::kAlways);
    return {done, rig::host_now_us() - begin};
}

NetworkReport NetworkRun::execute() {
    const rig::NetworkCalls library(rig_->library_path());
    NetworkReport report;
    report.node = rig_->scenario().host.node;
    report.scenario = rig_->scenario().source;
    if (options_.configure != Configure::kNo) {
        report.configure = configure(library);
    }
    report.table = library.read_table();
    report.now_us = rig::host_now_us();
    if (!report.table) {
        report.trouble = last_words(rig_->folder());
    }
    return report;
}

}  // namespace

int run_network(const NetworkOptions &options, Interrupt &interrupt) {
    const OwnStdout own_stdout;
    Output output(own_stdout.fd());
    const NetworkReport report = NetworkRun(options, interrupt).execute();
    output.write(options.json ? network_json(report) : network_text(report));
    return exit_code_of(report);
}

}  // namespace velkhost::cli
