#include "ipmi/update_session.h"

#include <unistd.h>

#include "ipmi/kcs_channel.h"
#include "ipmi/oem_request.h"
#include "ipmi/transaction.h"
#include "velk/debug_log.h"
#include "velk/request_state.h"

namespace velk {
namespace {

constexpr const char *kTransactionName = "optfw";
constexpr int kTypeNotSupported = -1;
constexpr int kSecureModeUnknown = -12;

constexpr useconds_t kSettleUs = 100'000;
constexpr useconds_t kAfterFailureUs = 200'000;
constexpr unsigned kStepSeconds = 10;
constexpr unsigned kFailedStepSeconds = 60;

int close_after(const char *message, int result) {
    log_dated(message);
    disconnect_kcs();
    return result;
}

int give_up(const char *message, int result) {
    disconnect_kcs();
    usleep(kAfterFailureUs);
    log_dated(message);
    return result;
}

int drop_transaction(int *handle, int result) {
    destroy_ipmi_transaction(handle);
    return give_up("smm : start_update_option_firmware , open_ipmi_transaction failed", result);
}

int reconnect() {
    log_dated("smm : start_update_option_firmware , loop 0 ");
    return load(kcs_fd) == -1 ? connect_kcs(kIpmiDevice) : 0;
}

// In secure mode the transaction is not opened before the update begins.
int begin_update(int *handle, bool secure) {
    log_dated("smm : start_update_option_firmware , loop1  ip optfw ");
    usleep(kSettleUs);
    if (const int result = create_ipmi_transaction(handle); result < 0) {
        return give_up("smm : start_update_option_firmware , create_ipmi_transaction failed",
                       result);
    }
    usleep(kSettleUs);
    if (!secure) {
        if (const int result = open_ipmi_transaction(*handle, kTransactionName, 1); result < 0) {
            return drop_transaction(handle, result);
        }
    }
    if (const int result = begin_opt_update(*handle); result < 0) {
        return drop_transaction(handle, result);
    }
    log_dated("smm : start_update_option_firmware , begin_opt_update successfully.");
    return 0;
}

int start_on_second_generation(int *handle) {
    int secure = 0;
    if (get_secure_mode(&secure) != 0) {
        return close_after("smm : start_update_option_firmware , get_secure_mode failed",
                           kSecureModeUnknown);
    }
    log_dated(secure != 0 ? "smm : start_update_option_firmware get_secure_mode  SecureMode "
                          : "smm : start_update_option_firmware get_secure_mode  No SecureMode ");
    if (const int result = reconnect(); result != 0) {
        return result;
    }
    return begin_update(handle, secure != 0);
}

// A step of the end of a session: the controller is given time, and more of it after a failure.
void settle(int step_result) {
    sleep(kStepSeconds);
    if (step_result != 0) {
        sleep(kFailedStepSeconds);
    }
}

int query_status(int handle) {
    OemRequest request(Operation::kStatus);
    const Outcome outcome = request.add_dword(static_cast<std::uint32_t>(handle)).send();
    switch (outcome) {
        case Outcome::kTransportFailed:
            disconnect_kcs();
            return kChannelFailed;
        case Outcome::kRefused:
            return kChannelFailed;  // and the channel stays open
        case Outcome::kSucceeded:
            log_dated("Query smm status successfully!");
            [[fallthrough]];
        case Outcome::kNotCompleted:
            disconnect_kcs();
            return 0;
    }
    return kChannelFailed;
}

}  // namespace
}  // namespace velk

int start_update_option_firmware(int *handle) {
    using namespace velk;
    log_dated("SMM : start_update_option_firmware enter .");
    if (const int result = connect_kcs(kIpmiDevice); result != 0) {
        log_dated("smm : start_update_option_firmware , connect_kcs failed");
        return result;
    }
    int type = kUnsupported;
    if (const int result = get_bmc_type(&type); result != 0) {
        return close_after("smm : start_update_option_firmware , get_bmc_type failed", result);
    }
    switch (type) {
        case kSecondGeneration:
            log_dated("smm : start_update_option_firmware , BMC  type is RXCv2");
            return start_on_second_generation(handle);
        case kFirstGeneration:
            log_dated("smm : start_update_option_firmware , BMC  type is RXCv1");
            return close_after("rxc v1 is not supported to smm", kTypeNotSupported);
        default:
            return close_after("smm : start_update_option_firmware , not support BMC type", 0);
    }
}

int get_flash_status(int handle) {
    using namespace velk;
    log_dated("SMM : get_flash_status enter .");
    if (const int result = connect_kcs(kIpmiDevice); result != 0) {
        log_dated("smm : get_flash_status , connect_kcs failed");
        return result;
    }
    int type = kUnsupported;
    const int result = get_bmc_type(&type);
    if (type != kSecondGeneration || handle == kNoTransaction) {
        disconnect_kcs();
        return result;
    }
    return query_status(handle);
}

void smm_disconnect(int *handle) {
    using namespace velk;
    log_dated("SMM : smm_disconnect enter .");
    if (connect_kcs(kIpmiDevice) != 0) {
        log_dated("smm : get_flash_status , connect_kcs failed");
        return;
    }
    settle(cancel_ipmi_transaction(*handle));
    settle(close_ipmi_transaction(*handle));
    destroy_ipmi_transaction(handle);
    disconnect_kcs();
    log_dated("smm : smm_disconnect successfully.");
}
