#include "host/broker/thread_book.h"

#include "host/broker/ledger.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace velkhost::broker {
namespace {

// The pages of one thread, one per broker that it has met.
class Pages {
  public:
    Pages() = default;
    Pages(const Pages &) = delete;
    Pages &operator=(const Pages &) = delete;
    ~Pages() {
        for (const auto &book : books_) {
            book->report_thread_end();
        }
    }

    ThreadBook &of(Ledger &ledger) {
        const auto place = find(ledger);
        if (place != books_.end()) {
            return **place;
        }
        return *books_.emplace_back(std::make_unique<ThreadBook>(ledger.shared_from_this()));
    }

    void drop(const Ledger &ledger) {
        const auto place = find(ledger);
        if (place != books_.end()) {
            books_.erase(place);
        }
    }

  private:
    std::vector<std::unique_ptr<ThreadBook>>::iterator find(const Ledger &ledger) {
        return std::find_if(books_.begin(), books_.end(),
                            [&ledger](const auto &book) { return book->ledger() == &ledger; });
    }

    std::vector<std::unique_ptr<ThreadBook>> books_;
};

thread_local Pages t_pages;

}  // namespace

ThreadBook &ThreadBook::of(Ledger &ledger) {
    return t_pages.of(ledger);
}

void ThreadBook::drop(const Ledger &ledger) {
    t_pages.drop(ledger);
}

ThreadBook::ThreadBook(std::shared_ptr<Ledger> ledger) : ledger_(std::move(ledger)), frames_(1) {}

ThreadBook::~ThreadBook() {
    while (!frames_.empty()) {
        leave();
    }
}

void ThreadBook::leave() {
    Link &frame = frames_.back();
    while (frame.previous != &frame) {
        Tag &tag = *frame.previous->tag;
        tag.unlink();
        ledger_->retire(tag, Life::kOver);
    }
    frames_.pop_back();
}

void ThreadBook::report_thread_end() const {
    const Link &root = frames_.front();
    for (const Link *link = root.next; link != &root; link = link->next) {
        const Tag &tag = *link->tag;
        if (tag.kind == ObjectKind::kEnumeration) {
            ledger_->note(FindingKind::kEnumerationAtThreadEnd,
                          tag.describe() + " was not released before its thread ended");
        }
    }
}

}  // namespace velkhost::broker
