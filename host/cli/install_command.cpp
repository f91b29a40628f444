#include "host/cli/install_command.h"

#include "host/cli/install_run.h"
#include "host/cli/json_report.h"
#include "host/cli/lines.h"
#include "host/cli/live_view.h"
#include "host/cli/output.h"
#include "host/cli/plain_view.h"
#include "host/cli/result_table.h"
#include "host/cli/stdout_capture.h"

#include <fmt/format.h>
#include <unistd.h>

#include <memory>

namespace velkhost::cli {
namespace {

std::unique_ptr<View> make_view(const InstallOptions &options, Output &output,
                                const Terminal &terminal) {
    if (options.json) {
        return std::make_unique<SilentView>();
    }
    if (!terminal.interactive) {
        return std::make_unique<PlainView>(output, terminal);
    }
    // In virtual time everything is over in a blink, so what happened stays to be read.
    const bool timeline = options.virtual_clock && options.pace_ms == 0;
    return std::make_unique<LiveView>(
        output, terminal, LiveViewOptions{timeline, !options.virtual_clock, options.pace_ms});
}

void show_log(const RunReport &report, Output &output) {
    std::string text = report.log.empty() ? "" : "\n";
    for (const std::string &line : report.log) {
        text += line + "\n";
    }
    output.write(text);
}

void show_result(const RunReport &report, const InstallOptions &options, Output &output,
                 const Terminal &terminal) {
    if (options.json) {
        output.write(json_report(report));
        return;
    }
    const std::size_t width = terminal.interactive ? window_size(output.fd()).columns : kUnlimited;
    output.write("\n" + result_table(report, terminal, width));
    show_log(report, output);
}

int trouble(Output &errors, const std::exception &error) {
    errors.write(fmt::format("velkhost: {}\n", error.what()));
    return kHostTrouble;
}

}  // namespace

int run_install(const InstallOptions &options, Interrupt &interrupt) {
    const OwnStdout own_stdout;
    Output output(own_stdout.fd());
    Output errors(STDERR_FILENO);
    const Terminal terminal = Terminal::of(output.fd());
    for (const std::string &warning : location_warnings(split_locations(options.uris))) {
        errors.write(fmt::format("velkhost: {}\n", warning));
    }
    const std::unique_ptr<View> view = make_view(options, output, terminal);
    try {
        InstallRun run(options, interrupt, *view);
        const RunReport report = run.execute();
        show_result(report, options, output, terminal);
        const int code = exit_code_of(report);
        if (report.limit_reached) {
            run.end_process(code);
        }
        run.finish(!output.is_broken());
        return code;
    } catch (const std::exception &error) {
        return trouble(errors, error);
    }
}

}  // namespace velkhost::cli
