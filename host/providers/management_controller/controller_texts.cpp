#include "host/providers/management_controller/controller_texts.h"

#include <algorithm>
#include <cctype>

namespace velkhost::providers {
namespace {

constexpr std::uint32_t kUsualUpdateLooks = 3;

bool is_fpga(const std::string &uri) {
    std::string name = uri.substr(uri.rfind('/') + 1);
    std::ranges::transform(name, name.begin(),
                           [](unsigned char c) { return static_cast<char>(std::tolower(c)); });
    return name.find("fpga") != std::string::npos;
}

}  // namespace

std::vector<scenario::JobLook> usual_job(const std::string &uri, bool reboots) {
    using scenario::JobLook;
    using scenario::kJobRunning;
    std::vector<JobLook> looks{
        JobLook{texts::kInitialization, kJobRunning, 1, false},
        JobLook{texts::kTransferring, kJobRunning, 1, false},
        JobLook{texts::kUpdating, kJobRunning, kUsualUpdateLooks, false},
    };
    if (reboots) {
        looks.push_back({texts::kRebooting, kJobRunning, 1, false});
    }
    const char *end = is_fpga(uri) ? texts::kFpgaCompleted : texts::kCompleted;
    looks.push_back({end, scenario::kJobCompleted, 1, false});
    return looks;
}

}  // namespace velkhost::providers
