// How the status of a request changed: every rewrite of its status file, with the clock's time.
#pragma once

#include "host/rig/status_line.h"

#include <cstdint>
#include <functional>
#include <mutex>
#include <string>
#include <vector>

namespace velkhost::rig {

// One rewrite of the status file.
struct StatusEntry {
    std::int64_t time_us = 0;  // of the host's clock, since 1970-01-01 UTC
    std::string path;          // the fixed path that was written
    StatusLine line;
};

// One package's new status.
struct StatusChange {
    std::int64_t time_us = 0;
    std::size_t package = 0;  // its place in the request
    PackageStatus status;
};

// Safe to use from any thread.
class StatusHistory {
  public:
    // Called for every change, on the thread that wrote the file, in order and one at a time.
    using Listener = std::function<void(const StatusChange &)>;
    void set_listener(Listener listener);

    // Takes the text that `path` has just been given. A text that is no status line is left out.
    void add(std::int64_t time_us, std::string path, std::string_view text);

    // Begins anew, for another request.
    void clear();

    [[nodiscard]] std::vector<StatusEntry> entries() const;
    // A package that a line no longer shows has not changed, nor has one that is merely cut.
    [[nodiscard]] std::vector<StatusChange> changes() const;

  private:
    void note(StatusChange change);

    mutable std::recursive_mutex mutex_;  // a listener may ask for what there is
    std::vector<PackageStatus> known_;    // as far as the lines have shown
    std::vector<StatusEntry> entries_;
    std::vector<StatusChange> changes_;
    Listener listener_;
};

}  // namespace velkhost::rig
