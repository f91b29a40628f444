#include "host/providers/kit/installation_service.h"

#include "host/providers/kit/cim_error.h"
#include "host/providers/kit/local_file.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {

InstallationService::InstallationService(const char *class_name, const char *element_name)
    : class_name_(class_name), element_name_(element_name) {
    scenario::Scenario::current();
}

std::vector<Instance> InstallationService::instances() {
    return {{keys(), {{"ElementName", Text(element_name_)}}}};
}

MethodResult InstallationService::invoke(const Path &target, const std::string &method,
                                         const Args &in) {
    if (!same_name(method, "InstallFromURI")) {
        return call(target, method, in);
    }
    check_keys(target);
    return install(in);
}

MethodResult InstallationService::call(const Path & /*target*/, const std::string &method,
                                       const Args & /*in*/) {
    fail_no_method(method);
}

void InstallationService::check_keys(const Path &target) const {
    if (!target.has_exactly(keys())) {
        fail_not_found();
    }
}

MethodResult plain_result(const scenario::ServiceAnswer &answer) {
    if (answer.status != CMPI_RC_OK) {
        throw CimError(static_cast<CMPIrc>(answer.status), answer.message);
    }
    return {answer.return_value, {}};
}

MethodResult job_result(const scenario::ServiceAnswer &answer, JobTable &jobs, const NewJob &job) {
    MethodResult result = plain_result(answer);
    if (answer.return_value != scenario::kJobStarted) {
        return result;
    }
    const std::vector<scenario::JobLook> &looks = answer.job ? *answer.job : job.usual;
    if (!looks.empty()) {
        const std::string id = jobs.start(job.class_name, job.request, looks);
        result.outputs.push_back({"Job", Reference{job.class_name, {{"InstanceID", id}}}});
    }
    return result;
}

bool is_accessible(const std::string &uri) {
    const auto path = path_of_file_uri(uri);
    return path && is_readable_file(*path);
}

}  // namespace velkhost::providers
