#include "host/bmc/standard_commands.h"

#include <algorithm>
#include <array>
#include <string>

namespace velkhost::bmc {
namespace {

constexpr std::uint8_t kGetDeviceId = 0x01;
constexpr std::uint8_t kSetGlobalEnables = 0x2E;
constexpr std::uint8_t kGetGlobalEnables = 0x2F;
constexpr std::uint8_t kClearFlags = 0x30;
constexpr std::uint8_t kGetFlags = 0x31;

struct Command {
    std::uint8_t cmd;
    std::size_t request_length;
    std::string_view name;
};

constexpr std::array kCommands{
    Command{kGetDeviceId, 0, "get device id"},
    Command{kSetGlobalEnables, 1, "set global enables"},
    Command{kGetGlobalEnables, 0, "get global enables"},
    Command{kClearFlags, 1, "clear message flags"},
    Command{kGetFlags, 0, "get message flags"},
};

const Command *find(std::uint8_t cmd) {
    const auto *const found = std::ranges::find(kCommands, cmd, &Command::cmd);
    return found == kCommands.end() ? nullptr : found;
}

// Device 0x20, revision 1, firmware 5.01, IPMI 2.0, no optional device support, no manufacturer.
Bytes device_id() {
    return {kCompleted, 0x20, 0x01, 0x05, 0x01, 0x02, 0x00, 0, 0, 0, 0, 0, 0, 0, 0, 0};
}

}  // namespace

std::string_view standard_command_name(std::uint8_t cmd) {
    const Command *const command = find(cmd);
    return command == nullptr ? "application command" : command->name;
}

Answer StandardCommands::serve(const Request &request) {
    const Command *const command = find(request.cmd);
    if (command == nullptr) {
        return not_completed(kInvalidCommand);
    }
    if (request.data.size() != command->request_length) {
        return not_completed(kInvalidLength);
    }
    switch (request.cmd) {
        case kGetDeviceId:
            return {device_id(), "IPMI 2.0"};
        case kSetGlobalEnables:
            global_enables_ = request.data.front();
            return {{kCompleted}, "0x" + hex(global_enables_)};
        case kGetGlobalEnables:
            return {{kCompleted, global_enables_}, "0x" + hex(global_enables_)};
        case kGetFlags:
            return {{kCompleted, 0}, "none"};
        default:
            return {{kCompleted}, "done"};
    }
}

}  // namespace velkhost::bmc
