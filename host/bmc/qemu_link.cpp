#include "host/bmc/qemu_link.h"

#include <algorithm>
#include <utility>

namespace velkhost::bmc {
namespace {

constexpr std::uint8_t kVersion = 0xFF;
constexpr std::uint8_t kProtocolVersion = 1;
constexpr std::uint8_t kCapabilities = 0x08;
constexpr std::uint8_t kResetAnswer = 0x05;
constexpr std::chrono::microseconds kLongWait = std::chrono::seconds(3);

}  // namespace

void QemuLink::receive(std::span<const std::uint8_t> bytes, std::int64_t now_us) {
    for (const std::uint8_t byte : bytes) {
        if (const auto frame = reader_.take(byte)) {
            serve(*frame, now_us);
        }
    }
}

Bytes QemuLink::take_due(std::int64_t now_us) {
    Bytes out;
    while (!outgoing_.empty() && outgoing_.front().due_us <= now_us) {
        const Bytes &bytes = outgoing_.front().bytes;
        out.insert(out.end(), bytes.begin(), bytes.end());
        outgoing_.pop_front();
    }
    return out;
}

std::optional<std::int64_t> QemuLink::next_us() const {
    return outgoing_.empty() ? std::nullopt : std::optional(outgoing_.front().due_us);
}

void QemuLink::serve(const Frame &frame, std::int64_t now_us) {
    if (frame.kind == FrameKind::kHardware) {
        serve_hardware(frame.bytes, now_us);
    } else if (const auto request = read_message(frame.bytes)) {
        serve(*request, now_us);
    }
}

void QemuLink::serve(const LinkRequest &request, std::int64_t now_us) {
    const Reply reply = controller_.handle(request.request, now_us);
    if (!reply.response || reply.delay >= kLongWait) {
        const auto wrong = static_cast<std::uint8_t>(request.sequence - 1);
        send(now_us, message_frame(wrong, request.lun, {0, 0, {kCompleted}}));
    }
    if (reply.response) {
        send(now_us + reply.delay.count(),
             message_frame(request.sequence, request.lun, *reply.response));
    }
}

// At connect QEMU tells its version and what it can do.
void QemuLink::serve_hardware(const Bytes &command, std::int64_t now_us) {
    const std::uint8_t kind = command.empty() ? std::uint8_t{0} : command.front();
    if (kind == kVersion) {
        send(now_us, hardware_frame({kVersion, kProtocolVersion}));
    } else if (kind == kCapabilities) {
        send(now_us, hardware_frame({kResetAnswer}));
    }
}

void QemuLink::send(std::int64_t due_us, Bytes bytes) {
    const auto later = std::ranges::upper_bound(outgoing_, due_us, {}, &Outgoing::due_us);
    outgoing_.insert(later, {due_us, std::move(bytes)});
}

}  // namespace velkhost::bmc
