// velkbmc: the controller of a scenario as a program, for QEMU's "ipmi-bmc-extern" device. Serves
// until it is told to end (SIGINT, SIGTERM) and then prints the trace of all exchanges.
#include "host/bmc/controller.h"
#include "host/bmc/qemu_server.h"
#include "host/bmc/scenario_controller.h"
#include "host/bmc/trace.h"
#include "host/scenario/reader.h"
#include "host/scenario/scenario.h"

#include <CLI/CLI.hpp>

#include <csignal>
#include <cstdlib>
#include <exception>
#include <iostream>
#include <string>

#include <sys/signalfd.h>

namespace {

using velkhost::bmc::OwnedDescriptor;

// Readable once the program is told to end.
OwnedDescriptor end_signal() {
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGINT);
    sigaddset(&signals, SIGTERM);
    sigprocmask(SIG_BLOCK, &signals, nullptr);
    return OwnedDescriptor(signalfd(-1, &signals, SFD_CLOEXEC));
}

void print_trace(const velkhost::bmc::Controller &controller) {
    const auto trace = controller.trace();
    for (const auto &exchange : trace) {
        std::cout << velkhost::bmc::in_words(exchange, trace.front().time_us) << '\n';
    }
}

int serve(const std::string &socket, const std::string &scenario_file) {
    velkhost::scenario::Scenario scenario(
        scenario_file.empty() ? velkhost::scenario::Description{}
                              : velkhost::scenario::read_description(scenario_file));
    velkhost::bmc::Controller controller(velkhost::bmc::settings_of(scenario),
                                         velkhost::bmc::faults_of(scenario));
    const OwnedDescriptor end = end_signal();
    velkhost::bmc::QemuServer(socket, controller).run(end.get());
    print_trace(controller);
    return EXIT_SUCCESS;
}

}  // namespace

int main(int argc, char **argv) {
    CLI::App app("A management controller for QEMU's ipmi-bmc-extern device.");
    std::string socket;
    std::string scenario_file;
    app.add_option("socket", socket, "UNIX socket to listen at")->required();
    app.add_option("--scenario", scenario_file, "scenario with [controller] and faults at bmc.*");
    CLI11_PARSE(app, argc, argv);
    try {
        return serve(socket, scenario_file);
    } catch (const std::exception &error) {
        std::cerr << "velkbmc: " << error.what() << '\n';
        return EXIT_FAILURE;
    }
}
