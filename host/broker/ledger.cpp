#include "host/broker/ledger.h"

#include "host/broker/thread_book.h"
#include "host/broker/threads.h"

#include <algorithm>
#include <utility>

namespace velkhost::broker {
namespace {

std::string end_of(const Tag &tag) {
    return tag.life.load() == Life::kReleased ? " after it was released"
                                              : " after its owner's end had freed it";
}

std::string here() {
    return ", by thread " + std::to_string(thread_number());
}

}  // namespace

Ledger::Ledger(bool strict) : strict_(strict) {}

Ledger::~Ledger() {
    // Clones first: their inner parts end in the quarantine.
    for (Tag *tag : clones_) {
        tag->destroy(*tag);
    }
    for (Tag *tag : quarantine_) {
        tag->destroy(*tag);
    }
}

std::vector<Finding> Ledger::findings() const {
    const std::lock_guard lock(findings_lock_);
    return findings_;
}

std::string Ledger::report() const {
    std::string text;
    for (const Finding &finding : findings()) {
        text += to_text(finding) + '\n';
    }
    return text;
}

void Ledger::clear_findings() {
    const std::lock_guard lock(findings_lock_);
    findings_.clear();
}

void Ledger::report_leaks() {
    std::vector<std::string> leaks;
    {
        const std::lock_guard lock(clones_lock_);
        for (Tag *tag : clones_) {
            if (reported_.insert(tag).second) {
                leaks.push_back(tag->describe() + " was never released");
            }
        }
    }
    std::sort(leaks.begin(), leaks.end());
    for (std::string &leak : leaks) {
        note(FindingKind::kCloneNeverReleased, std::move(leak));
    }
}

std::size_t Ledger::live_clones() const {
    const std::lock_guard lock(clones_lock_);
    return clones_.size();
}

void Ledger::note(FindingKind kind, std::string text) {
    const std::lock_guard lock(findings_lock_);
    findings_.push_back({kind, std::move(text), thread_number()});
}

void Ledger::enroll(Tag &tag) {
    if (tag.custody == Custody::kTracked) {
        ThreadBook::of(*this).track(tag);
    } else if (tag.custody == Custody::kClone) {
        const std::lock_guard lock(clones_lock_);
        clones_.insert(&tag);
    }
}

void Ledger::remove_clone(Tag &tag) {
    const std::lock_guard lock(clones_lock_);
    clones_.erase(&tag);
    reported_.erase(&tag);
}

CMPIrc Ledger::release(Tag &tag) {
    if (tag.custody == Custody::kCallArgument && tag.life.load() == Life::kAlive) {
        note(FindingKind::kArgumentReleased, tag.describe() + " was released" + here());
        const bool stays = tag.kind == ObjectKind::kObjectPath || tag.kind == ObjectKind::kInstance;
        return stays ? CMPI_RC_ERR_FAILED : CMPI_RC_OK;
    }
    if (tag.custody == Custody::kPart && tag.life.load() == Life::kAlive) {
        note(FindingKind::kPartReleased, tag.describe() + " was released" + here());
        return CMPI_RC_OK;
    }
    if (tag.custody == Custody::kTracked && tag.life.load() == Life::kAlive &&
        tag.thread != thread_number()) {
        note(FindingKind::kForeignRelease, tag.describe() + " was released" + here());
        return CMPI_RC_OK;
    }
    Life alive = Life::kAlive;
    if (!tag.life.compare_exchange_strong(alive, Life::kReleased)) {
        note(FindingKind::kSecondRelease, tag.describe() + " was released" + end_of(tag) + here());
        return CMPI_RC_ERR_INVALID_HANDLE;
    }
    if (tag.custody == Custody::kTracked) {
        tag.unlink();
    } else {
        remove_clone(tag);
    }
    retire(tag, Life::kReleased);
    return CMPI_RC_OK;
}

bool Ledger::usable(Tag &tag, const char *function) {
    if (tag.life.load() == Life::kAlive) {
        return true;
    }
    const bool argument = tag.custody == Custody::kCallArgument;
    note(argument ? FindingKind::kArgumentUsedAfterCall : FindingKind::kUseAfterRelease,
         tag.describe() + " was used by " + function + end_of(tag) + here());
    return false;
}

void Ledger::retire(Tag &tag, Life end) {
    tag.life.store(end);
    if (!strict_) {
        tag.destroy(tag);
        return;
    }
    tag.bury(tag);
    Tag *eldest = nullptr;
    {
        const std::lock_guard lock(quarantine_lock_);
        quarantine_.push_back(&tag);
        if (quarantine_.size() > kQuarantine) {
            eldest = quarantine_.front();
            quarantine_.pop_front();
        }
    }
    if (eldest != nullptr) {
        eldest->destroy(*eldest);
    }
}

void Ledger::enter_frame() {
    ThreadBook::of(*this).enter();
}

void Ledger::leave_frame() {
    ThreadBook::of(*this).leave();
}

void Ledger::drop_this_thread() const {
    ThreadBook::drop(*this);
}

}  // namespace velkhost::broker
