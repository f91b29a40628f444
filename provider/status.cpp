// The status writer: one line per request, rewritten whole at every report.
#include <algorithm>
#include <array>
#include <string_view>

#include "catalog/descriptor.h"
#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/file_io.h"
#include "velk/package_table.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace velk {
namespace {

constexpr std::size_t kStatusLineSize = 1024;
constexpr std::size_t kFileNameSize = 100;

// A report of these codes says that the package is still on its way.
constexpr std::array kProgressCodes = {
    status_code::kInitialized, status_code::kDownloaded, status_code::kTransferring,
    status_code::kScanning,    status_code::kUpdating,   status_code::kInstalling,
};

void write_result(PackageRecord &package, int code, std::string_view message) {
    copy(package.installResult, {});
    log_entry("pkgInstance[pkgIndex].TFTPXMLPkgURIs:");
    debug(package.TFTPXMLPkgURIs);
    copy(package.installResult, view(package.TFTPXMLPkgURIs));
    debug("\ninstallResult:");
    debug(package.installResult);
    trimPackageID(package.installResult);
    log_untimed("\ninstallResult after trim:", view(package.installResult));
    print(package.installResult, view(package.installResult).size(), ": %d: ", code);
    append(package.installResult, message);
    log_format("%s\n", package.installResult);
}

// The whole completion rule: a final result of the last package of the table completes the
// request, whatever became of the others; its next progress report takes that back.
int overall_status(int index, int code) {
    const bool is_last = index == pkgnum - 1;
    const bool is_progress =
        std::find(kProgressCodes.begin(), kProgressCodes.end(), code) != kProgressCodes.end();
    return is_last && !is_progress ? 1 : 0;
}

Text<kStatusLineSize> build_status_line(int overall) {
    Text<kStatusLineSize> line;
    print(line.buffer(), 0, "%d|", overall);
    for (int i = 0; i < package_count(); ++i) {
        line.add(view(pkgInstance[i].installResult)).add("|");
    }
    return line;
}

void write_job_file(const char *line) {
    Text<kFileNameSize> path("/tmp/sfcb/velkstat");
    path.add(view(instanceID)).add(".txt");
    log_entry("Write current status into file");
    debug(path.c_str());
    debug(" for async installation.\n");
    log_value("Current result:", line);
    pthread_mutex_lock(&mutex);
    log_entry("mutex lock.\n");
    const bool written = rewrite_file(path.c_str(), line);
    log_entry(written ? "Update async status sucessfully.\n" : "update velk status fail.\n");
    pthread_mutex_unlock(&mutex);
    log_entry("mutex unlock.\n");
}

}  // namespace
}  // namespace velk

void set_totalstatus(int value) {
    velk::store(totalstatus, value);
}

int update_Pkg_Install_status(int idx, int code, const char *message) {
    using namespace velk;
    log_entry("enter update velk status.\n");
    if (!is_package_index(idx)) {
        return 0;
    }
    write_result(pkgInstance[idx], code, view(message));
    const int overall = overall_status(idx, code);
    const auto line = build_status_line(overall);
    if (load(is_async_install) == 1) {
        write_job_file(line.c_str());
    }
    set_totalstatus(overall);
    return 0;
}
