// The pauses of a test's threads, written down inside of them.
#pragma once

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <cstddef>
#include <cstdint>
#include <memory>
#include <vector>

namespace velktest {

// Safe to use from any thread. Without a lock: inside of a pause the thread sanitizer sees none,
// and one that it saw would order the threads that it is to watch.
class PauseLog {
  public:
    struct Entry {
        std::int64_t at_us;
        std::int64_t length_us;
    };

    void add(std::int64_t at_us, std::int64_t length_us) {
        const std::size_t place = count_.fetch_add(1, std::memory_order_relaxed);
        if (place < kMost) {
            slots_[place].at_us.store(at_us, std::memory_order_relaxed);
            slots_[place].length_us.store(length_us, std::memory_order_relaxed);
        }
    }

    // In their order, once those who pause are known to be in or behind theirs.
    [[nodiscard]] std::vector<Entry> entries() const {
        const std::size_t count = count_.load(std::memory_order_relaxed);
        EXPECT_LE(count, kMost) << "more pauses than are written down";
        std::vector<Entry> result;
        for (std::size_t i = 0; i < std::min(count, kMost); ++i) {
            result.push_back({slots_[i].at_us.load(std::memory_order_relaxed),
                              slots_[i].length_us.load(std::memory_order_relaxed)});
        }
        return result;
    }

    // Their lengths alone, in units of so many microseconds.
    [[nodiscard]] std::vector<int> lengths(std::int64_t unit_us) const {
        std::vector<int> result;
        for (const Entry &entry : entries()) {
            result.push_back(static_cast<int>(entry.length_us / unit_us));
        }
        return result;
    }

  private:
    struct Slot {
        std::atomic<std::int64_t> at_us{0};
        std::atomic<std::int64_t> length_us{0};
    };

    static constexpr std::size_t kMost = 20'000;
    std::unique_ptr<Slot[]> slots_ = std::make_unique<Slot[]>(kMost);
    std::atomic<std::size_t> count_{0};
};

}  // namespace velktest
