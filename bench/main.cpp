// Requests per second and their times, of any CIM-XML server.
#include "bench/http_client.h"
#include "bench/load.h"

#include <fmt/format.h>

#include <cstdio>
#include <exception>
#include <stdexcept>

namespace velkbench {
namespace {

// The INSTANCENAME of the class's first instance.
std::string find_instance(const Options &options) {
    constexpr std::string_view kEnd = "</INSTANCENAME>";
    HttpClient client(options.url);
    const Response response = client.ask(enumerate_instance_names(options));
    const std::size_t start = response.body.find("<INSTANCENAME ");
    const std::size_t end = response.body.find(kEnd);
    if (response.status != 200 || start == std::string::npos || end == std::string::npos) {
        throw std::runtime_error(fmt::format("{} has no instance: status {}\n{}",
                                             options.class_name, response.status, response.body));
    }
    return response.body.substr(start, end + kEnd.size() - start);
}

// Whether the figures are good enough.
bool show(const std::string &name, const Figures &figures, double floor) {
    const bool good = figures.errors == 0 && figures.per_second >= floor;
    fmt::print("{:<32} {:>11} {:>12.0f} {:>10.2f} {:>10.2f} {:>7}{}\n", name, figures.connections,
               figures.per_second, figures.median_ms, figures.percentile99_ms, figures.errors,
               good ? "" : "  !");
    if (figures.errors > 0) {
        fmt::print("    {}\n", figures.first_error);
    }
    std::fflush(stdout);
    return good;
}

int run(int argc, char **argv) {
    int exit_code = 0;
    const auto options = read_options(argc, argv, exit_code);
    if (!options) {
        return exit_code;
    }
    const std::string instance = find_instance(*options);
    fmt::print("{:<32} {:>11} {:>12} {:>10} {:>10} {:>7}\n", "operation", "connections",
               "requests/s", "median ms", "99th ms", "errors");
    bool good = true;
    for (const Message &message : load_messages(*options, instance)) {
        for (const std::size_t connections : options->connections) {
            good =
                show(message.name, measure(*options, message, connections), options->floor) && good;
        }
    }
    return good ? 0 : 1;
}

}  // namespace
}  // namespace velkbench

int main(int argc, char **argv) {
    try {
        return velkbench::run(argc, argv);
    } catch (const std::exception &error) {
        fmt::print(stderr, "cimxml_bench: {}\n", error.what());
        return 2;
    }
}
