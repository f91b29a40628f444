#include "host/providers/kit/step_fault.h"

#include "host/providers/kit/cim_error.h"
#include "host/scenario/scenario.h"

namespace velkhost::providers {

void pass_step(std::string_view step, std::string_view subject) {
    const auto fault = scenario::Scenario::current()->faults.take(step, subject);
    if (fault) {
        throw CimError(static_cast<CMPIrc>(fault->code), fault->message);
    }
}

}  // namespace velkhost::providers
