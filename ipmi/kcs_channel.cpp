#include "ipmi/kcs_channel.h"

#include "ipmi/ipmi.h"
#include "velk/request_state.h"

// Closed from load on, so that a disconnect before the first connect closes nothing of the broker.
int kcs_fd = -1;

int connect_kcs(const char *path) {
    const int fd = connect_ipmi(path);
    velk::store(kcs_fd, fd);
    return fd < 0 ? velk::kChannelFailed : 0;
}

void disconnect_kcs(void) {
    disconnect_ipmi(velk::load(kcs_fd));
    velk::store(kcs_fd, -1);
}

int send_IPMI_command(unsigned char cmd, unsigned char *data, unsigned short data_len,
                      unsigned char *resp, unsigned short *resp_len, unsigned char netfn) {
    const int result =
        send_kcs_IPMI_command(velk::load(kcs_fd), cmd, data, data_len, resp, resp_len, netfn);
    return result == 0 ? 0 : velk::kChannelFailed;
}
