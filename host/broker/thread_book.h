// The ledger's page for one thread: what the thread's requests track.
#pragma once

#include "host/broker/tag.h"

#include <deque>
#include <memory>

namespace velkhost::broker {

class ThreadBook {
  public:
    // The calling thread's page of that ledger; made at its first use, closed at the thread's end.
    static ThreadBook &of(Ledger &ledger);

    // Closes the calling thread's page of that ledger, if it has one.
    static void drop(const Ledger &ledger);

    explicit ThreadBook(std::shared_ptr<Ledger> ledger);
    ~ThreadBook();
    ThreadBook(const ThreadBook &) = delete;
    ThreadBook &operator=(const ThreadBook &) = delete;

    void track(Tag &tag) { tag.insert_before(frames_.back()); }
    void enter() { frames_.emplace_back(); }
    // Frees what was tracked since the matching enter, newest first.
    void leave();

    // The thread ends: an enumeration that is left takes a real broker's process with it.
    void report_thread_end() const;

    [[nodiscard]] const Ledger *ledger() const { return ledger_.get(); }

  private:
    std::shared_ptr<Ledger> ledger_;
    std::deque<Link> frames_;  // each the head of a ring of tags
};

}  // namespace velkhost::broker
