#include "ipmi/network_config.h"

#include <unistd.h>

#include <ctime>

#include "ipmi/node_mapping.h"
#include "velk/debug_log.h"
#include "velk/file_io.h"

namespace velk {
namespace {

constexpr const char *kNetworkFlag = "/tmp/networkflag";
constexpr int kForce = 1;
constexpr long kMaxAgeSeconds = 899;
constexpr int kChecks = 26;
constexpr unsigned kCheckSeconds = 5;

bool stamp_is_fresh() {
    int stamp = 0;
    if (gettimestamp(&stamp) != 0) {
        return false;
    }
    const auto now = static_cast<long>(std::time(nullptr));
    log_dated_format("cfgnetwork :  time is %ld.%d.", now, stamp);
    return now - stamp <= kMaxAgeSeconds;
}

bool flag_exists() {
    return access(kNetworkFlag, F_OK) == 0;
}

void wait_for_flag_taken() {
    for (int i = 0; i < kChecks && flag_exists(); ++i) {
        sleep(kCheckSeconds);
    }
}

}  // namespace
}  // namespace velk

int cfgnetwork(int force) {
    using namespace velk;
    if (force != kForce && stamp_is_fresh()) {
        return 0;
    }
    log_dated("cfgnetwork :  need recfg");
    if (!rewrite_file(kNetworkFlag, "0")) {
        return -1;
    }
    wait_for_flag_taken();
    if (!flag_exists()) {
        return 0;
    }
    unlink(kNetworkFlag);
    log_dated("cfgnetwork :  timeout");
    return -1;
}
