// The shim's /dev/ipmi0 with a controller behind it, under the virtual clock, and the driver's
// control calls in a form fit for tests.
#pragma once

#include <gtest/gtest.h>

#include <array>
#include <cerrno>
#include <cstring>
#include <optional>
#include <string>
#include <vector>

#include <fcntl.h>
#include <linux/ipmi.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include "host/bmc/ipmi_device.h"
#include "tests/unit/host/bmc_testing.h"
#include "tests/unit/host/shim_fixture.h"

namespace velkhost::shim::test {

inline constexpr std::int64_t kSecond = 1'000'000;
inline constexpr unsigned char kApp = 0x06;
inline constexpr unsigned char kGetDeviceId = 0x01;
inline constexpr unsigned char kOem = 0x3A;
inline constexpr unsigned char kTypeQuery = 0xC1;

class ShimDevice : public ShimRoot {
  protected:
    ShimDevice() { velkshim_use_virtual_clock(0); }
    ~ShimDevice() override {
        device_.reset();
        velkshim_use_real_clock();
    }

    // Puts a controller behind the device, struck by these faults.
    void attach(std::vector<scenario::FaultRule> faults = {}) {
        device_.reset();
        rules_.emplace(std::move(faults));
        controller_.emplace(bmc::Settings{}, rules_->source());
        device_.emplace(*controller_);
    }

    static int open_device() { return open("/dev/ipmi0", O_RDWR); }

    // 0 or the errno value.
    static int send(int fd, long id, unsigned char netfn, unsigned char cmd,
                    std::vector<unsigned char> data = {}) {
        ipmi_system_interface_addr address = {};
        address.addr_type = IPMI_SYSTEM_INTERFACE_ADDR_TYPE;
        address.channel = IPMI_BMC_CHANNEL;
        ipmi_req request = {};
        request.addr = reinterpret_cast<unsigned char *>(&address);
        request.addr_len = sizeof address;
        request.msgid = id;
        request.msg = {netfn, cmd, static_cast<unsigned short>(data.size()), data.data()};
        return ioctl(fd, IPMICTL_SEND_COMMAND, &request) == 0 ? 0 : errno;
    }

    // "7: 3B C1 | 00 00 01", or the name of the errno value, with what came in spite of it behind.
    static std::string fetch(int fd, unsigned short capacity = 272,
                             unsigned long code = IPMICTL_RECEIVE_MSG_TRUNC) {
        std::array<unsigned char, 40> address = {};
        std::vector<unsigned char> data(capacity);
        ipmi_recv answer = {};
        answer.addr = address.data();
        answer.addr_len = address.size();
        answer.msg.data = data.data();
        answer.msg.data_len = capacity;
        const int error = ioctl(fd, code, &answer) == 0 ? 0 : errno;
        const std::string name = error == 0 ? "" : strerrorname_np(error);
        if (answer.recv_type != IPMI_RESPONSE_RECV_TYPE) {
            return name;
        }
        data.resize(answer.msg.data_len);
        return name + (name.empty() ? "" : " ") + std::to_string(answer.msgid) + ": " +
               bmc::hex(answer.msg.netfn) + " " + bmc::hex(answer.msg.cmd) + " | " + bmc::hex(data);
    }

    static bool is_readable(int fd, int limit_ms = 0) {
        pollfd set = {fd, POLLIN, 0};
        return poll(&set, 1, limit_ms) == 1 && (set.revents & POLLIN) != 0;
    }

    // When the controller saw each request, in whole milliseconds.
    [[nodiscard]] std::vector<int> request_times_ms() const {
        std::vector<int> out;
        for (const auto &exchange : controller_->trace()) {
            out.push_back(static_cast<int>(exchange.time_us / 1000));
        }
        return out;
    }

    std::optional<bmc::test::Rules> rules_;
    std::optional<bmc::Controller> controller_;
    std::optional<bmc::IpmiDevice> device_;
};

}  // namespace velkhost::shim::test
