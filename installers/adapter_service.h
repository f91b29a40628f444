// What the families' calls to their vendors' services have in common.
#pragma once

#include <algorithm>
#include <cstring>
#include <string_view>

#include "velk/bounded_text.h"
#include "velk/cim.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"

namespace velk::adapter {

// The `SystemName` key of the last instance of a service's class; null when there is none.
class SystemName {
  public:
    // `log` is called with each value found.
    template <class Log>
    void find(const CMPIContext *context, const cim::Path &service_class, Log log) {
        const auto services = cim::Instances::of(context, service_class);
        for (const CMPIInstance *service : services) {
            const char *name = cim::key_of(service, "SystemName");
            found_ = name != nullptr;
            copy(name_.buffer(), view(name));
            log(name_.c_str());
        }
    }

    [[nodiscard]] const char *get() const { return found_ ? name_.c_str() : nullptr; }
    [[nodiscard]] const char *text() const { return name_.c_str(); }

  private:
    bool found_ = false;
    Text<256> name_;
};

// Calls `install_one(path, device)` for each of the package's payloads up to the first result other
// than 0, which is logged with `failure_format` (null: not at all) and returned. `payload_format`
// takes the payload's number, path and device.
template <class InstallOne>
int install_payloads(int index, const char *payload_format, const char *failure_format,
                     InstallOne install_one) {
    if (!is_package_index(index)) {
        return 0;
    }
    const PackageRecord &package = pkgInstance[index];
    for (int i = 0; i < std::min(package.payloadnum, kMaxPayloads); ++i) {
        const PayloadDevice &payload = package.PayloadDeviceIDArray[i];
        log_format(payload_format, i, payload.PayloadPath, payload.DeviceID);
        const int result = install_one(payload.PayloadPath, payload.DeviceID);
        if (result != 0) {
            if (failure_format != nullptr) {
                log_format(failure_format, result);
            }
            return result;
        }
    }
    return 0;
}

// For log lines.
inline const char *text_or_empty(const char *text) {
    return text == nullptr ? "" : text;
}

// Appends an adapter to the package's `DFNDeviceIDArray`. Returns false when the table is full.
bool add_device(PackageRecord &package, std::string_view dfn, std::string_view device_id);

// `raw` as trimString leaves it.
class TrimmedDfn {
  public:
    // Logged before and after, with the vendor's name as the log has it.
    TrimmedDfn(const char *vendor, const char *raw);
    [[nodiscard]] std::string_view view() const { return velk::view(text_.c_str()); }

  private:
    static constexpr std::size_t kRawSize = 1024;  // blanks around it may be many

    Text<kRawSize> text_;
};

}  // namespace velk::adapter
