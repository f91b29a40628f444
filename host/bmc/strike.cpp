#include "host/bmc/strike.h"

#include "host/bmc/hex.h"

#include <algorithm>

namespace velkhost::bmc {

using enum scenario::ControllerFault;

bool reaches_the_controller(const scenario::Fault &fault) {
    switch (fault.controller) {
        case kLate:
        case kWrongFunction:
        case kWrongCommand:
        case kLonger:
            return true;
        default:
            return false;
    }
}

std::string strike(const scenario::Fault &fault, Reply &reply, const std::string &words) {
    Response &response = *reply.response;
    switch (fault.controller) {
        case kLate:
            reply.delay = std::chrono::seconds(fault.code);
            return words + ", " + std::to_string(fault.code) + " s late";
        case kWrongFunction:
            response.netfn ^= 0x02;
            return words + ", with function 0x" + hex(response.netfn);
        case kWrongCommand:
            response.cmd ^= 0x01;
            return words + ", with command 0x" + hex(response.cmd);
        case kLonger:
            response.data.resize(
                std::max(response.data.size(), static_cast<std::size_t>(fault.code)));
            return words + ", " + std::to_string(response.data.size()) + " bytes long";
        case kCompletionCode:
            response.data = {static_cast<std::uint8_t>(fault.code)};
            return "completion code 0x" + hex(response.data.front());
        case kRefuse:
            return words;
        case kVanish:
            reply = gone();
            return "the device is gone";
        case kNone:
        case kNoAnswer:
            break;
    }
    reply.response.reset();
    return "no answer";
}

}  // namespace velkhost::bmc
