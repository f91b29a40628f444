// The faults of a run at work: whoever serves a step asks here first whether a fault strikes.
#pragma once

#include "host/scenario/model.h"

#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::scenario {

// How a step that a fault has struck fails.
struct Fault {
    int code = 0;  // as in the rule
    std::string message;
    ControllerFault controller = ControllerFault::kNone;
    TransferFault transfer = TransferFault::kNone;
};

// Safe to use from any thread.
class VELKSCENARIO_API FaultRules {
  public:
    explicit FaultRules(std::vector<FaultRule> rules);

    // One pass of a step. Rules are asked in order and the first that strikes ends the search, so
    // a later rule sees only the passes that the earlier ones let by.
    std::optional<Fault> take(std::string_view step, std::string_view subject = {});

    // The rules that have never struck. A run that names such a rule has not tested what it says.
    [[nodiscard]] std::vector<FaultRule> unfired() const;

  private:
    struct Counted {
        FaultRule rule;
        std::uint32_t passed = 0;
        std::uint32_t struck = 0;

        bool strikes();
    };

    mutable std::mutex mutex_;
    std::vector<Counted> rules_;
};

}  // namespace velkhost::scenario
