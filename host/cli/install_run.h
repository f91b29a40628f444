// One run of a request from the setting-up of its host to the report.
#pragma once

#include "host/cli/guarded_rig.h"
#include "host/cli/install_options.h"
#include "host/cli/interrupt.h"
#include "host/cli/report.h"
#include "host/cli/view.h"

namespace velkhost::cli {

class InstallRun {
  public:
    // Sets the host up. All references must outlive the run. Throws what GuardedRig throws.
    InstallRun(const InstallOptions &options, Interrupt &interrupt, View &view);
    ~InstallRun();
    InstallRun(const InstallRun &) = delete;
    InstallRun &operator=(const InstallRun &) = delete;

    // Once.
    RunReport execute();

    // Keeps a temporary run folder, so that what the report names can be opened, unless it is to
    // be discarded or nobody can know its name.
    void finish(bool was_shown);

    // The end of a run whose threads are still at work.
    [[noreturn]] void end_process(int code);

  private:
    [[nodiscard]] bool stays() const;
    [[nodiscard]] std::int64_t since_start() const;
    void tick();
    void follow();
    void settle_job();
    void read_job();
    void fill_request();
    void fill_packages();
    void fill_history();
    void fill_places();
    void fill_log();

    const InstallOptions &options_;
    Interrupt &interrupt_;
    View &view_;
    const double real_start_;
    std::vector<std::string> locations_;
    GuardedRig rig_;
    RunReport report_;
    std::int64_t next_look_us_ = 0;  // at the job
};

}  // namespace velkhost::cli
