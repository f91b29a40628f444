// A management controller behind /dev/ipmi0, for fixtures of the library's tests.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "host/bmc/controller.h"
#include "host/bmc/ipmi_device.h"
#include "host/scenario/fault_rules.h"

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

class ControllerStand {
  public:
    // Puts a controller behind the device, struck by these faults. Without one there is no device.
    void attach(std::vector<FaultRule> faults = {}, velkhost::bmc::Settings settings = {});

    // What the controller was asked: each request in words, such as "create XFLASH -> handle 1",
    // or as the bytes of its data.
    [[nodiscard]] std::vector<std::string> exchanges() const;
    [[nodiscard]] std::vector<std::string> requests() const;

    // How many status queries it was asked.
    [[nodiscard]] int status_queries() const;

  private:
    std::optional<velkhost::scenario::FaultRules> rules_;
    std::optional<velkhost::bmc::Controller> controller_;
    std::optional<velkhost::bmc::IpmiDevice> device_;
};

}  // namespace velktest
