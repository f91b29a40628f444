// Which files the file transfer service has brought to the host. Only these does it delete.
#pragma once

#include <mutex>
#include <set>
#include <string>
#include <vector>

namespace velkhost::providers {

// Safe to use from any thread.
class TransferLedger {
  public:
    // `paths` are absolute.
    explicit TransferLedger(const std::vector<std::string> &paths);

    void add(const std::string &path);

    enum class Outcome { kDeleted, kNotTransferred, kFailed };

    // Deletes a file of the ledger and forgets it. kFailed leaves the file in the ledger, and errno
    // says why; a file of the ledger that is gone already counts as deleted.
    Outcome remove(const std::string &path);

  private:
    std::mutex mutex_;
    std::set<std::string> paths_;
};

}  // namespace velkhost::providers
