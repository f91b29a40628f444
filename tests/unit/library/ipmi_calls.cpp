#include "tests/unit/library/ipmi_calls.h"

#include <cerrno>
#include <cstdarg>
#include <cstring>

#include <sys/ioctl.h>

namespace velktest {
namespace {

IpmiCalls *watcher = nullptr;

void note(const ipmi_req &request) {
    SentRequest sent;
    sent.address_length = request.addr_len;
    std::memcpy(&sent.address, request.addr, sizeof sent.address);
    sent.id = request.msgid;
    sent.netfn = request.msg.netfn;
    sent.cmd = request.msg.cmd;
    sent.data.assign(request.msg.data, request.msg.data + request.msg.data_len);
    watcher->sent.push_back(sent);
}

bool fails_now(const ipmi_recv &answer) {
    watcher->offered_address = answer.addr_len;
    watcher->offered_data = answer.msg.data_len;
    return watcher->failing_receives-- > 0;
}

}  // namespace

IpmiCalls::IpmiCalls() {
    watcher = this;
}

IpmiCalls::~IpmiCalls() {
    watcher = nullptr;
}

}  // namespace velktest

// Names that the linker gives to a wrapped call.
// NOLINTBEGIN(bugprone-reserved-identifier,readability-identifier-naming)
extern "C" int __real_ioctl(int fd, unsigned long code, ...);

// Visible, because sanitizers' libraries refer to the same name.
extern "C" [[gnu::visibility("default")]] int __wrap_ioctl(int fd, unsigned long code, ...) {
    va_list arguments;
    va_start(arguments, code);
    void *const argument = va_arg(arguments, void *);
    va_end(arguments);
    if (velktest::watcher == nullptr) {
        return __real_ioctl(fd, code, argument);
    }
    if (code == IPMICTL_SEND_COMMAND) {
        velktest::note(*static_cast<const ipmi_req *>(argument));
        return __real_ioctl(fd, code, argument);
    }
    auto &answer = *static_cast<ipmi_recv *>(argument);
    if (velktest::fails_now(answer)) {
        errno = EIO;
        return -1;
    }
    const int result = __real_ioctl(fd, code, argument);
    if (result == 0 && velktest::watcher->change) {
        velktest::watcher->change(answer);
    }
    return result;
}
// NOLINTEND(bugprone-reserved-identifier,readability-identifier-naming)
