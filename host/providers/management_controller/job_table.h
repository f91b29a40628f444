// The update jobs that the management controller has started.
#pragma once

#include "host/scenario/answer_book.h"

#include <cstdint>
#include <deque>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::providers {

// What a caller asked for.
struct UpdateRequest {
    std::string uri;
    std::uint8_t update_operation = 0;  // 0 primary bank, 1 backup bank
    std::uint8_t reboot_option = 0;     // 1: the controller restarts after the update
};

// A job as one look at it finds it.
struct JobView {
    std::string id;
    UpdateRequest request;
    scenario::JobLook look;
};

// Safe to use from any thread. Remembers the latest kMostJobs jobs.
class JobTable {
  public:
    static constexpr std::size_t kMostJobs = 256;

    // Starts a job that shows `looks` (not empty); its id.
    std::string start(UpdateRequest request, std::vector<scenario::JobLook> looks);

    // What was asked of the job; no value when there is no such job.
    std::optional<UpdateRequest> request_of(const std::string &id) const;
    // One read of the job, which uses up one look.
    std::optional<JobView> take_look(const std::string &id);
    // All jobs as their next read will find them; uses up nothing.
    std::vector<JobView> peek_all() const;

  private:
    struct Job {
        std::string id;
        UpdateRequest request;
        scenario::JobLooks looks;
    };

    mutable std::mutex mutex_;
    std::deque<Job> jobs_;
    std::uint32_t started_ = 0;
};

}  // namespace velkhost::providers
