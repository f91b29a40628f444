// The library's IPMI functions against the host's device with a controller behind it.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "host/bmc/controller.h"
#include "host/bmc/hex.h"
#include "host/bmc/ipmi_device.h"
#include "host/scenario/fault_rules.h"
#include "host/shim/velkshim.h"
#include "ipmi/kcs_channel.h"
#include "tests/support/library_test.h"

namespace velktest {

using velkhost::bmc::Generation;
using velkhost::scenario::ControllerFault;
using velkhost::scenario::FaultRule;

// A fault that strikes the step's first `count` passes.
inline FaultRule fault(std::string step, ControllerFault kind, int code = 0,
                       std::uint32_t count = FaultRule::kAlways) {
    FaultRule out;
    out.step = std::move(step);
    out.controller = kind;
    out.code = code;
    out.count = count;
    return out;
}

// An entry of the session's log, `elapsed` seconds after the test began.
std::string dated(std::string_view message, int elapsed = 0);
std::string dated(const std::vector<std::string_view> &messages, int elapsed = 0);

class IpmiTest : public LibraryTest {
  public:
    IpmiTest();
    ~IpmiTest() override;

  protected:
    // Puts a controller behind /dev/ipmi0, struck by these faults. Without one there is no device.
    void attach(std::vector<FaultRule> faults = {}, velkhost::bmc::Settings settings = {});

    // What the controller was asked: each request in words, such as "create XFLASH -> handle 1",
    // or as the bytes of its data.
    [[nodiscard]] std::vector<std::string> exchanges() const;
    [[nodiscard]] std::vector<std::string> requests() const;

    // Lengths of the pauses so far, in milliseconds.
    [[nodiscard]] const std::vector<int> &pauses_ms() const { return pauses_ms_; }

    // Virtual time since the test began.
    [[nodiscard]] int elapsed_ms() const;

    [[nodiscard]] static bool channel_is_open() { return kcs_fd >= 0; }

  private:
    std::int64_t start_us_;
    std::vector<int> pauses_ms_;
    std::optional<velkhost::scenario::FaultRules> rules_;
    std::optional<velkhost::bmc::Controller> controller_;
    std::optional<velkhost::bmc::IpmiDevice> device_;
};

}  // namespace velktest
