#include "provider/package_list.h"

#include <array>
#include <string_view>

#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/request_state.h"
#include "velk/status_report.h"

namespace velk {
namespace {

constexpr char kSeparator = '|';

// Takes the next element off the list; returns whether a separator followed it.
bool take_element(std::string_view &list, std::string_view &element) {
    const std::size_t separator = list.find(kSeparator);
    element = list.substr(0, separator);
    if (separator == std::string_view::npos) {
        return false;
    }
    list.remove_prefix(separator + 1);
    return true;
}

// The location up to and with its last "/"; nothing of a location without one.
std::string_view directory_of(std::string_view location) {
    return location.substr(0, location.rfind('/') + 1);
}

void fill_record(int index, std::string_view location) {
    PackageRecord &package = pkgInstance[index];
    overlay(package.TFTPXMLPkgURIs, location);
    copy(package.TFTPPayloadPkgURIs, directory_of(view(package.TFTPXMLPkgURIs)));
    package.OrderFlag = order_flag::kInitial;
    copy(package.supersedes, "No supersedes");
    package.prereqnum = 0;
    update_Pkg_Install_status(index, status_code::kInitialized, "Package Initialization finished");
    log_format("%d", index);
    log_untimed(" Package XML path:", view(package.TFTPXMLPkgURIs));
    log_untimed(" Package URI address:", view(package.TFTPPayloadPkgURIs));
}

struct Scheme {
    std::string_view marker;
    FileLocation location;
};

// "sftp://" and "tftp://" contain "ftp://" and so are looked for first.
constexpr std::array kSchemes = {
    Scheme{"file://", kLocal},
    Scheme{"tftp://", kTftp},
    Scheme{"sftp://", kSftp},
    Scheme{"ftp://", kFtp},
};

FileLocation location_kind(std::string_view location) {
    for (const Scheme &scheme : kSchemes) {
        if (location.find(scheme.marker) != std::string_view::npos) {
            return scheme.location;
        }
    }
    log_entry("Unknown file location .\n");
    return kUnknownLocation;
}

}  // namespace
}  // namespace velk

int initPkgInstall(const char *uriList) {
    using namespace velk;
    std::string_view list = view(uriList);
    log_entry("Enter initPkgInstall.\n");
    log_value("Package URI list:", list);
    pkgInstance[0] = {};
    set_totalstatus(0);
    int count = 0;
    bool more = true;
    while (more && count < kMaxPackages) {
        std::string_view location;
        more = take_element(list, location);
        fill_record(count, location);
        ++count;
    }
    pkgnum = count;
    log_value("Total Package number is ", count);
    filelocation = location_kind(view(pkgInstance[0].TFTPXMLPkgURIs));
    log_entry("Complete initPkgInstall.\n");
    return 0;
}
