// The library's pauses of whole seconds, at a hundredth of their length and counted. This program
// is linked statically, so that its definition stands before libc's.
#include "tests/integration/kernel/guest/pauses.h"

#include <atomic>

#include <unistd.h>

namespace velkguest {
namespace {

constexpr useconds_t kMicrosPerSecond = 10'000;

std::atomic<unsigned> paused{0};
std::atomic<unsigned> begun{0};

}  // namespace

unsigned take_paused_seconds() {
    return paused.exchange(0);
}

void wait_for_pauses(unsigned count) {
    const unsigned before = begun;
    while (begun - before < count) {
        usleep(1000);
    }
}

}  // namespace velkguest

extern "C" unsigned int sleep(unsigned int seconds) {
    velkguest::paused += seconds;
    ++velkguest::begun;
    usleep(seconds * velkguest::kMicrosPerSecond);
    return 0;
}
