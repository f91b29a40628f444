#include "host/providers/file_transfer/transfer_jobs.h"

#include "host/scenario/model.h"

#include <algorithm>

namespace velkhost::providers {

// Waiting counts as running: clients take any other state for an end.
std::uint16_t job_state_of(const TransferView &view) {
    if (!view.outcome) {
        return scenario::kJobRunning;
    }
    return view.outcome->result == FetchResult::kFetched ? scenario::kJobCompleted
                                                         : scenario::kJobException;
}

std::string job_status_of(const TransferView &view) {
    if (view.outcome) {
        return view.outcome->result == FetchResult::kFetched ? "Transfer completed"
                                                             : view.outcome->text;
    }
    if (!view.has_begun) {
        return "Waiting for other transfers";
    }
    const std::string received = std::to_string(view.progress.received);
    const std::string of_all =
        view.progress.total ? " of " + std::to_string(*view.progress.total) : "";
    return "Transferring, " + received + of_all + " bytes received";
}

std::optional<std::uint16_t> percent_of(const TransferView &view) {
    constexpr std::uint64_t kWhole = 100;
    if (job_state_of(view) == scenario::kJobCompleted) {
        return static_cast<std::uint16_t>(kWhole);
    }
    if (!view.progress.total || *view.progress.total == 0) {
        return std::nullopt;
    }
    const std::uint64_t percent = view.progress.received * kWhole / *view.progress.total;
    return static_cast<std::uint16_t>(std::min(percent, kWhole));
}

std::string TransferJobs::add(const std::string &source, const std::string &destination) {
    const std::lock_guard lock(mutex_);
    TransferView job;
    job.id = "ZEB:FileTransferJob:" + std::to_string(++added_);
    job.source = source;
    job.destination = destination;
    jobs_.push_back(job);
    if (jobs_.size() > kMostJobs) {
        jobs_.pop_front();
    }
    return job.id;
}

void TransferJobs::remove(const std::string &id) {
    const std::lock_guard lock(mutex_);
    std::erase_if(jobs_, [&id](const TransferView &job) { return job.id == id; });
}

template <typename Change>
void TransferJobs::change(const std::string &id, Change change) {
    const std::lock_guard lock(mutex_);
    const auto job = std::ranges::find(jobs_, id, &TransferView::id);
    if (job != jobs_.end()) {
        change(*job);
    }
}

void TransferJobs::report(const std::string &id, const TransferProgress &progress) {
    change(id, [&progress](TransferView &job) {
        job.has_begun = true;
        job.progress = progress;
    });
}

void TransferJobs::end(const std::string &id, const FetchOutcome &outcome) {
    change(id, [&outcome](TransferView &job) { job.outcome = outcome; });
}

std::optional<TransferView> TransferJobs::find(const std::string &id) const {
    const std::lock_guard lock(mutex_);
    const auto job = std::ranges::find(jobs_, id, &TransferView::id);
    return job == jobs_.end() ? std::nullopt : std::optional(*job);
}

std::vector<TransferView> TransferJobs::all() const {
    const std::lock_guard lock(mutex_);
    return {jobs_.begin(), jobs_.end()};
}

}  // namespace velkhost::providers
