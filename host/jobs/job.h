// One job: what is known of it, and when it may go.
#pragma once

#include <cstdint>
#include <memory>
#include <mutex>
#include <optional>
#include <string>

#include "host/jobs/callbacks.h"

namespace velkhost::jobs {

// CIM_ConcreteJob.JobState (DSP1103).
inline constexpr int kNew = 2;
inline constexpr int kCompleted = 7;
inline constexpr int kTerminated = 8;
inline constexpr int kKilled = 9;
inline constexpr int kException = 10;

bool is_end(int state);

// How long a job stays readable after its end: CIM_ConcreteJob.TimeBeforeRemoval's default.
inline constexpr std::int64_t kTimeBeforeRemoval = 300 * 1'000'000LL;

// The host's clock, in microseconds since 1970-01-01 UTC.
std::int64_t now_us();

// What clients see of a job at one moment.
struct JobView {
    std::string id;
    std::string provider_name;
    int state = kNew;
    std::string message;
    std::uint16_t percent = 0;
    std::int64_t start_us = 0;
    std::int64_t last_state_change_us = 0;
    std::optional<std::int64_t> end_us;
};

// Safe to use from any thread. No lock is held while the provider's functions run.
class Job {
  public:
    Job(std::string id, Registration registration);

    [[nodiscard]] const std::string &id() const { return id_; }

    [[nodiscard]] JobView view() const;

    // Asks the status function. A library or function that cannot be had is an exception of the
    // job, which a later call may cure.
    void refresh();

    // Whether a state that ends has ever been told: the job then is no more polled.
    [[nodiscard]] bool has_ended() const;

    // When the job goes out of date: some time after its end, or after the last change that was
    // seen since, for a request may go on behind a state that looks like its end. No value before
    // the end.
    [[nodiscard]] std::optional<std::int64_t> removal_us() const;

    // Calls the clean-up function. To be called once, when the job has left the table.
    void clean_up();

  private:
    [[nodiscard]] std::shared_ptr<const Callbacks> callbacks();
    void note(const Reading &reading);

    const std::string id_;
    const Registration registration_;
    mutable std::mutex mutex_;  // guards what follows
    std::shared_ptr<const Callbacks> callbacks_;
    JobView view_;
};

}  // namespace velkhost::jobs
