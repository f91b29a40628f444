#include "provider/transfer_call.h"

#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/package_table.h"
#include "velk/status_report.h"

namespace velk::transfer {
namespace {

constexpr std::uint16_t kBlockSize = 2048;
constexpr int kNoReturnValue = -1;

}  // namespace

TransferCall::TransferCall(const char *no_service_line, const char *source_uri,
                           std::uint16_t option)
    : service_(cim::make_path("zeb/cimv2", "ZEB_FileTransferService")),
      has_service_(service_ != nullptr) {
    if (!has_service_) {
        log_entry(no_service_line);
    }
    in_ = cim::make_args();
    out_ = cim::make_args();
    cim::add_text(in_, "SourceURI", source_uri);
    const cim::Array options = cim::make_uint16_array(1);
    cim::set_element(options, 0, option);
    cim::add_uint16_array(in_, "TransferOptions", options);
    cim::add_uint16(in_, "BlockSize", kBlockSize);
    log_entry("Downloading... \n");
    log_untimed({}, view(source_uri));
}

int TransferCall::invoke(const CMPIContext *context, const char *method) {
    const cim::Call call = cim::invoke(context, service_, method, in_, out_);
    service_.reset();
    return call.returned ? call.value : kNoReturnValue;
}

cim::Path TransferCall::job() const {
    return cim::clone_reference(cim::argument(out_.get(), "Job"));
}

bool TransferCall::store_destination(int index, const char *invalid_message) const {
    const char *destination = cim::text_of(cim::argument(out_.get(), "DestinationURI"));
    if (out_ != nullptr && destination == nullptr) {
        update_Pkg_Install_status(index, status_code::kInvalidDestination, invalid_message);
    }
    log_value("DestinationPath is  ", view(destination));
    copy(pkgInstance[index].LocalPkgURI, view(destination));
    return out_ == nullptr || destination != nullptr;
}

void reject(int index, int code, const char *message) {
    update_Pkg_Install_status(index, code, message);
    pkgInstance[index].OrderFlag = order_flag::kRejected;
}

}  // namespace velk::transfer
