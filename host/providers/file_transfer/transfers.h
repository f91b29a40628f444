// What the file transfer service does behind its methods: begins transfers as the scenario has
// them, and keeps the books of what they brought.
#pragma once

#include "host/providers/file_transfer/fault_source.h"
#include "host/providers/file_transfer/file_store.h"
#include "host/providers/file_transfer/location.h"
#include "host/providers/file_transfer/transfer_jobs.h"
#include "host/providers/file_transfer/transfer_ledger.h"
#include "host/providers/file_transfer/worker_pool.h"
#include "host/scenario/scenario.h"

#include <cstdint>
#include <memory>
#include <string>

namespace velkhost::providers {

// How a transfer that is over before its call returns came out.
struct TransferAnswer {
    FetchOutcome outcome;
    std::string destination;  // file:// location; empty unless fetched
};

// A transfer that goes on by itself.
struct StartedTransfer {
    std::string job_id;
    std::string destination;
};

// Safe to use from any thread.
class Transfers {
  public:
    // Into the folder `store`, which is absolute; `program` fetches.
    Transfers(std::shared_ptr<scenario::Scenario> scenario, const std::string &store,
              std::string program);

    // Fetches on the calling thread. `block_size` is that of TFTP.
    TransferAnswer fetch(const Location &location, std::uint16_t block_size);

    // Has a thread of its own fetch. Throws std::system_error when nothing was begun.
    StartedTransfer start(const Location &location, std::uint16_t block_size);

    [[nodiscard]] TransferLedger &ledger() { return ledger_; }

  private:
    FetchOutcome run(const FetchRequest &request, StoredFile file, const std::string &job_id,
                     const std::stop_token &stop);
    std::unique_ptr<Source> open(const FetchRequest &request, scenario::TransferFault fault) const;
    [[nodiscard]] FetchRequest request_for(const Location &location,
                                           std::uint16_t block_size) const;

    const std::shared_ptr<scenario::Scenario> scenario_;
    const FileStore store_;
    const std::string program_;
    const std::shared_ptr<TransferJobs> jobs_;
    TransferLedger ledger_;
    WorkerPool workers_;  // last: its threads use all of the above
};

}  // namespace velkhost::providers
