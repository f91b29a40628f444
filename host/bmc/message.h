// One IPMI request and what becomes of it, as seen at the controller's system interface.
#pragma once

#include <chrono>
#include <cstdint>
#include <optional>
#include <vector>

namespace velkhost::bmc {

using Bytes = std::vector<std::uint8_t>;

struct Request {
    std::uint8_t netfn = 0;  // network function, 6 bits, even
    std::uint8_t cmd = 0;
    Bytes data;
};

struct Response {
    std::uint8_t netfn = 0;  // the request's with the low bit set
    std::uint8_t cmd = 0;
    Bytes data;  // the completion code first
};

// What becomes of a request.
struct Reply {
    std::optional<Response> response;    // no value: silence
    std::chrono::microseconds delay{0};  // from the request to the response
    bool device_gone = false;            // the controller has left the host's bus
};

inline Reply gone() {
    Reply reply;
    reply.device_gone = true;
    return reply;
}

// Completion codes (IPMI 2.0, table 5-2).
inline constexpr std::uint8_t kCompleted = 0x00;
inline constexpr std::uint8_t kInvalidCommand = 0xC1;
inline constexpr std::uint8_t kInvalidLength = 0xC7;
inline constexpr std::uint8_t kInvalidField = 0xCC;

}  // namespace velkhost::bmc
