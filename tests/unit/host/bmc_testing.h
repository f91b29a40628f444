// What the tests of the controller share: requests as bytes, and answers as text.
#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

#include "host/bmc/controller.h"
#include "host/bmc/hex.h"
#include "host/scenario/fault_rules.h"

namespace velkhost::bmc::test {

inline constexpr std::uint8_t kOem = 0x3A;

inline Request type_query() {
    return {kOem, 0xC1, {}};
}

// The frame of an operation around its elements.
inline Request flash(std::uint8_t operation, const Bytes &elements) {
    Bytes data{operation, 0, 0, static_cast<std::uint8_t>(elements.size())};
    data.insert(data.end(), elements.begin(), elements.end());
    return {kOem, 0xF0, data};
}

inline Request with_handle(std::uint8_t operation, std::uint32_t handle) {
    Bytes elements;
    append_number(elements, handle);
    return flash(operation, elements);
}

inline Request with_text(std::uint8_t operation, std::string_view text) {
    Bytes elements;
    append_text(elements, text);
    return flash(operation, elements);
}

inline Request create() {
    return with_text(0x01, "XFLASH");
}

inline Request open(std::uint32_t handle) {
    Bytes elements;
    append_number(elements, handle);
    append_text(elements, "optfw");
    append_number(elements, 0x80);
    return flash(0x03, elements);
}

// The answer's bytes, "silence" or "gone".
inline std::string ask(Controller &controller, const Request &request, std::int64_t now_us = 0) {
    const Reply reply = controller.handle(request, now_us);
    if (reply.device_gone) {
        return "gone";
    }
    return reply.response ? hex(reply.response->data) : "silence";
}

// A fault that strikes at every pass of the step.
inline scenario::FaultRule rule(std::string step, scenario::ControllerFault fault, int code = 0) {
    scenario::FaultRule out;
    out.step = std::move(step);
    out.controller = fault;
    out.code = code;
    out.count = scenario::FaultRule::kAlways;
    return out;
}

// Rules at work, for a controller's constructor. Must outlive the controller.
class Rules {
  public:
    explicit Rules(std::vector<scenario::FaultRule> rules) : rules_(std::move(rules)) {}

    FaultSource source() {
        return [this](std::string_view step, std::string_view subject) {
            return rules_.take(step, subject);
        };
    }

  private:
    scenario::FaultRules rules_;
};

}  // namespace velkhost::bmc::test
