#include "host/jobs/poller.h"

#include <pthread.h>
#include <signal.h>
#include <unistd.h>

#include <thread>
#include <utility>

#include "host/jobs/job_table.h"
#include "host/scenario/scenario.h"

namespace velkhost::jobs {
namespace {

// Signals are for the program's own threads; the thread created in this scope inherits the mask.
class SignalsBlocked {
  public:
    SignalsBlocked() {
        sigset_t all;
        sigfillset(&all);
        pthread_sigmask(SIG_SETMASK, &all, &before_);
    }
    ~SignalsBlocked() { pthread_sigmask(SIG_SETMASK, &before_, nullptr); }
    SignalsBlocked(const SignalsBlocked &) = delete;
    SignalsBlocked &operator=(const SignalsBlocked &) = delete;

  private:
    sigset_t before_{};
};

// False when the job needs no watching any more. No signal reaches this thread, so a pause that is
// cut short means that the host around the library, whose clock it was, is being taken down.
bool pause_for(const Job &job, unsigned seconds) {
    return sleep(seconds) == 0 && JobTable::instance().holds(job);
}

unsigned seconds_until(std::int64_t time_us) {
    constexpr std::int64_t kMicrosPerSecond = 1'000'000;
    const std::int64_t left = time_us - now_us();
    return left <= 0 ? 0 : static_cast<unsigned>((left + kMicrosPerSecond - 1) / kMicrosPerSecond);
}

// True when the job has ended, false when it is gone.
bool poll_until_ended(Job &job, unsigned interval) {
    while (pause_for(job, interval)) {
        job.refresh();
        if (job.has_ended()) {
            return true;
        }
    }
    return false;
}

// A look at the job removes it when it is out of date. Its status is asked for then, and whatever
// has changed since its end puts the removal off.
void watch_until_removed(const Job &job) {
    while (pause_for(job, seconds_until(*job.removal_us()))) {
        if (JobTable::instance().find(job.id()) == nullptr) {
            return;
        }
    }
}

void watch(const std::shared_ptr<Job> &job, unsigned interval) {
    if (poll_until_ended(*job, interval)) {
        watch_until_removed(*job);
    }
}

}  // namespace

void start_polling(std::shared_ptr<Job> job) {
    const unsigned interval = scenario::Scenario::current()->jobs.poll_seconds;
    const SignalsBlocked blocked;
    std::thread([job = std::move(job), interval] { watch(job, interval); }).detach();
}

}  // namespace velkhost::jobs
