// The books on every object of a broker: who owns it, whether it still lives, and what was done to
// it that a real broker would not survive or that costs it memory.
//
// As in brokers of the sfcb kind, an object made by a factory or an up-call belongs to the thread
// that made it and goes at the end of that thread's request, or of the thread itself where a
// provider started it; a clone belongs to its taker until it is released. In strict mode objects
// that are gone stay in memory, emptied, and answer INVALID_HANDLE (60), so that a later use is a
// finding and no crash; the newest kQuarantine of them are kept.
#pragma once

#include "host/broker/api.h"
#include "host/broker/finding.h"
#include "host/broker/tag.h"

#include <cmpi/cmpidt.h>

#include <deque>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_set>
#include <vector>

namespace velkhost::broker {

class VELKBROKER_API Ledger : public std::enable_shared_from_this<Ledger> {
  public:
    static constexpr std::size_t kQuarantine = 131072;

    explicit Ledger(bool strict);
    ~Ledger();
    Ledger(const Ledger &) = delete;
    Ledger &operator=(const Ledger &) = delete;

    // All findings so far, oldest first.
    [[nodiscard]] std::vector<Finding> findings() const;

    // The findings as lines of text; empty when there are none.
    [[nodiscard]] std::string report() const;

    void clear_findings();

    // Makes a finding of every clone that is alive now, each once. Call it when nothing of the
    // provider runs any more.
    void report_leaks();

    [[nodiscard]] std::size_t live_clones() const;

    // -- For the broker's own code --

    void note(FindingKind kind, std::string text);

    // Takes a new object into the books.
    void enroll(Tag &tag);

    // The release slot of every object: 0, or what a real broker answers.
    CMPIrc release(Tag &tag);

    // Whether the object may be used by `function`; a finding if not.
    bool usable(Tag &tag, const char *function);

    // Ends an object that is in no list any more. `tag` may be gone afterwards.
    void retire(Tag &tag, Life end);

    // Objects tracked from now on by the calling thread go at leave_frame.
    void enter_frame();
    void leave_frame();

    // Frees what the calling thread still tracks. Called when its broker goes.
    void drop_this_thread() const;

  private:
    void remove_clone(Tag &tag);

    const bool strict_;
    mutable std::mutex findings_lock_;
    std::vector<Finding> findings_;
    mutable std::mutex clones_lock_;
    std::unordered_set<Tag *> clones_;
    std::unordered_set<Tag *> reported_;  // clones that are findings already
    std::mutex quarantine_lock_;
    std::deque<Tag *> quarantine_;
};

// A request, or a provider call inside of one: objects made meanwhile go at its end.
class FrameScope {
  public:
    explicit FrameScope(Ledger &ledger) : ledger_(ledger) { ledger_.enter_frame(); }
    ~FrameScope() { ledger_.leave_frame(); }
    FrameScope(const FrameScope &) = delete;
    FrameScope &operator=(const FrameScope &) = delete;

  private:
    Ledger &ledger_;
};

}  // namespace velkhost::broker
