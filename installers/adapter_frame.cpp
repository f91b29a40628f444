#include "installers/adapter_frame.h"

#include <algorithm>

#include "catalog/applicability.h"
#include "catalog/remove_tree.h"
#include "installers/adapter_session.h"
#include "installers/unpack.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"

namespace velk::adapter {
namespace {

constexpr StatusRow kUnlistedResult = {0, status_code::kInstallError,
                                       "Package installation error happened."};

// False after the package has been reported as having no adapter on this host.
bool discover(const AdapterFamily &family, int index, const CMPIContext *context) {
    if (family.discover == nullptr) {
        return true;
    }
    family.discover(index, context);
    if (pkgInstance[index].dfnnumber > 0) {
        return true;
    }
    log_optional(family.no_adapter_line);
    update_Pkg_Install_status(index, status_code::kInstallError, family.no_adapter_message);
    return false;
}

bool unpack(const AdapterFamily &family, int index) {
    const int result = unpack_package(pkgInstance[index].LocalPkgURI);
    if (result == 0) {
        log_entry(family.unpacked_line);
    } else if (family.unpack_must_succeed) {
        log_format("Minizip() failed: %d\n", result);
        return false;
    }
    log_optional(family.unpack_over_line);
    return true;
}

bool match_payloads(const AdapterFamily &family, int index) {
    if (!family.matches_payloads || parsePayloadDeviceIDArray(index) != 0) {
        return true;
    }
    log_optional(family.mismatch_line);
    return false;
}

const StatusRow *find_row(const AdapterFamily &family, int result) {
    const auto row = std::find_if(family.statuses.begin(), family.statuses.end(),
                                  [=](const StatusRow &known) { return known.result == result; });
    return row == family.statuses.end() ? nullptr : &*row;
}

int remove_unpacked(const AdapterFamily &family) {
    const int result = util_remove_file(kUnpackDirectory);
    log_optional(result == 0 ? family.removed_line : family.not_removed_line);
    return result;
}

void report(int index, const StatusRow &row) {
    if (row.code != kNoReport) {
        update_Pkg_Install_status(index, row.code, row.message);
    }
}

// Installs the payloads in a session and leaves nothing of it behind but the status. Returns the
// result of removing the unpacked files.
int install_in_session(const AdapterFamily &family, int index, const CMPIContext *context) {
    UpdateSession session(family.watcher);
    const int result = family.install(index, context);
    log_optional(family.installed_line);
    const StatusRow *row = find_row(family, result);
    if (row == nullptr) {
        log_optional(family.unlisted_result_line);
    }
    const int removal = remove_unpacked(family);
    session.close();
    report(index, row == nullptr ? kUnlistedResult : *row);
    return removal;
}

}  // namespace

int install_package(const AdapterFamily &family, int index, const CMPIContext *context) {
    log_entry(family.enter_line);
    if (!is_package_index(index)) {
        return kCallFailed;
    }
    if (!discover(family, index, context)) {
        return family.no_adapter_result;
    }
    if (!unpack(family, index) || !match_payloads(family, index)) {
        return 0;
    }
    log_optional(family.before_install_line);
    const int removal = install_in_session(family, index, context);
    log_optional(family.exit_line);
    return family.returns_removal ? removal : 0;
}

PayloadUri payload_uri(const char *payload_path) {
    PayloadUri uri("file://");
    uri.add(kUnpackDirectory).add(view(payload_path));
    return uri;
}

void log_optional(const char *line) {
    if (line != nullptr) {
        log_entry(line);
    }
}

}  // namespace velk::adapter
