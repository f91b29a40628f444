#include "host/shim/thread_end.h"

#include <pthread.h>

#include "host/shim/virtual_clock.h"

namespace velkhost::shim {
namespace {

// A key's destructor and not a thread_local object: that would register itself with the C++
// runtime, which allocates, on threads that a sanitizer does not know yet.
class EndKey {
  public:
    EndKey() {
        pthread_key_create(&key_, [](void *) { virtual_clock.thread_ends(); });
        pthread_atfork(nullptr, nullptr, [] { virtual_clock.reset_after_fork(); });
    }

    // The value only has to differ from null: without one the destructor is not called.
    void watch() const { pthread_setspecific(key_, this); }

  private:
    pthread_key_t key_{};
};

const EndKey &end_key() {
    static const EndKey key;
    return key;
}

// While there is but one thread: low keys need no memory of their own.
[[gnu::constructor]] void make_end_key() {
    end_key();
}

}  // namespace

void watch_thread_end() {
    end_key().watch();
}

}  // namespace velkhost::shim
