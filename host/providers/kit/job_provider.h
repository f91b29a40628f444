// The jobs of a provider's services as instances of a class.
#pragma once

#include "host/providers/kit/job_table.h"
#include "host/providers/kit/provider.h"
#include "host/providers/kit/shared_while_used.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace velkhost::providers {

class JobProvider : public Provider {
  public:
    // What clients of the class do to see how far a job is: read it by its name, or enumerate all.
    // Each time the job shows its next look, and the other way only what that will be.
    enum class Follow { kByRead, kByEnumeration };

    // A look is a pass of the step `step`, a literal. `jobs`: those that the services start.
    JobProvider(const char *class_name, const char *step, Follow follow = Follow::kByRead,
                std::shared_ptr<JobTable> jobs = shared_while_used<JobTable>());

    [[nodiscard]] const char *class_name() const override { return class_name_; }

    std::vector<Instance> instances() override;
    Instance read(const Path &path) override;
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    std::vector<JobView> look_at_all();
    std::optional<JobView> look_at(const JobRequest &request, const std::string &id);

    const char *class_name_;
    const char *step_;
    Follow follow_;
    std::shared_ptr<JobTable> jobs_;
};

}  // namespace velkhost::providers
