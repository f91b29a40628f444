// ZEB_FileTransferJob: how far a transfer is.
#include "host/providers/file_transfer/transfer_jobs.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/shared_while_used.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {
namespace {

Instance describe(const TransferView &view) {
    Instance out{{{"InstanceID", Text(view.id)}},
                 {{"Name", Text("TransferViaURL")},
                  {"JobStatus", Text(job_status_of(view))},
                  {"JobState", job_state_of(view)},
                  {"SourceURI", Text(view.source)},
                  {"DestinationURI", Text(view.destination)}}};
    if (const auto percent = percent_of(view)) {
        out.properties.push_back({"PercentComplete", *percent});
    }
    return out;
}

class FileTransferJob final : public Provider {
  public:
    FileTransferJob() { scenario::Scenario::current(); }  // fails while it is unusable

    [[nodiscard]] const char *class_name() const override { return "ZEB_FileTransferJob"; }

    std::vector<Instance> instances() override {
        std::vector<Instance> out;
        for (const TransferView &view : jobs_->all()) {
            out.push_back(describe(view));
        }
        return out;
    }

    Instance read(const Path &path) override {
        const auto view = jobs_->find(path.key("InstanceID").value_or(""));
        if (!view || path.key_count() != 1) {
            fail_not_found();
        }
        pass_step("filetransfer.job", view->source);
        return describe(*view);
    }

    [[nodiscard]] bool may_unload() const override { return false; }

  private:
    std::shared_ptr<TransferJobs> jobs_ = shared_while_used<TransferJobs>();
};

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(ZEB_FileTransferJobProvider, velkhost::providers::FileTransferJob);
