#include "host/scenario/controller_reader.h"

#include <algorithm>
#include <array>
#include <string>

namespace velkhost::scenario {
namespace {

constexpr std::uint32_t kHighestType = 2;
constexpr std::size_t kLongestSecureMode = 127;

// An action with the key of the number that it takes, if it takes one.
struct Action {
    const char *name;
    ControllerFault fault;
    const char *key = nullptr;
    std::uint32_t lowest = 0;
    std::uint32_t highest = 0;
};

constexpr std::array kActions{
    Action{"no-answer", ControllerFault::kNoAnswer},
    Action{"late", ControllerFault::kLate, "seconds", 1, 3600},
    Action{"wrong-function", ControllerFault::kWrongFunction},
    Action{"wrong-command", ControllerFault::kWrongCommand},
    Action{"completion-code", ControllerFault::kCompletionCode, "code", 1, 0xFF},
    Action{"refuse", ControllerFault::kRefuse},
    Action{"longer", ControllerFault::kLonger, "bytes", 1, 4096},
    Action{"vanish", ControllerFault::kVanish},
};

std::string known_actions() {
    std::string out;
    for (const Action &action : kActions) {
        out += (out.empty() ? "" : ", ") + std::string(action.name);
    }
    return out;
}

const Action &read_action(TableReader &in) {
    const auto name = in.text("action");
    if (!name) {
        in.fail("action", "is missing; known are " + known_actions());
    }
    const auto *const found = std::ranges::find(kActions, *name, &Action::name);
    if (found == kActions.end()) {
        in.fail("action", "is unknown; known are " + known_actions());
    }
    return *found;
}

}  // namespace

ControllerSettings read_controller(TableReader in) {
    ControllerSettings out;
    out.present = in.flag("present").value_or(out.present);
    out.type = in.number("type", 0, kHighestType).value_or(out.type);
    out.secure_mode = in.text("secure_mode").value_or(out.secure_mode);
    if (out.secure_mode.size() > kLongestSecureMode) {
        in.fail("secure_mode", "must be at most 127 bytes long");
    }
    in.finish();
    return out;
}

void read_controller_fault(TableReader &in, FaultRule &rule) {
    const Action &action = read_action(in);
    rule.controller = action.fault;
    if (action.key == nullptr) {
        return;
    }
    const auto number = in.number(action.key, action.lowest, action.highest);
    if (!number) {
        in.fail(action.key, std::string("is missing; \"") + action.name + "\" needs it");
    }
    rule.code = static_cast<int>(*number);
}

}  // namespace velkhost::scenario
