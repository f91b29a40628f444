#include "host/broker/trace.h"

#include "host/broker/threads.h"

#include <utility>

namespace velkhost::broker {

std::string to_text(const TraceEntry &entry) {
    const bool client = entry.side == TraceEntry::Side::kClient;
    std::string text = '#' + std::to_string(entry.number) + (client ? " client " : " up-call ");
    text += entry.operation + ' ' + entry.name_space + ':' + entry.class_name;
    text += entry.method.empty() ? "" : '.' + entry.method;
    text += '(' + entry.arguments + ')';
    if (!entry.finished) {
        return text + " ...";
    }
    text += " -> " + std::to_string(entry.status.code);
    text += entry.status.message.empty() ? "" : " \"" + entry.status.message + '"';
    return text + (entry.result.empty() ? "" : ' ' + entry.result);
}

void Trace::subscribe(Subscriber subscriber) {
    const std::lock_guard lock(lock_);
    subscriber_ = subscriber ? std::make_shared<const Subscriber>(std::move(subscriber)) : nullptr;
}

std::shared_ptr<const Trace::Subscriber> Trace::subscriber() const {
    const std::lock_guard lock(lock_);
    return subscriber_;
}

std::vector<TraceEntry> Trace::entries() const {
    const std::lock_guard lock(lock_);
    return {entries_.begin(), entries_.end()};
}

void Trace::clear() {
    const std::lock_guard lock(lock_);
    entries_.clear();
}

std::uint64_t Trace::begin(TraceEntry entry) {
    entry.thread = thread_number();
    {
        const std::lock_guard lock(lock_);
        entry.number = ++last_;
        entries_.push_back(entry);
        if (entries_.size() > kMaxEntries) {
            entries_.pop_front();
        }
    }
    if (const auto listener = subscriber()) {
        (*listener)(entry);
    }
    return entry.number;
}

void Trace::finish(std::uint64_t number, const Status &status, std::string result) {
    TraceEntry copy;
    {
        const std::lock_guard lock(lock_);
        // Numbers of the entries that are kept have no gaps.
        if (entries_.empty() || number < entries_.front().number) {
            return;
        }
        TraceEntry &entry = entries_[static_cast<std::size_t>(number - entries_.front().number)];
        entry.finished = true;
        entry.status = status;
        entry.result = std::move(result);
        copy = entry;
    }
    if (const auto listener = subscriber()) {
        (*listener)(copy);
    }
}

}  // namespace velkhost::broker
