#include "host/rig/status_history.h"

#include <algorithm>
#include <utility>

namespace velkhost::rig {
namespace {

std::string text_of(const PackageStatus &status) {
    return status.code ? status.id + ": " + std::to_string(*status.code) + ": " + status.message
                       : status.id;
}

// Whether `line` shows less of its package `i`, the last one, than is known.
bool merely_cuts(const StatusLine &line, std::size_t i, const PackageStatus &known) {
    return line.cut && i + 1 == line.packages.size() &&
           text_of(known).starts_with(text_of(line.packages[i]));
}

}  // namespace

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
    entries_.push_back({time_us, std::move(path), *line});
    known_.resize(std::max(known_.size(), line->packages.size()));
    for (std::size_t i = 0; i < line->packages.size(); ++i) {
        if (line->packages[i] != known_[i] && !merely_cuts(*line, i, known_[i])) {
            note({time_us, i, line->packages[i]});
        }
    }
}

void StatusHistory::note(StatusChange change) {
    known_[change.package] = change.status;
    changes_.push_back(std::move(change));
    if (listener_) {
        listener_(changes_.back());
    }
}

void StatusHistory::clear() {
    const std::lock_guard lock(mutex_);
    entries_.clear();
    changes_.clear();
    known_.clear();
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
