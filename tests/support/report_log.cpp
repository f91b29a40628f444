#include "tests/support/report_log.h"

#include "tests/support/log_text.h"

namespace velktest {

std::string report_log(const Report &report) {
    const std::string location(report.location);
    const std::string id(report.id);
    const std::string message(report.message);
    return entry("enter update velk status.\n", report.elapsed) +
           entry("pkgInstance[pkgIndex].TFTPXMLPkgURIs:", report.elapsed) + location +
           "\ninstallResult:" + location + "\ninstallResult after trim:" + id + "\n" +
           entry(id + ": " + std::to_string(report.code) + ": " + message + "\n", report.elapsed);
}

std::vector<std::string> reports_in(std::string_view log, std::string_view id) {
    std::vector<std::string> found;
    const std::string mark = "] " + std::string(id) + ": ";
    for (std::size_t at = log.find(mark); at != std::string_view::npos; at = log.find(mark, at)) {
        at += mark.size();
        found.emplace_back(log.substr(at, log.find('\n', at) - at));
    }
    return found;
}

std::string job_file_log(std::string_view file, std::string_view line, int elapsed) {
    return entry("Write current status into file", elapsed) + std::string(file) +
           " for async installation.\n" + entry("Current result:", elapsed) + std::string(line) +
           "\n" + entry("mutex lock.\n", elapsed) +
           entry("Update async status sucessfully.\n", elapsed) + entry("mutex unlock.\n", elapsed);
}

}  // namespace velktest
