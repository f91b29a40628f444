// A lock for the end of the process.
#pragma once

#include <poll.h>

namespace velkhost::cli {

// Locks and never unlocks, so that nobody else goes on; gives up after about a second of real time
// when the owner is stuck.
template <class Mutex>
void take_for_good(Mutex &mutex) {
    constexpr int kTries = 100;
    for (int i = 0; i < kTries && !mutex.try_lock(); ++i) {
        poll(nullptr, 0, 10);  // sleeping would be a pause of the host's clock
    }
}

}  // namespace velkhost::cli
