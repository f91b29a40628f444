// Where a transfer's bytes come from.
#pragma once

#include "host/providers/file_transfer/fetch_protocol.h"

#include <cstdint>
#include <span>
#include <stop_token>
#include <variant>

namespace velkhost::providers {

// The size of the whole file, as its server announces it.
struct AnnouncedSize {
    std::uint64_t bytes = 0;
};

// The next bytes, valid until the next call.
using FileBytes = std::span<const char>;

using Piece = std::variant<AnnouncedSize, FileBytes, FetchOutcome>;

class Source {
  public:
    Source() = default;
    virtual ~Source() = default;
    Source(const Source &) = delete;
    Source &operator=(const Source &) = delete;

    // Waits for the next piece; the outcome is the last one. Ends soon, with an outcome, once
    // `stop` is requested.
    virtual Piece next(const std::stop_token &stop) = 0;
};

}  // namespace velkhost::providers
