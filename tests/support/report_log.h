// What one status report leaves in the debug log.
#pragma once

#include <string>
#include <string_view>
#include <vector>

namespace velktest {

struct Report {
    std::string_view location;  // the package's `TFTPXMLPkgURIs`
    std::string_view id;        // and what is left of it
    int code;
    std::string_view message;
    int elapsed = 0;  // seconds since the test began
};

// Of a request that is not asynchronous.
std::string report_log(const Report &report);

// What comes after that for an asynchronous one.
std::string job_file_log(std::string_view file, std::string_view line, int elapsed = 0);

// Codes and messages of the reports of package `id` in a log, in their order: "50: Done.".
std::vector<std::string> reports_in(std::string_view log, std::string_view id);

}  // namespace velktest
