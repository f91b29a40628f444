#include "host/shim/device_controls.h"

#include <linux/ipmi.h>
#include <sys/ioctl.h>

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <utility>

namespace velkhost::shim {
namespace {

constexpr unsigned char kHighestLun = 3;

// Requests have even network functions of six bits (IPMI 2.0, 5.1).
bool is_request_function(unsigned char netfn) {
    return netfn % 2 == 0 && netfn <= 0x3E;
}

int check_address(const ipmi_req &request, ipmi_system_interface_addr &address) {
    if (request.addr == nullptr) {
        return EFAULT;
    }
    if (request.addr_len < sizeof address || request.addr_len > sizeof(ipmi_addr)) {
        return EINVAL;
    }
    std::memcpy(&address, request.addr, sizeof address);
    const bool valid = address.addr_type == IPMI_SYSTEM_INTERFACE_ADDR_TYPE &&
                       address.channel == IPMI_BMC_CHANNEL && address.lun <= kHighestLun;
    return valid ? 0 : EINVAL;
}

// As in the driver, a request without a pointer to data has none, whatever its length says.
std::size_t length_of(const ipmi_msg &message) {
    return message.data == nullptr ? 0 : message.data_len;
}

int send(const DeviceAccess &access, const std::shared_ptr<IpmiClient> &client,
         const ipmi_req *request) {
    if (request == nullptr) {
        return EFAULT;
    }
    ipmi_system_interface_addr address = {};
    if (const int error = check_address(*request, address); error != 0) {
        return error;
    }
    const std::size_t length = length_of(request->msg);
    if (length > IPMI_MAX_MSG_LENGTH - 2) {
        return EMSGSIZE;
    }
    if (!is_request_function(request->msg.netfn)) {
        return EINVAL;
    }
    if (access.driver().is_gone()) {
        return ENODEV;
    }
    IpmiMessage message{request->msgid, request->msg.netfn, request->msg.cmd, address.lun, {}};
    message.data.assign(request->msg.data, request->msg.data + length);
    access.driver().submit(client, std::move(message), access.now_us());
    return 0;
}

void hand_over(const IpmiMessage &message, std::size_t length, ipmi_recv &out) {
    ipmi_system_interface_addr address = {};
    address.addr_type = IPMI_SYSTEM_INTERFACE_ADDR_TYPE;
    address.channel = IPMI_BMC_CHANNEL;
    address.lun = message.lun;
    std::memcpy(out.addr, &address, sizeof address);
    out.addr_len = sizeof address;
    out.recv_type = IPMI_RESPONSE_RECV_TYPE;
    out.msgid = message.id;
    out.msg.netfn = message.netfn;
    out.msg.cmd = message.cmd;
    std::copy_n(message.data.begin(), length, out.msg.data);
    out.msg.data_len = static_cast<unsigned short>(length);
}

// A message that does not fit stays queued, unless it may be cut.
int receive(IpmiClient &client, ipmi_recv *out, bool may_cut) {
    if (out == nullptr) {
        return EFAULT;
    }
    if (client.empty()) {
        return EAGAIN;
    }
    const IpmiMessage &message = client.front();
    if (out->addr_len < sizeof(ipmi_system_interface_addr)) {
        return EINVAL;
    }
    const bool fits = message.data.size() <= out->msg.data_len;
    if (!fits && !may_cut) {
        return EMSGSIZE;
    }
    if (out->addr == nullptr || out->msg.data == nullptr) {
        return EFAULT;
    }
    hand_over(message, std::min<std::size_t>(message.data.size(), out->msg.data_len), *out);
    client.pop_front();
    return fits ? 0 : EMSGSIZE;
}

}  // namespace

int control_device(const DeviceAccess &access, const std::shared_ptr<IpmiClient> &client,
                   unsigned long code, void *argument) {
    switch (code) {
        case IPMICTL_SEND_COMMAND:
            return send(access, client, static_cast<const ipmi_req *>(argument));
        case IPMICTL_RECEIVE_MSG:
            return receive(*client, static_cast<ipmi_recv *>(argument), false);
        case IPMICTL_RECEIVE_MSG_TRUNC:
            return receive(*client, static_cast<ipmi_recv *>(argument), true);
        default:
            return ENOTTY;
    }
}

}  // namespace velkhost::shim
