#include "host/bmc/qemu_frames.h"

#include "host/bmc/byte_cursor.h"

#include <numeric>
#include <utility>

namespace velkhost::bmc {
namespace {

constexpr std::uint8_t kMessageEnd = 0xA0;
constexpr std::uint8_t kHardwareEnd = 0xA1;
constexpr std::uint8_t kEscape = 0xAA;
constexpr std::uint8_t kEscapeBit = 0x10;
constexpr std::size_t kLongestFrame = 1024;
constexpr unsigned kLunBits = 2;
constexpr std::uint8_t kLunMask = 0x03;

std::uint8_t sum_of(const Bytes &bytes) {
    return std::accumulate(
        bytes.begin(), bytes.end(), std::uint8_t{0},
        [](std::uint8_t sum, std::uint8_t byte) { return static_cast<std::uint8_t>(sum + byte); });
}

bool needs_escape(std::uint8_t byte) {
    return byte == kMessageEnd || byte == kHardwareEnd || byte == kEscape;
}

Bytes framed(const Bytes &bytes, std::uint8_t end) {
    Bytes out;
    for (const std::uint8_t byte : bytes) {
        if (needs_escape(byte)) {
            out.push_back(kEscape);
        }
        out.push_back(needs_escape(byte) ? byte | kEscapeBit : byte);
    }
    out.push_back(end);
    return out;
}

}  // namespace

std::optional<Frame> FrameReader::take(std::uint8_t byte) {
    if (byte == kMessageEnd || byte == kHardwareEnd) {
        Frame frame{byte == kMessageEnd ? FrameKind::kMessage : FrameKind::kHardware,
                    std::exchange(bytes_, {})};
        escaped_ = false;
        return std::exchange(too_long_, false) ? std::nullopt : std::optional(std::move(frame));
    }
    if (byte == kEscape) {
        escaped_ = true;
        return std::nullopt;
    }
    if (bytes_.size() == kLongestFrame) {
        too_long_ = true;
        return std::nullopt;
    }
    bytes_.push_back(std::exchange(escaped_, false) ? static_cast<std::uint8_t>(byte & ~kEscapeBit)
                                                    : byte);
    return std::nullopt;
}

std::optional<LinkRequest> read_message(const Bytes &bytes) {
    constexpr std::size_t kChecksumSize = 1;
    ByteCursor in(bytes);
    const auto sequence = in.byte();
    const auto address = in.byte();
    const auto cmd = in.byte();
    if (!cmd || in.left() < kChecksumSize || sum_of(bytes) != 0) {
        return std::nullopt;
    }
    const auto data = *in.take(in.left() - kChecksumSize);
    return LinkRequest{
        *sequence,
        static_cast<std::uint8_t>(*address & kLunMask),
        {static_cast<std::uint8_t>(*address >> kLunBits), *cmd, Bytes(data.begin(), data.end())}};
}

Bytes message_frame(std::uint8_t sequence, std::uint8_t lun, const Response &response) {
    Bytes bytes{sequence, static_cast<std::uint8_t>(response.netfn << kLunBits | lun),
                response.cmd};
    bytes.insert(bytes.end(), response.data.begin(), response.data.end());
    bytes.push_back(static_cast<std::uint8_t>(-sum_of(bytes)));
    return framed(bytes, kMessageEnd);
}

Bytes hardware_frame(const Bytes &bytes) {
    return framed(bytes, kHardwareEnd);
}

}  // namespace velkhost::bmc
