#include "host/providers/file_transfer/transfers.h"

#include "host/providers/file_transfer/fetch_process.h"
#include "host/providers/file_transfer/host_pause.h"
#include "host/providers/kit/shared_while_used.h"

#include <exception>
#include <system_error>
#include <utility>

namespace velkhost::providers {

using scenario::TransferFault;

Transfers::Transfers(std::shared_ptr<scenario::Scenario> scenario, const std::string &store,
                     std::string program)
    : scenario_(std::move(scenario)),
      store_(store, scenario_->file_transfer.capacity),
      program_(std::move(program)),
      jobs_(shared_while_used<TransferJobs>()),
      ledger_(scenario_->file_transfer.transferred),
      workers_(scenario_->file_transfer.at_once) {}

TransferAnswer Transfers::fetch(const Location &location, std::uint16_t block_size) {
    StoredFile file = store_.create(location.file_name);
    const std::string destination = file.uri();
    const FetchOutcome outcome =
        run(request_for(location, block_size), std::move(file), {}, std::stop_token());
    return {outcome, outcome.result == FetchResult::kFetched ? destination : ""};
}

StartedTransfer Transfers::start(const Location &location, std::uint16_t block_size) {
    // A task can be copied, which a file cannot.
    auto file = std::make_shared<StoredFile>(store_.create(location.file_name));
    const StartedTransfer started{jobs_->add(location.url, file->uri()), file->uri()};
    try {
        workers_.post([this, file, id = started.job_id,
                       request = request_for(location, block_size)](const std::stop_token &stop) {
            take_part_in_host_time();
            jobs_->report(id, {});
            jobs_->end(id, run(request, std::move(*file), id, stop));
        });
    } catch (const std::system_error &) {
        jobs_->remove(started.job_id);
        throw;
    }
    return started;
}

FetchOutcome Transfers::run(const FetchRequest &request, StoredFile file, const std::string &job_id,
                            const std::stop_token &stop) {
    const auto fault = scenario_->faults.take("filetransfer.fetch", request.url);
    const TransferFault kind = fault ? fault->transfer : TransferFault::kNone;
    if (fault && kind == TransferFault::kNone) {  // one of all the service's steps
        return {FetchResult::kFailed, "Failed by the scenario: " + fault->message};
    }
    const std::string path = file.path();
    if (kind == TransferFault::kFull) {
        file.fill_up();
    }
    const std::unique_ptr<Source> source = open(request, kind);
    const FetchOutcome outcome = run_transfer(
        {*source, std::move(file), scenario_->file_transfer.bytes_per_second,
         [this, &job_id](const TransferProgress &progress) { jobs_->report(job_id, progress); }},
        stop);
    if (outcome.result == FetchResult::kFetched) {
        ledger_.add(path);
    }
    return outcome;
}

std::unique_ptr<Source> Transfers::open(const FetchRequest &request, TransferFault fault) const {
    std::unique_ptr<Source> source;
    if (fault != TransferFault::kRefuse) {
        source = std::make_unique<FetchProcess>(program_, request);
    }
    if (fault == TransferFault::kNone || fault == TransferFault::kFull) {
        return source;
    }
    return std::make_unique<FaultSource>(std::move(source), fault,
                                         scenario_->file_transfer.stall_seconds);
}

FetchRequest Transfers::request_for(const Location &location, std::uint16_t block_size) const {
    const scenario::FileTransferSettings &settings = scenario_->file_transfer;
    FetchRequest out;
    out.url = location.url;
    out.scheme = location.scheme;
    // A location that names a user stands for itself: the scenario's password is another user's.
    out.user = location.user ? *location.user : settings.user.value_or("");
    out.password = location.user ? location.password.value_or("") : settings.password.value_or("");
    out.private_key = settings.private_key.value_or("");
    out.known_hosts = settings.known_hosts.value_or("");
    out.block_size = block_size;
    out.connect_seconds = settings.connect_seconds;
    out.stall_seconds = settings.stall_seconds;
    return out;
}

}  // namespace velkhost::providers
