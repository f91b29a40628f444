#include "host/jobs/job.h"

#include <algorithm>
#include <chrono>
#include <utility>

#include "host/jobs/status_line.h"

namespace velkhost::jobs {

bool is_end(int state) {
    return state >= kCompleted && state <= kException;
}

std::int64_t now_us() {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    return std::chrono::duration_cast<std::chrono::microseconds>(now).count();
}

Job::Job(std::string id, Registration registration)
    : id_(std::move(id)), registration_(std::move(registration)) {
    view_.id = id_;
    view_.provider_name = registration_.provider_name;
    view_.start_us = now_us();
    view_.last_state_change_us = view_.start_us;
}

JobView Job::view() const {
    const std::lock_guard lock(mutex_);
    return view_;
}

bool Job::has_ended() const {
    const std::lock_guard lock(mutex_);
    return view_.end_us.has_value();
}

std::optional<std::int64_t> Job::removal_us() const {
    const std::lock_guard lock(mutex_);
    return view_.end_us ? std::optional(*view_.end_us + kTimeBeforeRemoval) : std::nullopt;
}

// Opened without the lock: the library's initialisers may do anything. Of two that open at the
// same time one is used.
std::shared_ptr<const Callbacks> Job::callbacks() {
    {
        const std::lock_guard lock(mutex_);
        if (callbacks_) {
            return callbacks_;
        }
    }
    auto opened = std::make_shared<const Callbacks>(registration_);
    const std::lock_guard lock(mutex_);
    if (!callbacks_ && opened->error().empty()) {
        callbacks_ = opened;
    }
    return callbacks_ ? callbacks_ : opened;
}

void Job::refresh() {
    const auto functions = callbacks();
    if (!functions->error().empty()) {
        note({kException, functions->error()});
        return;
    }
    const JobView known = view();
    if (const auto reading = functions->status(id_, {known.state, known.message})) {
        note(*reading);
    }
}

void Job::note(const Reading &reading) {
    const std::lock_guard lock(mutex_);
    const std::int64_t now = now_us();
    const bool changed = reading.state != view_.state || reading.message != view_.message;
    if (reading.state != view_.state) {
        view_.last_state_change_us = now;
    }
    if (changed && (view_.end_us || is_end(reading.state))) {
        view_.end_us = now;
    }
    view_.state = reading.state;
    view_.message = reading.message;
    const std::uint16_t otherwise = is_end(reading.state) ? 100 : 0;
    view_.percent = std::max(view_.percent, percent_complete(reading.message).value_or(otherwise));
}

void Job::clean_up() {
    callbacks()->clean_up(id_);
}

}  // namespace velkhost::jobs
