// ZEB_ConcreteJob: the jobs of the process as CIM instances.
#include "host/jobs/job_table.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/step_fault.h"

namespace velkhost::jobs {
namespace {

using providers::DateTime;
using providers::Instance;
using providers::Path;
using providers::Text;

// CIM_ManagedSystemElement.OperationalStatus (DSP1103).
constexpr std::uint16_t kOk = 2;
constexpr std::uint16_t kError = 6;
constexpr std::uint16_t kDormant = 15;
constexpr std::uint16_t kCompletedStatus = 17;

std::vector<std::uint16_t> operational_status(int state) {
    if (state == kNew) {
        return {kDormant};
    }
    if (!is_end(state)) {
        return {kOk};
    }
    return {kCompletedStatus, state == kCompleted ? kOk : kError};
}

DateTime moment(std::int64_t time_us) {
    return {static_cast<std::uint64_t>(time_us), false};
}

DateTime interval(std::int64_t length_us) {
    return {static_cast<std::uint64_t>(length_us), true};
}

Instance to_instance(const JobView &job) {
    const std::int64_t until = job.end_us.value_or(now_us());
    return {
        {{"InstanceID", Text(job.id)}},
        {
            {"Name", Text(job.provider_name)},
            {"JobState", static_cast<std::uint16_t>(job.state)},
            {"JobStatus", Text(job.message)},
            {"PercentComplete", job.percent},
            {"StartTime", moment(job.start_us)},
            {"ElapsedTime", interval(until - job.start_us)},
            {"TimeOfLastStateChange", moment(job.last_state_change_us)},
            {"DeleteOnCompletion", true},
            {"TimeBeforeRemoval", interval(kTimeBeforeRemoval)},
            {"OperationalStatus", operational_status(job.state)},
        },
    };
}

class JobProvider : public providers::Provider {
  public:
    // The provider goes when the broker that used it ends.
    ~JobProvider() override { JobTable::instance().abandon(); }

    [[nodiscard]] const char *class_name() const override { return "ZEB_ConcreteJob"; }

    std::vector<Instance> instances() override {
        std::vector<Instance> result;
        for (const auto &job : JobTable::instance().list()) {
            result.push_back(to_instance(job->view()));
        }
        return result;
    }

    Instance read(const Path &path) override {
        const std::string id = id_in(path);
        providers::pass_step("job.get", id);
        const auto job = JobTable::instance().find(id);
        if (!job) {
            fail_not_found();
        }
        return to_instance(job->view());
    }

    void remove(const Path &path) override {
        const std::string id = id_in(path);
        providers::pass_step("job.delete", id);
        if (!JobTable::instance().remove(id)) {
            fail_not_found();
        }
    }

    [[nodiscard]] bool may_unload() const override { return JobTable::instance().is_empty(); }

  private:
    [[nodiscard]] std::string id_in(const Path &path) const {
        const auto id = path.key("InstanceID");
        if (!id || path.key_count() != 1) {
            fail_not_found();
        }
        return *id;
    }
};

}  // namespace
}  // namespace velkhost::jobs

VELKHOST_EXPORT_PROVIDER(ZEB_ConcreteJobProvider, velkhost::jobs::JobProvider);
