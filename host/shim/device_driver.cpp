#include "host/shim/device_driver.h"

#include <algorithm>
#include <limits>
#include <utility>

namespace velkhost::shim {

constinit ControllerHook controller_hook;

namespace {

// An answer that takes longer is dropped when it comes, and the request is sent again. Until it
// comes the interface takes nothing else. After the eleventh time that the driver has waited so
// long with one request it gives up, whether or not the controller has seen that request.
constexpr std::int64_t kPatienceUs = 5'005'000;
constexpr int kTimeouts = 11;
constexpr std::int64_t kNever = std::numeric_limits<std::int64_t>::max();

// An interface transfer has 272 bytes, of which network function and command take two.
constexpr std::size_t kLongestAnswer = 270;

constexpr std::uint8_t kResponseBit = 1;
constexpr std::uint8_t kTruncated = 0xC6;
constexpr std::uint8_t kUnspecified = 0xFF;

IpmiMessage answer_to(const IpmiMessage &request, std::vector<std::uint8_t> data) {
    return {request.id, static_cast<std::uint8_t>(request.netfn | kResponseBit), request.cmd,
            request.lun, std::move(data)};
}

// What the client gets of the controller's answer.
IpmiMessage checked(const IpmiMessage &request, const velkshim_ipmi_answer &answer) {
    const bool fits = answer.netfn == (request.netfn | kResponseBit) && answer.cmd == request.cmd;
    if (!fits || answer.length == 0) {
        return answer_to(request, {kUnspecified});
    }
    const std::size_t length = std::min<std::size_t>(answer.length, kLongestAnswer);
    std::vector<std::uint8_t> data(answer.data, answer.data + length);
    if (answer.length > kLongestAnswer) {
        data.front() = kTruncated;
    }
    return answer_to(request, std::move(data));
}

}  // namespace

void IpmiDriver::submit(const std::shared_ptr<IpmiClient> &client, IpmiMessage request,
                        std::int64_t now_us) {
    pending_.push_back({client, std::move(request), now_us});
    advance(now_us);
}

void IpmiDriver::advance(std::int64_t now_us) {
    while (!pending_.empty()) {
        if (!attempt_) {
            timeouts_ = 0;
            try_front(std::max(idle_since_us_, pending_.front().submitted_us));
        } else if (attempt_->end_us <= now_us) {
            end_attempt();
        } else {
            return;
        }
    }
}

std::optional<std::int64_t> IpmiDriver::next_us() const {
    return attempt_ ? std::optional(attempt_->end_us) : std::nullopt;
}

void IpmiDriver::try_front(std::int64_t now_us) {
    const bool is_free = busy_until_us_ <= now_us;
    if (is_free && !ask_controller(now_us)) {
        gone_ = true;
        attempt_.reset();
        pending_.clear();
    } else if (!attempt_ || !attempt_->answer) {
        wait_for_interface(now_us);
    }
}

// Returns false when the controller has gone.
bool IpmiDriver::ask_controller(std::int64_t now_us) {
    const IpmiMessage &message = pending_.front().request;
    const velkshim_ipmi_request request = {message.netfn, message.cmd, message.data.data(),
                                           message.data.size()};
    velkshim_ipmi_answer answer = {};
    const auto outcome = controller_hook(&request, now_us, &answer);
    const bool answers = outcome == VELKSHIM_IPMI_ANSWERED;
    busy_until_us_ = answers ? now_us + answer.delay_us : kNever;
    attempt_.reset();
    if (answers && answer.delay_us < kPatienceUs) {
        attempt_ = Attempt{busy_until_us_, false, checked(message, answer)};
    }
    return outcome != VELKSHIM_IPMI_GONE;
}

void IpmiDriver::wait_for_interface(std::int64_t now_us) {
    const std::int64_t limit_us = now_us + (kTimeouts - timeouts_) * kPatienceUs;
    const std::int64_t end_us = std::min(busy_until_us_, limit_us);
    attempt_ = Attempt{end_us, end_us == limit_us, {}};
    timeouts_ += static_cast<int>((end_us - now_us) / kPatienceUs);
}

void IpmiDriver::end_attempt() {
    if (attempt_->answer) {
        finish(*std::move(attempt_->answer));
    } else if (attempt_->gives_up) {
        finish(answer_to(pending_.front().request, {kUnspecified}));
    } else {
        try_front(attempt_->end_us);
    }
}

void IpmiDriver::finish(IpmiMessage answer) {
    if (const auto client = pending_.front().client.lock()) {
        client->push_back(std::move(answer));
    }
    idle_since_us_ = attempt_->end_us;
    attempt_.reset();
    pending_.pop_front();
}

}  // namespace velkhost::shim
