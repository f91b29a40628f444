// The thread that watches one job.
#pragma once

#include <memory>

#include "host/jobs/job.h"

namespace velkhost::jobs {

// Starts a thread that asks for the job's status at the scenario's interval until the job has
// ended, removes the job when it goes out of date, and ends when the job has left the table. It
// makes one pause for all the time until the removal, so that nothing turns while nothing happens.
// Throws std::system_error when no thread can be had.
void start_polling(std::shared_ptr<Job> job);

}  // namespace velkhost::jobs
