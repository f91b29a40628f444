// The jobs that a provider's services have started.
#pragma once

#include "host/providers/kit/data.h"
#include "host/scenario/answer_book.h"

#include <cstdint>
#include <deque>
#include <mutex>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::providers {

// What a job was started for.
struct JobRequest {
    std::string uri;
    std::vector<Property> shown;  // what the job's instance tells of it
};

// A job as one look at it finds it.
struct JobView {
    std::string id;
    JobRequest request;
    scenario::JobLook look;
};

// Safe to use from any thread. Remembers the latest kMostJobs jobs.
class JobTable {
  public:
    static constexpr std::size_t kMostJobs = 256;

    // Starts a job of the class that shows `looks` (not empty); its id.
    std::string start(const std::string &job_class, JobRequest request,
                      std::vector<scenario::JobLook> looks);

    // What was asked of the job; no value when there is no such job.
    std::optional<JobRequest> request_of(const std::string &id) const;
    // One read of the job, which uses up one look.
    std::optional<JobView> take_look(const std::string &id);
    // One read of every job, in the order in which they were started.
    std::vector<JobView> take_all();
    // All jobs as their next read will find them; uses up nothing.
    std::vector<JobView> peek_all() const;

  private:
    struct Job {
        std::string id;
        JobRequest request;
        scenario::JobLooks looks;
    };

    mutable std::mutex mutex_;
    std::deque<Job> jobs_;
    std::uint32_t started_ = 0;
};

}  // namespace velkhost::providers
