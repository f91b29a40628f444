#include "host/rig/status_history.h"

#include <utility>

namespace velkhost::rig {

std::vector<StatusChange> changes_between(const StatusLine &before, const StatusEntry &after) {
    std::vector<StatusChange> changes;
    for (std::size_t i = 0; i < after.line.packages.size(); ++i) {
        const PackageStatus &now = after.line.packages[i];
        if (i >= before.packages.size() || before.packages[i] != now) {
            changes.push_back({after.time_us, i, now});
        }
    }
    return changes;
}

void StatusHistory::set_listener(Listener listener) {
    const std::lock_guard lock(mutex_);
    listener_ = std::move(listener);
}

void StatusHistory::add(std::int64_t time_us, std::string path, std::string_view text) {
    auto line = parse_status_line(text);
    if (!line) {
        return;
    }
    const std::lock_guard lock(mutex_);
    const StatusLine before = entries_.empty() ? StatusLine{} : entries_.back().line;
    entries_.push_back({time_us, std::move(path), *std::move(line)});
    for (StatusChange &change : changes_between(before, entries_.back())) {
        changes_.push_back(change);
        if (listener_) {
            listener_(change);
        }
    }
}

void StatusHistory::clear() {
    const std::lock_guard lock(mutex_);
    entries_.clear();
    changes_.clear();
}

std::vector<StatusEntry> StatusHistory::entries() const {
    const std::lock_guard lock(mutex_);
    return entries_;
}

std::vector<StatusChange> StatusHistory::changes() const {
    const std::lock_guard lock(mutex_);
    return changes_;
}

}  // namespace velkhost::rig
