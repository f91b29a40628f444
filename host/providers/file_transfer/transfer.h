// One transfer: from a source into a file of the store.
#pragma once

#include "host/providers/file_transfer/file_store.h"
#include "host/providers/file_transfer/source.h"

#include <cstdint>
#include <functional>
#include <optional>
#include <stop_token>

namespace velkhost::providers {

struct TransferProgress {
    std::uint64_t received = 0;
    std::optional<std::uint64_t> total;  // no value: not announced
};

struct TransferRun {
    Source &source;
    StoredFile file;
    std::uint32_t bytes_per_second = 0;  // of the host's time; 0: takes none
    std::function<void(const TransferProgress &)> report = {};
};

// Reads the source to its end. Fetched means that the whole file has arrived, as long as it was
// announced to be, and stays in the store; any other outcome leaves no file behind.
FetchOutcome run_transfer(TransferRun run, const std::stop_token &stop);

}  // namespace velkhost::providers
