// Faults that tests and scenarios put into the broker's services.
#pragma once

#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace velkhost::broker {

// The service answers null, or no value, with this status.
struct Fault {
    int code = 0;  // CIM status
    std::string message;
};

// Asked before each service that a provider calls. `step` is "broker." and the slot's name
// ("broker.newObjectPath", "broker.invokeMethod"), `subject` the class name, "Class.Method" for
// invokeMethod, the text for newString, the element type for newArray. "broker.cloneContext" stands
// for native_clone_CMPIContext and prepareAttachThread. Called on the provider's thread with no
// lock held; it may be called by several threads at once.
using FaultHook =
    std::function<std::optional<Fault>(std::string_view step, std::string_view subject)>;

class Faults {
  public:
    void set(FaultHook hook) {
        const std::lock_guard lock(lock_);
        hook_ = hook ? std::make_shared<const FaultHook>(std::move(hook)) : nullptr;
    }

    [[nodiscard]] std::optional<Fault> ask(std::string_view step, std::string_view subject) const {
        std::shared_ptr<const FaultHook> hook;
        {
            const std::lock_guard lock(lock_);
            hook = hook_;
        }
        return hook ? (*hook)(step, subject) : std::nullopt;
    }

  private:
    mutable std::mutex lock_;
    std::shared_ptr<const FaultHook> hook_;
};

}  // namespace velkhost::broker
