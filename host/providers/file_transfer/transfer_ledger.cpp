#include "host/providers/file_transfer/transfer_ledger.h"

#include <cerrno>

#include <unistd.h>

namespace velkhost::providers {

TransferLedger::TransferLedger(const std::vector<std::string> &paths)
    : paths_(paths.begin(), paths.end()) {}

void TransferLedger::add(const std::string &path) {
    const std::lock_guard lock(mutex_);
    paths_.insert(path);
}

TransferLedger::Outcome TransferLedger::remove(const std::string &path) {
    const std::lock_guard lock(mutex_);
    const auto known = paths_.find(path);
    if (known == paths_.end()) {
        return Outcome::kNotTransferred;
    }
    if (::unlink(path.c_str()) != 0 && errno != ENOENT) {
        return Outcome::kFailed;
    }
    paths_.erase(known);
    return Outcome::kDeleted;
}

}  // namespace velkhost::providers
