#include "host/shim/virtual_clock.h"

#include <algorithm>
#include <limits>
#include <mutex>

#include "host/shim/thread_end.h"

namespace velkhost::shim {

constinit VirtualClock virtual_clock;

// Lives in the frame of the pausing thread.
struct VirtualClock::Sleeper {
    std::int64_t wake_us = 0;
    std::int64_t left_us = 0;  // of a pause that was cut short by the end of its run
    Sleeper *next = nullptr;
    Signal woken;
};

// What a thread knows of itself; no other thread reads it.
struct VirtualClock::Self {
    unsigned run = 0;  // the run in which it takes part
    int waits = 0;     // open waits; one that waits is not counted among the running
};

VirtualClock::Self &VirtualClock::self() {
    static thread_local constinit Self instance;
    return instance;
}

namespace {

std::int64_t saturating_sum(std::int64_t time_us, std::int64_t length_us) {
    constexpr std::int64_t kEnd = std::numeric_limits<std::int64_t>::max();
    return time_us > 0 && length_us > kEnd - time_us ? kEnd : time_us + length_us;
}

}  // namespace

// ---- Runs ----

void VirtualClock::start(std::int64_t epoch_us) {
    const std::lock_guard lock(mutex_);
    cut_pauses();
    epoch_us_ = epoch_us;
    now_us_ = epoch_us;
    run_ = (run_ + 1) | 1U;
}

void VirtualClock::stop() {
    const std::lock_guard lock(mutex_);
    cut_pauses();
    run_ = (run_ + 1) & ~1U;
}

// Nobody takes part in what comes.
void VirtualClock::cut_pauses() {
    running_threads_ = 0;
    while (sleepers_ != nullptr) {
        Sleeper &sleeper = *sleepers_;
        sleepers_ = sleeper.next;
        sleeper.left_us = std::max<std::int64_t>(sleeper.wake_us - now_us(), 1);
        sleeper.woken.set();
    }
}

bool VirtualClock::takes_part() const {
    return is_running() && self().run == run_;
}

void VirtualClock::reset_after_fork() {
    mutex_.reset_after_fork();
    sleepers_ = nullptr;
    joins_ = nullptr;
    running_threads_ = takes_part() && self().waits == 0 ? 1 : 0;
}

// ---- The order of events ----

// Behind those of the same time: ties go by arrival.
void VirtualClock::insert(Sleeper &sleeper) {
    Sleeper **place = &sleepers_;
    while (*place != nullptr && (*place)->wake_us <= sleeper.wake_us) {
        place = &(*place)->next;
    }
    sleeper.next = *place;
    *place = &sleeper;
}

bool VirtualClock::remove(Sleeper &sleeper) {
    for (Sleeper **place = &sleepers_; *place != nullptr; place = &(*place)->next) {
        if (*place == &sleeper) {
            *place = sleeper.next;
            return true;
        }
    }
    return false;
}

void VirtualClock::wake(Sleeper &sleeper) {
    ++running_threads_;
    sleeper.woken.set();
}

void VirtualClock::advance() {
    if (running_threads_ > 0 || sleepers_ == nullptr) {
        return;
    }
    Sleeper &first = *sleepers_;
    sleepers_ = first.next;
    now_us_ = std::max(now_us(), first.wake_us);
    wake(first);
}

void VirtualClock::suspend_one() {
    --running_threads_;
    advance();
}

// ---- Pauses and waits ----

std::int64_t VirtualClock::pause(std::int64_t length_us) {
    Sleeper sleeper;
    unsigned run = 0;
    {
        const std::lock_guard lock(mutex_);
        if (!is_running()) {
            return length_us;  // the run has just ended
        }
        take_part();
        run = run_;
        sleeper.wake_us = saturating_sum(now_us(), std::max<std::int64_t>(length_us, 0));
        insert(sleeper);
        running_threads_ -= self().waits == 0 ? 1 : 0;
        advance();
    }
    const bool was_woken = sleeper.woken.wait_interruptibly();
    if (was_woken && self().waits == 0) {
        return sleeper.left_us;
    }
    const std::lock_guard lock(mutex_);
    const bool cut_short = remove(sleeper);
    running_threads_ += cut_short ? 1 : 0;
    if (self().waits > 0 && run == run_) {
        suspend_one();  // back to the wait around this pause
    }
    return cut_short ? sleeper.wake_us - now_us() : sleeper.left_us;
}

void VirtualClock::take_part() {
    if (self().run == run_) {
        return;
    }
    self() = Self{run_, 0};
    ++running_threads_;
    watch_thread_end();
}

void VirtualClock::enter() {
    const std::lock_guard lock(mutex_);
    if (is_running()) {
        take_part();
    }
}

void VirtualClock::leave() {
    const std::lock_guard lock(mutex_);
    if (takes_part() && self().waits == 0) {
        suspend_one();
    }
    self() = Self{};
}

void VirtualClock::wait_begin() {
    const std::lock_guard lock(mutex_);
    if (takes_part() && self().waits++ == 0) {
        suspend_one();
    }
}

void VirtualClock::wait_end() {
    const std::lock_guard lock(mutex_);
    if (takes_part() && self().waits > 0 && --self().waits == 0) {
        ++running_threads_;
    }
}

// ---- Threads ----

VirtualClock::Token VirtualClock::reserve_child() {
    const std::lock_guard lock(mutex_);
    if (!takes_part()) {
        return 0;
    }
    ++running_threads_;
    return run_;
}

void VirtualClock::cancel_child(Token token) {
    const std::lock_guard lock(mutex_);
    if (token == run_ && is_running()) {
        suspend_one();
    }
}

void VirtualClock::adopt(Token token, Begin begin, Signal &adopted) {
    self() = Self{token, 0};
    if (token != 0) {
        watch_thread_end();
    }
    Sleeper sleeper;
    {
        const std::lock_guard lock(mutex_);
        static_cast<void>(forget_ended(pthread_self()));  // the number of an earlier thread
        if (takes_part() && begin == Begin::kInTurn) {
            sleeper.wake_us = now_us();
            insert(sleeper);
            suspend_one();
        } else {
            sleeper.woken.set();
        }
    }
    adopted.set();
    sleeper.woken.wait();
}

void VirtualClock::thread_ends() {
    const std::lock_guard lock(mutex_);
    const bool counted = takes_part() && self().waits == 0;
    self() = Self{};
    if (hand_to_joiner(pthread_self())) {
        running_threads_ += counted ? 0 : 1;
        return;
    }
    remember_ended(pthread_self());
    if (counted) {
        suspend_one();
    }
}

bool VirtualClock::hand_to_joiner(pthread_t ending) {
    for (Join *join = joins_; join != nullptr; join = join->next_) {
        if (join->run_ == run_ && pthread_equal(join->target_, ending) != 0) {
            join->resumed_ = true;
            return true;
        }
    }
    return false;
}

void VirtualClock::remember_ended(pthread_t thread) {
    ended_[next_ended_] = thread;
    next_ended_ = (next_ended_ + 1) % ended_.size();
}

bool VirtualClock::forget_ended(pthread_t thread) {
    const auto place = std::ranges::find(ended_, thread);
    if (place == ended_.end()) {
        return false;
    }
    *place = pthread_t{};
    return true;
}

// ---- Joins ----

VirtualClock::Join::Join(VirtualClock &clock, pthread_t thread) : clock_(clock), target_(thread) {
    const std::lock_guard lock(clock_.mutex_);
    const bool has_ended = clock_.forget_ended(thread);
    const bool is_self = pthread_equal(thread, pthread_self()) != 0;
    if (has_ended || is_self || !clock_.takes_part() || self().waits > 0) {
        return;
    }
    run_ = clock_.run_;
    next_ = clock_.joins_;
    clock_.joins_ = this;
    clock_.suspend_one();
}

VirtualClock::Join::~Join() {
    if (run_ == 0) {
        return;
    }
    const std::lock_guard lock(clock_.mutex_);
    clock_.unlink(*this);
    if (!resumed_ && run_ == clock_.run_) {
        ++clock_.running_threads_;
    }
}

void VirtualClock::unlink(const Join &join) {
    Join **place = &joins_;
    while (*place != nullptr && *place != &join) {
        place = &(*place)->next_;
    }
    if (*place != nullptr) {
        *place = join.next_;
    }
}

}  // namespace velkhost::shim
