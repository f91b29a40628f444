#include "host/providers/file_transfer/fault_source.h"

#include "host/providers/file_transfer/host_pause.h"

#include <utility>

namespace velkhost::providers {

using scenario::TransferFault;

FaultSource::FaultSource(std::unique_ptr<Source> source, TransferFault fault,
                         std::uint32_t stall_seconds)
    : source_(std::move(source)), fault_(fault), stall_seconds_(stall_seconds) {}

Piece FaultSource::next(const std::stop_token &stop) {
    if (fault_ == TransferFault::kRefuse) {
        return FetchOutcome{FetchResult::kFailed, "The server cannot be reached"};
    }
    if (has_begun_ && fault_ == TransferFault::kStall) {
        return stall(stop);
    }
    if (has_begun_ && fault_ == TransferFault::kCut) {
        return FetchOutcome{FetchResult::kFetched, {}};
    }
    Piece piece = source_->next(stop);
    if (auto *const bytes = std::get_if<FileBytes>(&piece)) {
        has_begun_ = true;
        *bytes = bytes->first(fault_ == TransferFault::kCut ? bytes->size() / 2 : bytes->size());
    }
    return piece;
}

Piece FaultSource::stall(const std::stop_token &stop) const {
    constexpr std::int64_t kMicrosPerSecond = 1'000'000;
    host_pause(stall_seconds_ * kMicrosPerSecond, stop);
    return FetchOutcome{FetchResult::kTimedOut, "Nothing came any more"};
}

}  // namespace velkhost::providers
