// What the job library calls back: it reads the status line of a job and asks for its removal.
#include <unistd.h>

#include <optional>
#include <string_view>

#include "provider/work_area.h"
#include "velk/bounded_text.h"
#include "velk/file_io.h"
#include "velk/job_id.h"
#include "velk/status_report.h"

namespace velk {
namespace {

constexpr std::size_t kPathSize = 256;
constexpr std::size_t kLineSize = 1024;

// CIM_ConcreteJob.JobState (DSP1103).
enum JobState : int { kRunning = 4, kCompleted = 7, kException = 10 };

// The status file of a job, named by the number after the first "-" of its id; no value for an id
// without a "-".
std::optional<Text<kPathSize>> job_file(const char *instance_id) {
    const std::optional<int> number = job_number(view(instance_id));
    if (!number) {
        return std::nullopt;
    }
    Text<kPathSize> path;
    print(path.buffer(), 0, "/tmp/sfcb/velkstatVELK-%d.txt", *number);
    return path;
}

// The whole line decides, so that one package's success makes the job read as completed.
JobState job_state_of(std::string_view line) {
    const auto has = [line](std::string_view text) {
        return line.find(text) != std::string_view::npos;
    };
    if (has("successfully") || has("already")) {
        return kCompleted;
    }
    return has("running") || has("Initialization") ? kRunning : kException;
}

void record_query(const char *instance_id, const char *message) {
    Text<2 * kLineSize> record("begin to record ");
    record.add(instance_id).add("-").add(message).add("\n");
    rewrite_file(kStatusQueryRecord, record.c_str());
}

}  // namespace
}  // namespace velk

int getVELKStatus(const char *instance_id, int *job_state, char *message, int message_size) {
    using namespace velk;
    const auto path = job_file(instance_id);
    if (!path) {
        return 0;
    }
    char line[kLineSize];
    if (!LineReader(path->c_str()).next(line)) {
        return 0;
    }
    const char *told = line;
    if (message != nullptr && message_size > 0) {
        const std::span<char> text(message, static_cast<std::size_t>(message_size));
        copy(text, view(line));
        text.back() = '\0';
        told = message;
    }
    record_query(instance_id, told);
    if (job_state != nullptr) {
        *job_state = job_state_of(view(line));
    }
    return 0;
}

int VELKStatusCleanup(const char *instance_id) {
    const auto path = velk::job_file(instance_id);
    return path && unlink(path->c_str()) == 0 ? 1 : 0;
}
