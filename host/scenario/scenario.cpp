#include "host/scenario/scenario.h"

#include "host/scenario/adapter_family.h"
#include "host/scenario/reader.h"

#include <mutex>
#include <utility>

namespace velkhost::scenario {
namespace {

std::mutex current_mutex;
std::shared_ptr<Scenario> current_scenario;

}  // namespace

Scenario::Scenario(Description description)
    : source(std::move(description.source)),
      host(std::move(description.host)),
      jobs(description.jobs),
      controller(std::move(description.controller)),
      file_transfer(std::move(description.file_transfer)),
      hypervisor(std::move(description.hypervisor)),
      network(std::move(description.network)),
      adapters(std::move(description.adapters)),
      management_controller(std::move(description.management_controller)),
      hypervisor_service(hypervisor.answers),
      faults(std::move(description.faults)) {
    for (const FamilyTraits &traits : kFamilyTraits) {
        const auto index = static_cast<std::size_t>(traits.family);
        adapter_services_.emplace_back(std::move(description.adapter_answers.at(index)),
                                       traits.service);
    }
}

AnswerBook &Scenario::adapter_service(AdapterFamily family) {
    return adapter_services_.at(static_cast<std::size_t>(family));
}

std::shared_ptr<Scenario> Scenario::current() {
    const std::lock_guard lock(current_mutex);
    if (!current_scenario) {
        current_scenario = std::make_shared<Scenario>(read_description_if_there(kScenarioPath));
    }
    return current_scenario;
}

void Scenario::set_current(std::shared_ptr<Scenario> scenario) {
    const std::lock_guard lock(current_mutex);
    current_scenario.swap(scenario);
}

}  // namespace velkhost::scenario
