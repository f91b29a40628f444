#include "host/providers/hypervisor/update_course.h"

namespace velkhost::providers {

using scenario::JobLook;
using scenario::kJobCompleted;
using scenario::kJobException;
using scenario::kJobRunning;

namespace {

constexpr std::uint32_t kUpdateLooks = 4;

JobLook scanning() {
    return {texts::kScanning, kJobRunning, 1, false};
}

}  // namespace

std::vector<JobLook> completed_course() {
    return {scanning(),
            {texts::kUpdating, kJobRunning, kUpdateLooks, false},
            {texts::kCompleted, kJobCompleted, 1, false}};
}

std::vector<JobLook> obsolete_course() {
    return {scanning(), {texts::kObsolete, kJobCompleted, 1, false}};
}

std::vector<JobLook> failed_course(const std::string &reason) {
    return {scanning(), {texts::kFailed + reason, kJobException, 1, false}};
}

}  // namespace velkhost::providers
