// State that several users share and that goes with the last of them.
#pragma once

#include <memory>
#include <mutex>

namespace velkhost::providers {

// The one T of the process; made anew when nobody holds one.
template <typename T>
std::shared_ptr<T> shared_while_used() {
    static std::mutex mutex;
    static std::weak_ptr<T> known;
    const std::lock_guard lock(mutex);
    std::shared_ptr<T> shared = known.lock();
    if (!shared) {
        shared = std::make_shared<T>();
        known = shared;
    }
    return shared;
}

}  // namespace velkhost::providers
