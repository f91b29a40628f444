// How an adapter package is installed, whatever the family: its adapters are discovered, the
// package is unpacked, payloads are matched to adapters, and the vendor's service is called inside
// an update session with the management controller. A family says in one `AdapterFamily` what
// distinguishes it.
#pragma once

#include <cmpi/cmpidt.h>

#include <span>
#include <string_view>

#include "velk/bounded_text.h"
#include "velk/status_report.h"

namespace velk::adapter {

inline constexpr const char *kUnpackDirectory = "/var/tmp/ZEB/Pakro/Package/";

// Results of a payload's install. The first three are those of
// CIM_SoftwareInstallationService.InstallFromURI() (DSP1023).
inline constexpr int kSucceeded = 0;
inline constexpr int kUnsupportedTarget = 4097;
inline constexpr int kUriNotAccessible = 4107;
inline constexpr int kNoObjectPath = 1;   // our own: a path could not be built
inline constexpr int kCallFailed = 4098;  // our own: the method call failed

inline constexpr int kJobStarted = 4096;

// What an install result is reported as.
struct StatusRow {
    int result;
    int code;
    const char *message;
};

inline constexpr int kNoReport = -1;  // as `StatusRow::code`: the package keeps its status

struct AdapterFamily {
    const char *enter_line;

    // Fills the package's `DFNDeviceIDArray` or at least `dfnnumber`; null where the vendor's
    // service picks its own targets.
    void (*discover)(int index, const CMPIContext *context) = nullptr;
    const char *no_adapter_line = nullptr;  // logged before the status; null: nothing
    const char *no_adapter_message = nullptr;
    int no_adapter_result = 0;

    bool unpack_must_succeed = false;
    const char *unpacked_line;
    const char *unpack_over_line = nullptr;

    // Whether payloads are matched to adapters before the session is opened; a failure ends the
    // install without a status.
    bool matches_payloads = false;
    const char *mismatch_line = nullptr;

    const char *before_install_line = nullptr;
    void *(*watcher)(void *session_block);
    int (*install)(int index, const CMPIContext *context);
    const char *installed_line = nullptr;        // after the payloads, whatever came of them
    const char *unlisted_result_line = nullptr;  // for a result that no status row names

    const char *removed_line = nullptr;
    const char *not_removed_line = nullptr;
    std::span<const StatusRow> statuses;
    const char *exit_line = nullptr;
    bool returns_removal = false;  // the result is that of removing the unpacked files
};

// Installs package `index`. The result is not the install's: that is the status reported.
int install_package(const AdapterFamily &family, int index, const CMPIContext *context);

// "file:///var/tmp/ZEB/Pakro/Package/" and the payload's path, cut at 255 characters.
using PayloadUri = Text<256>;
PayloadUri payload_uri(const char *payload_path);

// Logs the entry unless it is null.
void log_optional(const char *line);

}  // namespace velk::adapter
