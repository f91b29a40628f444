// The jobs of the process.
#pragma once

#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

#include "host/jobs/job.h"

namespace velkhost::jobs {

class JobTable {
  public:
    // The table of the process. Never destroyed: threads poll to the very end.
    static JobTable &instance();

    // Makes a job with the next id and begins to poll it. Throws std::system_error without a
    // thread, std::length_error when the id has more than `longest_id` characters, and CimError
    // when the scenario says so; none of these uses up a number.
    std::shared_ptr<Job> create(Registration registration, std::size_t longest_id);

    // The jobs as clients see them now: those that have ended are asked once more, and those that
    // are out of date are removed and not among the results.
    std::vector<std::shared_ptr<Job>> list();
    std::shared_ptr<Job> find(const std::string &id);  // nullptr when there is none

    // Removes the job and has its provider clean up. False when there is no such job (any more):
    // of several callers one gets true.
    bool remove(const std::string &id);

    [[nodiscard]] bool is_empty() const;
    [[nodiscard]] bool holds(const Job &job) const;

    // Forgets all jobs and calls nobody, for the end of the host: their threads end when they wake
    // up.
    void abandon();

  private:
    [[nodiscard]] std::vector<std::shared_ptr<Job>> all() const;

    // Refreshes a job that has ended; false when it was out of date and is gone.
    bool bring_up_to_date(Job &job);

    mutable std::mutex mutex_;  // guards what follows
    std::map<std::string, std::shared_ptr<Job>> jobs_;
    unsigned issued_ = 0;  // numbers given out
};

}  // namespace velkhost::jobs
