#include "tests/integration/kernel/guest/device.h"

#include "tests/integration/kernel/guest/text.h"

#include <array>
#include <cerrno>
#include <cstring>

#include <poll.h>
#include <sys/ioctl.h>

namespace velkguest {
namespace {

std::string result_of(int result) {
    return result == 0 ? "ok" : strerrorname_np(errno);
}

std::string in_words(const ipmi_recv &answer) {
    return "id=" + std::to_string(answer.msgid) + " netfn=" + hex(answer.msg.netfn) +
           " cmd=" + hex(answer.msg.cmd) +
           " data=" + hex(std::span(answer.msg.data, answer.msg.data_len));
}

}  // namespace

std::string send(int fd, const Send &request) {
    ipmi_system_interface_addr address = {};
    address.addr_type = IPMI_SYSTEM_INTERFACE_ADDR_TYPE;
    address.channel = request.channel;
    ipmi_req out = {};
    out.addr = reinterpret_cast<unsigned char *>(&address);
    out.addr_len = request.address_length;
    out.msgid = request.id;
    out.msg = {request.netfn, request.cmd, static_cast<unsigned short>(request.data.size()),
               request.data.data()};
    return result_of(ioctl(fd, IPMICTL_SEND_COMMAND, &out));
}

std::string wait(int fd, int limit_ms) {
    const Stopwatch watch;
    pollfd set = {fd, POLLIN, 0};
    const int ready = poll(&set, 1, limit_ms);
    return (ready > 0 ? "readable after " : "timeout after ") + std::to_string(watch.ms()) + " ms";
}

std::string fetch(int fd, unsigned short capacity, bool truncating) {
    std::array<unsigned char, 40> address = {};
    std::array<unsigned char, 512> data = {};
    ipmi_recv answer = {};
    answer.addr = address.data();
    answer.addr_len = address.size();
    answer.msg.data = data.data();
    answer.msg.data_len = capacity;
    const int result =
        ioctl(fd, truncating ? IPMICTL_RECEIVE_MSG_TRUNC : IPMICTL_RECEIVE_MSG, &answer);
    if (result == 0) {
        return in_words(answer);
    }
    const bool was_cut = errno == EMSGSIZE && truncating;
    return result_of(result) + (was_cut ? " " + in_words(answer) : "");
}

std::string codes() {
    std::array<char, 64> text = {};
    std::snprintf(text.data(), text.size(), "send=0x%lX receive=0x%lX",
                  static_cast<unsigned long>(IPMICTL_SEND_COMMAND) & 0xFFFFFFFFUL,
                  static_cast<unsigned long>(IPMICTL_RECEIVE_MSG_TRUNC) & 0xFFFFFFFFUL);
    return text.data();
}

}  // namespace velkguest
