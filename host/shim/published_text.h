// A text that may be replaced while other threads read it without a lock.
#pragma once

#include <atomic>
#include <cstdlib>
#include <cstring>
#include <mutex>
#include <new>
#include <string_view>

#include "host/shim/futex.h"

namespace velkhost::shim {

// Texts are never freed, since a reader may hold one at any time; a text that was published before
// is published again rather than copied again.
class PublishedText {
  public:
    // The terminated text, or nullptr where none is published.
    [[nodiscard]] const char *get() const { return current_.load(std::memory_order_acquire); }

    // Returns false when there is no memory for the copy; the text then stays what it was.
    [[nodiscard]] bool publish(std::string_view text) {
        const std::lock_guard lock(publishing_);
        const char *copy = find(text);
        if (copy == nullptr) {
            copy = add(text);
        }
        if (copy != nullptr) {
            current_.store(copy, std::memory_order_release);
        }
        return copy != nullptr;
    }

    void withdraw() { current_.store(nullptr, std::memory_order_release); }

  private:
    struct Copy {
        Copy *older;
        char *text;
    };

    [[nodiscard]] const char *find(std::string_view text) const {
        for (const Copy *copy = newest_; copy != nullptr; copy = copy->older) {
            if (text == copy->text) {
                return copy->text;
            }
        }
        return nullptr;
    }

    const char *add(std::string_view text) {
        char *const buffer = strndup(text.data(), text.size());
        Copy *const copy = buffer == nullptr ? nullptr : new (std::nothrow) Copy{newest_, buffer};
        if (copy == nullptr) {
            std::free(buffer);
            return nullptr;
        }
        newest_ = copy;
        return buffer;
    }

    FutexMutex publishing_;
    Copy *newest_ = nullptr;
    std::atomic<const char *> current_{nullptr};
};

}  // namespace velkhost::shim
