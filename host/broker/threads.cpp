#include "host/broker/threads.h"

#include "host/shim/velkshim.h"

#include <atomic>
#include <thread>

// The broker also runs without the shim.
#pragma weak velkshim_wait_begin
#pragma weak velkshim_wait_end

namespace velkhost::broker {

unsigned thread_number() {
    static std::atomic<unsigned> last{0};
    thread_local const unsigned own = ++last;
    return own;
}

WaitGuard::WaitGuard() {
    if (&velkshim_wait_begin != nullptr) {
        velkshim_wait_begin();
    }
}

WaitGuard::~WaitGuard() {
    if (&velkshim_wait_end != nullptr) {
        velkshim_wait_end();
    }
}

void run_on_fresh_thread(const std::function<void()> &work) {
    std::thread request(work);
    const WaitGuard waiting;
    request.join();
}

}  // namespace velkhost::broker
