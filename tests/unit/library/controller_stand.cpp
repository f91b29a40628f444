#include "tests/unit/library/controller_stand.h"

#include <algorithm>
#include <string_view>

#include "host/bmc/hex.h"

namespace velktest {

void ControllerStand::attach(std::vector<FaultRule> faults, velkhost::bmc::Settings settings) {
    device_.reset();
    rules_.emplace(std::move(faults));
    controller_.emplace(std::move(settings),
                        [this](std::string_view step, std::string_view subject) {
                            return rules_->take(step, subject);
                        });
    device_.emplace(*controller_);
}

std::vector<std::string> ControllerStand::exchanges() const {
    std::vector<std::string> out;
    if (controller_) {
        for (const auto &exchange : controller_->trace()) {
            out.push_back(exchange.words);
        }
    }
    return out;
}

std::vector<std::string> ControllerStand::requests() const {
    std::vector<std::string> out;
    for (const auto &exchange : controller_->trace()) {
        const auto &request = exchange.request;
        out.push_back(velkhost::bmc::hex(request.netfn) + " " + velkhost::bmc::hex(request.cmd) +
                      " | " + velkhost::bmc::hex(request.data));
    }
    return out;
}

int ControllerStand::status_queries() const {
    const auto all = exchanges();
    return static_cast<int>(std::ranges::count_if(
        all, [](const std::string &words) { return words.starts_with("status "); }));
}

}  // namespace velktest
