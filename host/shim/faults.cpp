#include "host/shim/faults.h"

#include <algorithm>
#include <array>
#include <climits>

namespace velkhost::shim {

constinit Hook<int(void *, const char *)> fault_hook;

int fault_at(std::string_view verb, std::string_view subject) {
    if (!fault_hook.is_set()) {
        return 0;
    }
    std::array<char, PATH_MAX + 32> step{};  // verbs are short, subjects below PATH_MAX
    auto end = std::ranges::copy(verb, step.begin()).out;
    if (!subject.empty()) {
        *end++ = ':';
        std::ranges::copy(subject, end);
    }
    return fault_hook(step.data());
}

}  // namespace velkhost::shim

void velkshim_set_fault_hook(velkshim_fault_hook hook, void *context) {
    velkhost::shim::fault_hook.set(hook, context);
}
