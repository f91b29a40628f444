// The kernel's IPMI driver as its users see it: each open of the device has a queue of its own, the
// controller is given one request at a time, and a request that it does not answer is sent again.
// docs/real-driver.md tells how this was seen.
#pragma once

#include <cstdint>
#include <deque>
#include <memory>
#include <optional>
#include <vector>

#include "host/shim/hook.h"
#include "host/shim/velkshim.h"

namespace velkhost::shim {

using ControllerHook = Hook<velkshim_ipmi_outcome(void *, const velkshim_ipmi_request *, int64_t,
                                                  velkshim_ipmi_answer *)>;
extern ControllerHook controller_hook;

struct IpmiMessage {
    long id = 0;  // of the request, chosen by the client
    std::uint8_t netfn = 0;
    std::uint8_t cmd = 0;
    std::uint8_t lun = 0;
    std::vector<std::uint8_t> data;
};

// One open of the device: the answers that nobody has fetched yet.
using IpmiClient = std::deque<IpmiMessage>;

// Not safe by itself; whoever has it locks. Times are microseconds of the shim's clock.
class IpmiDriver {
  public:
    // Starts over: nothing is under way and the device is there.
    void reset() { *this = IpmiDriver(); }

    [[nodiscard]] bool is_gone() const { return gone_; }

    // Takes a request; its answer is queued at the client, unless that is gone by then.
    void submit(const std::shared_ptr<IpmiClient> &client, IpmiMessage request,
                std::int64_t now_us);

    // Does all that is due up to `now_us`.
    void advance(std::int64_t now_us);

    // When there will be something to do again; no value when nothing is under way.
    [[nodiscard]] std::optional<std::int64_t> next_us() const;

  private:
    struct Pending {
        std::weak_ptr<IpmiClient> client;
        IpmiMessage request;
        std::int64_t submitted_us = 0;
    };

    // The first of `pending_` at the controller.
    struct Attempt {
        std::int64_t end_us = 0;
        bool gives_up = false;              // the driver's patience with the request ends
        std::optional<IpmiMessage> answer;  // no value: none in time
    };

    void try_front(std::int64_t now_us);
    [[nodiscard]] bool ask_controller(std::int64_t now_us);
    void wait_for_interface(std::int64_t now_us);
    void end_attempt();
    void finish(IpmiMessage answer);

    std::deque<Pending> pending_;
    std::optional<Attempt> attempt_;
    int timeouts_ = 0;                // of the request at the controller
    std::int64_t idle_since_us_ = 0;  // when the latest request was done
    std::int64_t busy_until_us_ = 0;  // the controller has a request and has not answered it
    bool gone_ = false;
};

}  // namespace velkhost::shim
