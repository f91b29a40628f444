#include "host/scenario/hypervisor_reader.h"

#include "host/scenario/service_reader.h"

#include <utility>

namespace velkhost::scenario {
namespace {

// "esx-base 5.1.0-0.5": a name, one blank, a version.
bool is_package(const std::string &text) {
    const auto blank = text.find(' ');
    return blank != std::string::npos && blank > 0 && blank + 1 < text.size() &&
           text.find(' ', blank + 1) == std::string::npos;
}

std::vector<std::string> read_installed(TableReader &in) {
    std::vector<std::string> packages;
    assign(packages, in.texts("installed"));
    for (const std::string &package : packages) {
        if (!is_package(package)) {
            in.fail("installed", "must hold names with a version, not \"" + package + '"');
        }
    }
    return packages;
}

}  // namespace

HypervisorSettings read_hypervisor(TableReader in) {
    HypervisorSettings out;
    out.systems = in.texts("systems");
    out.installed = read_installed(in);
    assign(out.earlier_jobs, in.texts("earlier_jobs"));
    out.answers = read_service(std::move(in), ServiceKind::kJob);
    return out;
}

}  // namespace velkhost::scenario
