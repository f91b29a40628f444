// A management controller as a user of its system interface sees it: the type query and the flash
// transactions of its OEM commands, what a driver's probe asks, and faults by rule. It knows no
// device and no clock: who calls it brings request and time.
#pragma once

#include "host/bmc/answer.h"
#include "host/bmc/flash_service.h"
#include "host/bmc/message.h"
#include "host/bmc/standard_commands.h"
#include "host/bmc/trace.h"
#include "host/scenario/fault_rules.h"

#include <functional>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace velkhost::bmc {

enum class Generation : std::uint8_t { kNone = 0, kFirst = 1, kSecond = 2 };

struct Settings {
    Generation generation = Generation::kSecond;
    std::string secure_mode = "no";  // text of the variable, up to 127 characters
    std::uint32_t first_handle = 1;
};

// Asked once for each request: the step is "bmc." and the operation (README.md has the list), the
// subject the request in words. The fault's `controller` says what happens.
using FaultSource =
    std::function<std::optional<scenario::Fault>(std::string_view step, std::string_view subject)>;

// Safe to use from any thread.
class Controller {
  public:
    explicit Controller(Settings settings, FaultSource faults = {});

    // One request that comes at `now_us`.
    Reply handle(const Request &request, std::int64_t now_us);

    // Every exchange so far, in order.
    [[nodiscard]] std::vector<Exchange> trace() const;

    [[nodiscard]] TransactionState transaction_state() const;

  private:
    // A request, understood: by what name faults strike it, and how it is served.
    struct Call {
        std::string step;
        std::string words;
        std::function<Answer()> serve;
        Answer refused;
    };

    Call understand(const Request &request);
    Call flash_call(const Request &request);
    Answer serve_type_query(const Request &request) const;
    Reply reply_to(const Request &request, const Call &call, std::string &words);

    const Settings settings_;
    const FaultSource faults_;
    mutable std::mutex mutex_;
    StandardCommands standard_;
    FlashService flash_;
    bool gone_ = false;
    std::vector<Exchange> trace_;
};

}  // namespace velkhost::bmc
