// The IPMI device straight through the driver's control calls, without the library.
#pragma once

#include <optional>
#include <span>
#include <string>

#include <linux/ipmi.h>

namespace velkguest {

// A request to be sent; the defaults are those of a well-formed one.
struct Send {
    long id = 0;
    unsigned char netfn = 0;
    unsigned char cmd = 0;
    std::span<unsigned char> data = {};
    short channel = IPMI_BMC_CHANNEL;
    unsigned address_length = sizeof(ipmi_system_interface_addr);
};

// "ok", or the name of the errno value.
std::string send(int fd, const Send &request);

// "readable" or "timeout", and how long it took.
std::string wait(int fd, int limit_ms);

// One attempt to fetch an answer into a buffer of `capacity` bytes:
// "id=7 netfn=3B cmd=C1 data=00 00 01", with "EMSGSIZE " in front where it was cut; else the name
// of the errno value. `truncating` picks the call that cuts.
std::string fetch(int fd, unsigned short capacity, bool truncating);

// Both control codes, as numbers.
std::string codes();

}  // namespace velkguest
