// The fetcher's side of the stream: frames out, in the order of the protocol.
#pragma once

#include "host/providers/file_transfer/fetch_protocol.h"

#include <cstdint>
#include <span>
#include <string_view>
#include <vector>

namespace velkhost::fetch {

class FrameWriter {
  public:
    explicit FrameWriter(int fd) : fd_(fd) {}

    // All return false when nobody listens any more.
    bool size(std::uint64_t bytes);
    bool data(std::span<const char> bytes);  // kept back until a frame is full
    bool end(const providers::FetchOutcome &outcome);

  private:
    bool flush();
    bool frame(providers::FrameKind kind, std::string_view content);
    bool write_all(std::string_view bytes) const;

    int fd_;
    std::vector<char> kept_;
};

}  // namespace velkhost::fetch
