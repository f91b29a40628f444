// Where the scenario's faults strike a provider.
#pragma once

#include <string_view>

namespace velkhost::providers {

// One pass of the step: throws CimError with the fault's status when a fault strikes it.
void pass_step(std::string_view step, std::string_view subject);

}  // namespace velkhost::providers
