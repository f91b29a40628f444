#include "host/providers/file_transfer/transfer.h"

#include "host/providers/file_transfer/host_pause.h"

#include <cerrno>
#include <cstring>
#include <utility>

namespace velkhost::providers {
namespace {

constexpr std::int64_t kMicrosPerSecond = 1'000'000;

FetchOutcome outcome_of_errno(int error) {
    if (error == ENOSPC || error == EDQUOT || error == EFBIG) {
        return {FetchResult::kNoSpace, "Not enough space in the file store"};
    }
    return {FetchResult::kFailed,
            std::string("The file cannot be written: ") + std::strerror(error)};
}

class Transfer {
  public:
    Transfer(TransferRun run, std::stop_token stop)
        : run_(std::move(run)), stop_(std::move(stop)) {}

    FetchOutcome execute() {
        std::optional<FetchOutcome> outcome;
        while (!outcome) {
            outcome = std::visit([this](const auto &piece) { return take(piece); },
                                 run_.source.next(stop_));
        }
        return *std::move(outcome);
    }

  private:
    // Each returns the outcome when that is clear now.
    std::optional<FetchOutcome> take(const AnnouncedSize &size);
    std::optional<FetchOutcome> take(FileBytes bytes);
    std::optional<FetchOutcome> take(const FetchOutcome &outcome);

    void keep_pace(std::uint64_t bytes);
    void report() const;

    TransferRun run_;
    std::stop_token stop_;
    TransferProgress progress_;
    std::uint64_t unpaid_ = 0;  // bytes whose time on the link has not passed yet
};

std::optional<FetchOutcome> Transfer::take(const AnnouncedSize &size) {
    progress_.total = size.bytes;
    report();
    return size.bytes > run_.file.room() ? std::optional(outcome_of_errno(ENOSPC)) : std::nullopt;
}

std::optional<FetchOutcome> Transfer::take(FileBytes bytes) {
    if (const int error = run_.file.append(bytes); error != 0) {
        return outcome_of_errno(error);
    }
    progress_.received += bytes.size();
    report();
    keep_pace(bytes.size());
    return std::nullopt;
}

std::optional<FetchOutcome> Transfer::take(const FetchOutcome &outcome) {
    if (outcome.result != FetchResult::kFetched) {
        return outcome;
    }
    if (stop_.stop_requested()) {
        return FetchOutcome{FetchResult::kFailed, "The transfer was ended"};
    }
    if (progress_.received != progress_.total.value_or(progress_.received)) {
        return FetchOutcome{FetchResult::kFailed,
                            "Wrong size: " + std::to_string(progress_.received) + " bytes, not " +
                                std::to_string(*progress_.total)};
    }
    const int error = run_.file.keep();
    return error == 0 ? outcome : outcome_of_errno(error);
}

void Transfer::keep_pace(std::uint64_t bytes) {
    if (run_.bytes_per_second == 0) {
        return;
    }
    const auto rate = std::uint64_t{run_.bytes_per_second};
    unpaid_ += bytes * kMicrosPerSecond;
    host_pause(static_cast<std::int64_t>(unpaid_ / rate), stop_);
    unpaid_ %= rate;
}

void Transfer::report() const {
    if (run_.report) {
        run_.report(progress_);
    }
}

}  // namespace

FetchOutcome run_transfer(TransferRun run, const std::stop_token &stop) {
    return Transfer(std::move(run), stop).execute();
}

}  // namespace velkhost::providers
