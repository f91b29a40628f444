// A controller behind QEMU: bytes in, bytes out, each at its time. It knows no socket and no clock.
//
// QEMU itself answers 0xC3 for a controller that lets it wait for 4 seconds. An answer with another
// sequence number ends that wait and is dropped, so that is sent before a long silence.
#pragma once

#include "host/bmc/controller.h"
#include "host/bmc/qemu_frames.h"

#include <chrono>
#include <deque>
#include <optional>
#include <span>

namespace velkhost::bmc {

class QemuLink {
  public:
    // `controller` must outlive the link.
    explicit QemuLink(Controller &controller) : controller_(controller) {}

    // What QEMU sent, which came at `now_us`.
    void receive(std::span<const std::uint8_t> bytes, std::int64_t now_us);

    // What is to be sent by `now_us`.
    Bytes take_due(std::int64_t now_us);

    // When there will be something to send; no value when nothing waits.
    [[nodiscard]] std::optional<std::int64_t> next_us() const;

  private:
    struct Outgoing {
        std::int64_t due_us = 0;
        Bytes bytes;
    };

    void serve(const Frame &frame, std::int64_t now_us);
    void serve(const LinkRequest &request, std::int64_t now_us);
    void serve_hardware(const Bytes &command, std::int64_t now_us);
    void send(std::int64_t due_us, Bytes bytes);

    Controller &controller_;
    FrameReader reader_;
    std::deque<Outgoing> outgoing_;  // the earliest first
};

}  // namespace velkhost::bmc
