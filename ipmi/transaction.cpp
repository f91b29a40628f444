#include "ipmi/transaction.h"

#include <strings.h>

#include <array>
#include <cstdint>

#include "ipmi/kcs_channel.h"
#include "ipmi/oem_request.h"
#include "velk/bounded_text.h"
#include "velk/debug_log.h"
#include "velk/request_state.h"

namespace velk {
namespace {

constexpr int kDone = 0;
constexpr int kTypeQueryFailed = -1;
constexpr unsigned char kTypeQuery = 0xC1;
constexpr std::uint32_t kOpenFlagValue = 0x80;
constexpr std::size_t kMaxReturnedText = 128;

int result_of(Outcome outcome) {
    const bool done = outcome == Outcome::kSucceeded || outcome == Outcome::kNotCompleted;
    return done ? kDone : kChannelFailed;
}

OemRequest request_for(Operation operation, int handle) {
    OemRequest request(operation);
    request.add_dword(static_cast<std::uint32_t>(handle));
    return request;
}

// An operation whose whole payload is the handle; `success` is logged when it succeeded.
int operate(Operation operation, int handle, const char *success) {
    if (handle == kNoTransaction) {
        return kChannelFailed;
    }
    const Outcome outcome = request_for(operation, handle).send();
    if (outcome == Outcome::kSucceeded && success != nullptr) {
        log_dated(success);
    }
    return result_of(outcome);
}

bool contains_yes(const char *text) {
    return strcasestr(text, "yes") != nullptr;
}

}  // namespace
}  // namespace velk

int create_ipmi_transaction(int *handle) {
    using namespace velk;
    if (*handle != kNoTransaction) {
        return kChannelFailed;
    }
    OemRequest request(Operation::kCreate);
    const Outcome outcome = request.add_string("XFLASH").send();
    if (outcome == Outcome::kRefused) {
        log_dated("smm : create_ipmi_transaction failed");
    }
    if (outcome == Outcome::kSucceeded) {
        store(*handle, static_cast<int>(request.returned_dword()));
    }
    return result_of(outcome);
}

int destroy_ipmi_transaction(int *handle) {
    using namespace velk;
    if (*handle == kNoTransaction) {
        return kChannelFailed;
    }
    const Outcome outcome = request_for(Operation::kDestroy, *handle).send();
    if (outcome == Outcome::kSucceeded) {
        store(*handle, kNoTransaction);  // a watcher that begins late may be reading it
        log_dated("destroy_ipmi_transaction successfully.");
    }
    return result_of(outcome);
}

int open_ipmi_transaction(int handle, const char *name, int flag) {
    using namespace velk;
    if (handle == kNoTransaction) {
        return kChannelFailed;
    }
    OemRequest request = request_for(Operation::kOpen, handle);
    request.add_string(view(name));
    if (flag != 0) {
        request.add_dword(kOpenFlagValue);
    }
    return result_of(request.send());
}

int close_ipmi_transaction(int handle) {
    return velk::operate(velk::Operation::kClose, handle, "close_ipmi_transaction successfully.");
}

int begin_opt_update(int handle) {
    return velk::operate(velk::Operation::kBeginOptionUpdate, handle, nullptr);
}

int cancel_ipmi_transaction(int handle) {
    return velk::operate(velk::Operation::kCancel, handle, "cancel_ipmi_transaction successfully.");
}

int get_secure_mode(int *secure) {
    using namespace velk;
    OemRequest request(Operation::kGetVariable);
    const Outcome outcome = request.add_string("secure_mode").send();
    if (outcome == Outcome::kRefused) {
        log_dated("SMM :smm_ipmi_error");
    }
    if (outcome == Outcome::kSucceeded) {
        const Text<kMaxReturnedText> mode(request.returned_string());
        log_dated("smm : rxc_flash secure mode.\n");
        *secure = contains_yes(mode.c_str()) ? 1 : 0;
    }
    return result_of(outcome);
}

int get_bmc_type(int *type) {
    using namespace velk;
    std::array<unsigned char, 128> response = {};
    auto length = static_cast<unsigned short>(response.size());
    if (send_IPMI_command(kTypeQuery, nullptr, 0, response.data(), &length, kOemFunction) != 0 ||
        response[0] != 0) {
        return kTypeQueryFailed;
    }
    if ((response[2] & 0x01) != 0) {
        *type = kSecondGeneration;
    } else {
        *type = (response[1] & 0x80) != 0 ? kFirstGeneration : kUnsupported;
    }
    return kDone;
}
