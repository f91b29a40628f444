// BRCMFWUP_SoftwareInstallationService: installs while its caller goes on, and is asked how far it
// has come. It has no jobs; an update is known by its number, and 0 stands for the latest.
#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/export.h"
#include "host/providers/kit/folder_service.h"
#include "host/scenario/answer_book.h"

#include <mutex>
#include <optional>
#include <utility>

namespace velkhost::providers {
namespace {

using scenario::JobLook;

// Return values of CheckStatus.
constexpr std::uint32_t kAnswered = 0;
constexpr std::uint32_t kNoSuchUpdate = 2;

constexpr const char *kLatest = "0";

// How an update goes when all is well.
std::vector<JobLook> usual_course() {
    return {JobLook{std::nullopt, scenario::kUpdateRunning, 3, false},
            JobLook{std::nullopt, scenario::kUpdateDone, 1, false}};
}

class BrcmService final : public FolderService {
  public:
    BrcmService()
        : FolderService({.family = scenario::AdapterFamily::kBroadcom,
                         .class_name = "BRCMFWUP_SoftwareInstallationService",
                         .name = "BRCMFWUPSoftwareInstallationService",
                         .element_name = "Network adapter firmware update",
                         .system_class = "BRCMFWUP Provider",
                         .not_applicable = kUnsupportedTarget}) {}

  protected:
    MethodResult install(const Args &in) override;
    MethodResult call(const Path &target, const std::string &method, const Args &in) override;

  private:
    void begin(const scenario::ServiceAnswer &answer, const std::string &subject);
    MethodResult check_status(const std::string &id);
    std::string subject();
    std::optional<JobLook> take_look();

    std::mutex mutex_;
    std::optional<scenario::JobLooks> latest_;
    std::string subject_;  // of the latest update
};

MethodResult BrcmService::install(const Args &in) {
    const std::string place = in.text("URI");
    const std::string option = in.text("FacadeOption");
    std::string subject;
    const std::uint32_t obstacle = examine(place, subject);
    pass("install", subject);
    if (option != "asyn") {
        return {kInvalidParameter, {}};
    }
    if (obstacle != 0) {
        return {obstacle, {}};
    }
    const scenario::ServiceAnswer answer = next_answer(subject);
    const MethodResult result = plain_result(answer);
    if (result.return_value == scenario::kJobStarted) {
        begin(answer, subject);
    }
    return result;
}

void BrcmService::begin(const scenario::ServiceAnswer &answer, const std::string &subject) {
    const std::lock_guard lock(mutex_);
    std::vector<JobLook> looks = answer.job.value_or(usual_course());
    latest_.reset();
    if (!looks.empty()) {
        latest_.emplace(std::move(looks));
    }
    subject_ = subject;
}

MethodResult BrcmService::call(const Path &target, const std::string &method, const Args &in) {
    if (!same_name(method, "CheckStatus")) {
        fail_no_method(method);
    }
    check_keys(target);
    return check_status(in.text("ID"));
}

MethodResult BrcmService::check_status(const std::string &id) {
    pass("status", subject());
    const auto look = id == kLatest ? take_look() : std::nullopt;
    if (!look) {
        return {kNoSuchUpdate, {}};
    }
    MethodResult result{kAnswered, {}};
    if (!look->absent) {
        result.outputs.push_back({"status", std::uint32_t{look->job_state}});
    }
    return result;
}

std::string BrcmService::subject() {
    const std::lock_guard lock(mutex_);
    return subject_;
}

std::optional<JobLook> BrcmService::take_look() {
    const std::lock_guard lock(mutex_);
    return latest_ ? std::optional(latest_->take()) : std::nullopt;
}

}  // namespace
}  // namespace velkhost::providers

VELKHOST_EXPORT_PROVIDER(BRCMFWUP_SoftwareInstallationServiceProvider,
                         velkhost::providers::BrcmService);
