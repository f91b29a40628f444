#include "host/cli/plain_view.h"

#include "host/cli/lines.h"
#include "host/cli/locks.h"
#include "host/cli/text.h"

namespace velkhost::cli {

void PlainView::begin(const RequestReport &request, const std::vector<std::string> &packages) {
    const std::lock_guard lock(mutex_);
    id_width_ = widest(packages);
    output_.write("velkhost: " + title_line(request, packages.size()) + "\n");
}

void PlainView::change(std::int64_t at_us, std::size_t /*package*/,
                       const rig::PackageStatus &status) {
    if (status.code == 0) {
        return;  // that a package is in the list is no news
    }
    const std::lock_guard lock(mutex_);
    output_.write(change_line(terminal_, at_us, id_width_, status, kUnlimited) + "\n");
}

void PlainView::tick(std::int64_t now_us, const JobReport &job) {
    const std::lock_guard lock(mutex_);
    const std::string line = job_line(job);
    if (job.id.empty() || job_ == line) {
        return;
    }
    job_ = line;
    output_.write("[+" + elapsed(now_us) + "] " + line + "\n");
}

void PlainView::abandon() {
    take_for_good(mutex_);
}

}  // namespace velkhost::cli
