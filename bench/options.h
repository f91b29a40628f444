// What the benchmark is asked to do.
#pragma once

#include <chrono>
#include <cstddef>
#include <optional>
#include <string>
#include <vector>

namespace velkbench {

// http://[user:password@]host[:port]/path, taken apart.
struct Url {
    std::string host;
    std::string port = "5988";
    std::string path = "/cimom";
    std::string credentials;  // "user:password"; empty: none

    // Throws std::invalid_argument.
    static Url parse(const std::string &text);
};

struct Options {
    Url url;
    std::vector<std::size_t> connections = {1, 4, 16};
    std::chrono::milliseconds length{2000};  // of each measurement
    bool new_connections = false;            // one for each request
    std::string name_space = "velk/cimv2";
    std::string class_name = "PAKRO_VMpkgInstallationService";
    std::string method = "DeleteVELKDebugLogFile";
    double floor = 0;  // requests per second that every measurement must reach
};

// No value: the program is to end with that exit code.
std::optional<Options> read_options(int argc, char **argv, int &exit_code);

}  // namespace velkbench
