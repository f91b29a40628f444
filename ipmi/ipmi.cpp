#include "ipmi/ipmi.h"

#include <fcntl.h>
#include <linux/ipmi.h>
#include <poll.h>
#include <sys/ioctl.h>
#include <unistd.h>

#include <algorithm>
#include <cstring>
#include <span>

namespace velk {
namespace {

constexpr int kFailed = -1;
constexpr long kMessageId = 22444;
constexpr int kResponseTimeoutMs = 5000;
constexpr useconds_t kReceiveRetryUs = 1000;
constexpr std::size_t kReceiveSize = 272;
constexpr std::size_t kAddressSize = 40;

// The response function of a request function has the low bit set (IPMI 2.0, 5.1).
constexpr unsigned char kResponseBit = 1;

struct Response {
    ipmi_recv header;
    unsigned char address[kAddressSize];
    unsigned char data[kReceiveSize];
};

// Whether the driver took the request is not examined: a request that it refused shows as a
// response that never comes.
void submit(int fd, unsigned char cmd, std::span<unsigned char> data, unsigned char netfn) {
    ipmi_system_interface_addr address = {};
    address.addr_type = IPMI_SYSTEM_INTERFACE_ADDR_TYPE;
    address.channel = IPMI_BMC_CHANNEL;
    ipmi_req request = {};
    request.addr = reinterpret_cast<unsigned char *>(&address);
    request.addr_len = sizeof address;
    request.msgid = kMessageId;
    request.msg = {netfn, cmd, static_cast<unsigned short>(data.size()), data.data()};
    ioctl(fd, IPMICTL_SEND_COMMAND, &request);
}

bool wait_readable(int fd) {
    pollfd waiting = {fd, POLLIN, 0};
    return poll(&waiting, 1, kResponseTimeoutMs) > 0;
}

// A message is there, so it is fetched until it has been; between attempts others may run.
void receive(int fd, Response &response) {
    const auto attempt = [&] {
        response.header.addr = response.address;
        response.header.addr_len = sizeof response.address;
        response.header.msg.data = response.data;
        response.header.msg.data_len = sizeof response.data;
        return ioctl(fd, IPMICTL_RECEIVE_MSG_TRUNC, &response.header);
    };
    while (attempt() == -1) {
        usleep(kReceiveRetryUs);
    }
}

bool answers(const ipmi_recv &response, unsigned char cmd, unsigned char netfn) {
    return response.recv_type == IPMI_RESPONSE_RECV_TYPE &&
           response.msg.netfn == (netfn | kResponseBit) && response.msg.cmd == cmd;
}

}  // namespace
}  // namespace velk

int connect_ipmi(const char *path) {
    return open(path, O_RDWR);
}

void disconnect_ipmi(int fd) {
    if (fd >= 0) {
        close(fd);
    }
}

int send_kcs_IPMI_command(int fd, unsigned char cmd, unsigned char *data, unsigned short data_len,
                          unsigned char *resp, unsigned short *resp_len, unsigned char netfn) {
    using namespace velk;
    if (fd < 0) {
        return kFailed;
    }
    submit(fd, cmd, {data, data_len}, netfn);
    if (!wait_readable(fd)) {
        return kFailed;
    }
    Response response = {};
    receive(fd, response);
    if (!answers(response.header, cmd, netfn)) {
        return kFailed;
    }
    const unsigned short length = std::min({response.header.msg.data_len, *resp_len,
                                            static_cast<unsigned short>(sizeof response.data)});
    std::memcpy(resp, response.data, length);
    *resp_len = length;
    return 0;
}
