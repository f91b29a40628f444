#include "host/bmc/scenario_controller.h"

namespace velkhost::bmc {

Settings settings_of(const scenario::Scenario &scenario) {
    Settings settings;
    settings.generation = static_cast<Generation>(scenario.controller.type);
    settings.secure_mode = scenario.controller.secure_mode;
    return settings;
}

FaultSource faults_of(scenario::Scenario &scenario) {
    return [&scenario](std::string_view step, std::string_view subject) {
        return scenario.faults.take(step, subject);
    };
}

}  // namespace velkhost::bmc
