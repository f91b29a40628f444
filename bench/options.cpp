#include "bench/options.h"

#include <CLI/CLI.hpp>

#include <stdexcept>

namespace velkbench {

Url Url::parse(const std::string &text) {
    const std::string scheme = "http://";
    if (!text.starts_with(scheme)) {
        throw std::invalid_argument("\"" + text + "\" is no URL such as http://127.0.0.1:5988");
    }
    Url url;
    std::string place = text.substr(scheme.size());
    if (const std::size_t slash = place.find('/'); slash != std::string::npos) {
        url.path = place.substr(slash);
        place.erase(slash);
    }
    if (const std::size_t at = place.rfind('@'); at != std::string::npos) {
        url.credentials = place.substr(0, at);
        place.erase(0, at + 1);
    }
    const std::size_t colon = place.rfind(':');
    if (colon != std::string::npos && place.find(']', colon) == std::string::npos) {
        url.port = place.substr(colon + 1);
        place.erase(colon);
    }
    const bool bracketed = place.starts_with('[') && place.ends_with(']');
    url.host = bracketed ? place.substr(1, place.size() - 2) : place;
    if (url.host.empty() || url.port.empty()) {
        throw std::invalid_argument("\"" + text + "\" names no host or no port");
    }
    return url;
}

std::optional<Options> read_options(int argc, char **argv, int &exit_code) {
    CLI::App app{
        "Closed-loop load on a CIM-XML server: every connection asks again as soon as it "
        "has its answer."};
    Options options;
    std::string url = "http://127.0.0.1:5988/cimom";
    double seconds = 2;
    app.add_option("URL", url, "The server")->capture_default_str();
    app.add_option("--connections", options.connections, "Numbers of connections")
        ->delimiter(',')
        ->check(CLI::Range(1, 1000))
        ->capture_default_str();
    app.add_option("--seconds", seconds, "Length of each measurement")
        ->check(CLI::Range(0.1, 3600.0))
        ->capture_default_str();
    app.add_flag("--new-connections", options.new_connections, "A connection for each request");
    app.add_option("--namespace", options.name_space, "Namespace")->capture_default_str();
    app.add_option("--class", options.class_name, "Class with an instance")->capture_default_str();
    app.add_option("--method", options.method, "Method without arguments")->capture_default_str();
    app.add_option(
        "--floor", options.floor,
        "Requests per second that every measurement has to reach; else the exit code is 1");
    try {
        app.parse(argc, argv);
        options.url = Url::parse(url);
    } catch (const CLI::ParseError &error) {
        exit_code = app.exit(error) == 0 ? 0 : 2;
        return std::nullopt;
    }
    options.length = std::chrono::milliseconds(static_cast<std::int64_t>(seconds * 1000));
    return options;
}

}  // namespace velkbench
