// The transfers that go on after their caller has gone, as clients can look at them.
#pragma once

#include "host/providers/file_transfer/transfer.h"

#include <cstdint>
#include <deque>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::providers {

// A transfer as one look at it finds it.
struct TransferView {
    std::string id;
    std::string source;       // without user and password
    std::string destination;  // file:// location in the store
    bool has_begun = false;   // it no longer waits for its turn
    TransferProgress progress;
    std::optional<FetchOutcome> outcome;  // no value: it still runs
};

// CIM_ConcreteJob.JobState (DSP1103).
std::uint16_t job_state_of(const TransferView &view);

// What the transfer does or how it ended, for people. Never empty.
std::string job_status_of(const TransferView &view);

// How much of it is done; no value while that cannot be known.
std::optional<std::uint16_t> percent_of(const TransferView &view);

// Safe to use from any thread. Remembers the latest kMostJobs transfers.
class TransferJobs {
  public:
    static constexpr std::size_t kMostJobs = 256;

    // A transfer that waits for its turn; its id.
    std::string add(const std::string &source, const std::string &destination);
    // Forgets one that will never begin.
    void remove(const std::string &id);

    void report(const std::string &id, const TransferProgress &progress);
    void end(const std::string &id, const FetchOutcome &outcome);

    [[nodiscard]] std::optional<TransferView> find(const std::string &id) const;
    [[nodiscard]] std::vector<TransferView> all() const;

  private:
    template <typename Change>
    void change(const std::string &id, Change change);

    mutable std::mutex mutex_;
    std::deque<TransferView> jobs_;
    std::uint32_t added_ = 0;
};

}  // namespace velkhost::providers
