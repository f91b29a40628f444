// The first and only process of the guest: loads the kernel's IPMI driver, does what the kernel's
// command line asks for (velk_actions=WORD,WORD...) and powers the machine off.
#include "tests/integration/kernel/guest/actions.h"
#include "tests/integration/kernel/guest/machine_setup.h"
#include "tests/integration/kernel/guest/text.h"

#include <cstdio>
#include <cstdlib>

int main() {
    std::puts("");  // the firmware leaves its last line open
    if (velkguest::set_up()) {
        // The kernel hands parameters that it does not know to its first process.
        const char *const actions = std::getenv("velk_actions");
        for (const std::string &action : velkguest::split(actions == nullptr ? "" : actions, ',')) {
            velkguest::act(action);
        }
        velkguest::say("end of run");
    } else {
        velkguest::say("no IPMI device");
    }
    velkguest::power_off();
}
