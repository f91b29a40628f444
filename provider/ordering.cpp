#include "provider/ordering.h"

#include <algorithm>
#include <array>
#include <string_view>

#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"

namespace velk {
namespace {

// The package that a prerequisite supersedes becomes a prerequisite as well; what does not fit the
// list is left out.
void append_superseded(PackageRecord &dependent, const PackageRecord &prerequisite) {
    if (view(prerequisite.supersedes) == "No supersedes") {
        return;
    }
    log_entry("There is supersedes info for the prereq Package.\n");
    if (dependent.prereqnum < kMaxPrerequisites) {
        copy(dependent.preReq[dependent.prereqnum], view(prerequisite.supersedes));
        ++dependent.prereqnum;
    }
}

// Puts every package with the identification code `wanted` before `dependent`; returns whether
// there is one.
bool place_prerequisite(PackageRecord &dependent, std::string_view wanted) {
    bool found = false;
    for (int i = 0; i < package_count(); ++i) {
        PackageRecord &candidate = pkgInstance[i];
        if (view(candidate.identificationCode) != wanted) {
            continue;
        }
        candidate.OrderFlag = dependent.OrderFlag - 1;
        log_entry("Prereq Package is found in xml list.\n");
        found = true;
        append_superseded(dependent, candidate);
    }
    return found;
}

// One prerequisite found anywhere in the request silences the mark for all that come after it.
void place_prerequisites() {
    bool found = false;
    for (int i = 0; i < package_count(); ++i) {
        PackageRecord &package = pkgInstance[i];
        // The list can grow while it is walked.
        for (int k = 0; k < std::min(package.prereqnum, kMaxPrerequisites); ++k) {
            const std::string_view wanted = view(package.preReq[k]);
            log_entry(view(package.identificationCode));
            log_untimed(" require to install Prereq Package ", wanted);
            found = place_prerequisite(package, wanted) || found;
            if (!found) {
                log_entry("Prereq is not found in xml list.\n");
                package.OrderFlag = order_flag::kPrerequisiteMissing;
            }
        }
    }
}

using Selected = std::array<bool, kMaxPackages>;

int first_unselected(const Selected &selected) {
    int index = 0;
    for (; index < package_count(); ++index) {
        const bool taken = selected[static_cast<std::size_t>(index)];
        log_format("ee%d:", taken ? 1 : 0);
        if (!taken) {
            break;
        }
    }
    log_format("mm%d:", index);
    return index;
}

// The lowest flag of those left; ties go to the highest index.
int select_next(const Selected &selected) {
    int current = first_unselected(selected);
    for (int i = 0; i < package_count(); ++i) {
        if (!selected[static_cast<std::size_t>(i)] &&
            pkgInstance[i].OrderFlag <= pkgInstance[current].OrderFlag) {
            current = i;
        }
    }
    return current;
}

void select_sequence() {
    Selected selected = {};
    for (int n = 0; n < package_count(); ++n) {
        const int current = select_next(selected);
        PkgSeq[n] = current;
        log_format("xx%d:", current);
        selected[static_cast<std::size_t>(current)] = true;
    }
}

void log_flags() {
    for (int i = 0; i < package_count(); ++i) {
        const PackageRecord &package = pkgInstance[i];
        log_format("%s: Order Flag is %d\n", package.identificationCode, package.OrderFlag);
    }
}

void log_sequence() {
    log_entry("Pakage installation sequence:");
    debug("\n");
    for (int n = 0; n < package_count(); ++n) {
        log_format("--%d:%s\n", PkgSeq[n], pkgInstance[PkgSeq[n]].Name);
    }
}

}  // namespace
}  // namespace velk

void OrderPkgInstallation(void) {
    velk::log_entry("Enter OrderPkgInstallation.\n");
    velk::place_prerequisites();
    velk::log_flags();
    velk::select_sequence();
    velk::log_sequence();
}
