#include "tests/unit/library/ipmi_fixture.h"

#include <array>
#include <cstdio>

namespace velktest {
namespace {

constexpr int kMicrosPerMilli = 1000;

void note_pause(void *pauses, std::int64_t, std::int64_t length_us) {
    static_cast<std::vector<int> *>(pauses)->push_back(
        static_cast<int>(length_us / kMicrosPerMilli));
}

}  // namespace

std::string dated(std::string_view message, int elapsed) {
    const int now = kStartSecond + elapsed;
    std::array<char, 32> date{};
    std::snprintf(date.data(), date.size(), "Fri Oct  4 %02d:%02d:%02d 2024 ", now / 3600,
                  now / 60 % 60, now % 60);
    return date.data() + std::string(message) + "\n";
}

std::string dated(const std::vector<std::string_view> &messages, int elapsed) {
    std::string text;
    for (const std::string_view message : messages) {
        text += dated(message, elapsed);
    }
    return text;
}

IpmiTest::IpmiTest() : start_us_(velkshim_now_us()) {
    velkshim_observe_pauses(note_pause, &pauses_ms_);
}

IpmiTest::~IpmiTest() {
    disconnect_kcs();
    velkshim_observe_pauses(nullptr, nullptr);
}

void IpmiTest::attach(std::vector<FaultRule> faults, velkhost::bmc::Settings settings) {
    device_.reset();
    rules_.emplace(std::move(faults));
    controller_.emplace(std::move(settings),
                        [this](std::string_view step, std::string_view subject) {
                            return rules_->take(step, subject);
                        });
    device_.emplace(*controller_);
}

std::vector<std::string> IpmiTest::exchanges() const {
    std::vector<std::string> out;
    for (const auto &exchange : controller_->trace()) {
        out.push_back(exchange.words);
    }
    return out;
}

std::vector<std::string> IpmiTest::requests() const {
    std::vector<std::string> out;
    for (const auto &exchange : controller_->trace()) {
        const auto &request = exchange.request;
        out.push_back(velkhost::bmc::hex(request.netfn) + " " + velkhost::bmc::hex(request.cmd) +
                      " | " + velkhost::bmc::hex(request.data));
    }
    return out;
}

int IpmiTest::elapsed_ms() const {
    return static_cast<int>((velkshim_now_us() - start_us_) / kMicrosPerMilli);
}

}  // namespace velktest
