// The calls that begin and join threads, and the part that threads take in the virtual clock.
#include "host/shim/faults.h"
#include "host/shim/futex.h"
#include "host/shim/hook.h"
#include "host/shim/libc_calls.h"
#include "host/shim/velkshim.h"
#include "host/shim/virtual_clock.h"

namespace velkhost::shim {
namespace {

using ThreadBody = void *(*)(void *);

// What the new thread shall do. Lives in the frame of pthread_create, which waits until the thread
// has taken it over: memory of the heap would have to be freed on a thread that a sanitizer does
// not know yet.
struct Birth {
    ThreadBody body;
    void *argument;
    VirtualClock::Token token;
    Signal taken_over;
};

// The thread sanitizer's own pthread_create, which is in front of ours, waits until the thread has
// begun. There, who comes first stays a matter of chance.
VirtualClock::Begin begin_of_threads() {
    return __tsan_acquire == nullptr ? VirtualClock::Begin::kInTurn : VirtualClock::Begin::kAtOnce;
}

// Nothing here may be noexcept: pthread_exit and cancellation unwind through it.
void *run_thread(void *birth_of_thread) {
    Birth &birth = *static_cast<Birth *>(birth_of_thread);
    const ThreadBody body = birth.body;
    void *const argument = birth.argument;
    virtual_clock.adopt(birth.token, begin_of_threads(), birth.taken_over);
    return body(argument);
}

int create_thread(pthread_t *thread, const pthread_attr_t *attributes, ThreadBody body,
                  void *argument) {
    Birth birth{body, argument, virtual_clock.reserve_child(), {}};
    const int error = libc().pthread_create(thread, attributes, run_thread, &birth);
    if (error == 0) {
        birth.taken_over.wait();
    } else if (birth.token != 0) {
        virtual_clock.cancel_child(birth.token);
    }
    return error;
}

// The thread sanitizer, too, creates its own housekeeping thread through these calls. It pauses
// past the shim and so would hold the virtual clock up for ever. All other threads it creates with
// attributes.
bool is_sanitizers_own(const pthread_attr_t *attributes, ThreadBody body) {
    if (__tsan_acquire == nullptr || attributes != nullptr) {
        return false;
    }
    Dl_info of_body{};
    Dl_info of_sanitizer{};
    return dladdr(reinterpret_cast<void *>(body), &of_body) != 0 &&
           dladdr(reinterpret_cast<void *>(&__tsan_acquire), &of_sanitizer) != 0 &&
           of_body.dli_fbase == of_sanitizer.dli_fbase;
}

}  // namespace
}  // namespace velkhost::shim

namespace shim = velkhost::shim;

extern "C" {

VELKSHIM_API int pthread_create(pthread_t *thread, const pthread_attr_t *attributes,
                                void *(*body)(void *), void *argument) noexcept {
    if (shim::is_sanitizers_own(attributes, body)) {
        return shim::libc().pthread_create(thread, attributes, body, argument);
    }
    const int error = shim::fault_at("thread.create");
    return error != 0 ? error : shim::create_thread(thread, attributes, body, argument);
}

// Not noexcept: a join is a cancellation point.
VELKSHIM_API int pthread_join(pthread_t thread, void **result) {
    const shim::VirtualClock::Join join(shim::virtual_clock, thread);
    return shim::libc().pthread_join(thread, result);
}

}  // extern "C"

// ---- The shim's own interface ----

void velkshim_thread_enter(void) {
    shim::virtual_clock.enter();
}

void velkshim_thread_leave(void) {
    shim::virtual_clock.leave();
}

void velkshim_wait_begin(void) {
    shim::virtual_clock.wait_begin();
}

void velkshim_wait_end(void) {
    shim::virtual_clock.wait_end();
}
