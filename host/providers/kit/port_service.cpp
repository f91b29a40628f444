#include "host/providers/kit/port_service.h"

#include "host/providers/kit/naming.h"
#include "host/providers/kit/step_fault.h"
#include "host/scenario/adapter_family.h"
#include "host/scenario/scenario.h"

#include <algorithm>
#include <utility>

namespace velkhost::providers {
namespace {

using scenario::JobLook;
using scenario::Scenario;

// How a job goes when all is well. It is at work from its first look on.
std::vector<JobLook> usual_course() {
    const auto running = [](std::uint16_t percent, std::uint32_t looks) {
        return JobLook{"Updating flash", scenario::kJobRunning, looks, false, percent};
    };
    return {running(0, 1), running(40, 2), running(80, 1),
            JobLook{"Update completed", scenario::kJobCompleted, 1, false, std::uint16_t{100}}};
}

}  // namespace

PortService::PortService(PortServiceTraits traits)
    : InstallationService(traits.class_name, traits.element_name), traits_(std::move(traits)) {}

std::vector<Property> PortService::keys() const {
    return service_keys(traits_.system_class, host_name(), class_name(), traits_.name);
}

MethodResult PortService::install(const Args &in) {
    const std::string uri = in.text("URI");
    const Path target = in.reference("Target");
    const bool options_fit = takes_options(in);
    pass_step(scenario::name_of(traits_.family) + ".install", uri);
    if (!same_name(target.class_name(), traits_.port_class)) {
        return {kUnsupportedTarget, {}};
    }
    if (!options_fit || !has_port(target)) {
        return {kInvalidParameter, {}};
    }
    return is_accessible(uri) ? answer(uri) : MethodResult{kUriNotAccessible, {}};
}

// Whether every option that was asked for is one of the service's.
bool PortService::takes_options(const Args &in) const {
    if (traits_.options.empty()) {
        return true;
    }
    const std::vector<std::uint16_t> asked = in.uint16s("InstallOptions");
    return !asked.empty() && std::ranges::all_of(asked, [this](std::uint16_t option) {
        return std::ranges::find(traits_.options, option) != traits_.options.end();
    });
}

bool PortService::has_port(const Path &target) const {
    const auto scenario = Scenario::current();
    return std::ranges::any_of(scenario->adapters, [&](const scenario::Adapter &adapter) {
        return adapter.family == traits_.family &&
               std::ranges::any_of(adapter.*traits_.ports, [&](const std::string &id) {
                   return target.has_exactly(
                       device_keys(traits_.system_class, traits_.port_class, id));
               });
    });
}

MethodResult PortService::answer(const std::string &uri) {
    const auto given = Scenario::current()->adapter_service(traits_.family).next(uri);
    if (traits_.job_class == nullptr) {
        return plain_result(given);
    }
    return job_result(given, *jobs_, {traits_.job_class, {uri, {}}, usual_course()});
}

}  // namespace velkhost::providers
