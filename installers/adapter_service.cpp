#include "installers/adapter_service.h"

#include "catalog/applicability.h"

namespace velk::adapter {

bool add_device(PackageRecord &package, std::string_view dfn, std::string_view device_id) {
    if (package.dfnnumber < 0 || package.dfnnumber >= kMaxDevices) {
        return false;
    }
    DfnDevice &device = package.DFNDeviceIDArray[package.dfnnumber];
    copy(device.DFN, dfn);
    copy(device.DeviceID, device_id);
    ++package.dfnnumber;
    return true;
}

TrimmedDfn::TrimmedDfn(const char *vendor, const char *raw) : text_(velk::view(raw)) {
    log_format("DFN raw data from %s provider is \"%s\", to trim it.\n", vendor, text_.c_str());
    trimString(text_.buffer().data());
    log_format("DFN after trim is \"%s\"\n", text_.c_str());
}

}  // namespace velk::adapter
