// The jobs of a provider's services as instances of a class.
#pragma once

#include "host/providers/kit/job_table.h"
#include "host/providers/kit/provider.h"
#include "host/providers/kit/shared_while_used.h"

#include <memory>
#include <string>
#include <vector>

namespace velkhost::providers {

class JobProvider : public Provider {
  public:
    // A read of a job is a pass of the step `step`, a literal.
    JobProvider(const char *class_name, const char *step);

    [[nodiscard]] const char *class_name() const override { return class_name_; }

    std::vector<Instance> instances() override;
    Instance read(const Path &path) override;
    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    const char *class_name_;
    const char *step_;
    // The services start the jobs that are shown here.
    std::shared_ptr<JobTable> jobs_ = shared_while_used<JobTable>();
};

}  // namespace velkhost::providers
