// The byte protocol between QEMU's "ipmi-bmc-extern" device and the program that plays its
// controller.
//
//   message    sequence, network function << 2 | LUN, command, data..., checksum, 0xA0
//   hardware   bytes..., 0xA1
//
// All bytes of a message up to the checksum sum to 0 modulo 256. Inside, 0xA0, 0xA1 and 0xAA travel
// as 0xAA and the byte with bit 4 set.
#pragma once

#include "host/bmc/message.h"

#include <cstdint>
#include <optional>

namespace velkhost::bmc {

// A request as QEMU numbered it.
struct LinkRequest {
    std::uint8_t sequence = 0;
    std::uint8_t lun = 0;
    Request request;
};

enum class FrameKind { kMessage, kHardware };

struct Frame {
    FrameKind kind = FrameKind::kMessage;
    Bytes bytes;  // without escapes and without the end byte
};

// Takes a stream apart into frames.
class FrameReader {
  public:
    // The frame that this byte ends, if it ends one. Frames beyond 1024 bytes are dropped.
    std::optional<Frame> take(std::uint8_t byte);

  private:
    Bytes bytes_;
    bool escaped_ = false;
    bool too_long_ = false;
};

// No value when the message is too short or its checksum is wrong.
std::optional<LinkRequest> read_message(const Bytes &bytes);

// A whole frame with escapes and end byte.
Bytes message_frame(std::uint8_t sequence, std::uint8_t lun, const Response &response);
Bytes hardware_frame(const Bytes &bytes);

}  // namespace velkhost::bmc
