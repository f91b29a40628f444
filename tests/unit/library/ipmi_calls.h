// The device's control calls of the code under test, seen and changed on their way. What no driver
// of the kernel's ever does, a library may still have to take.
#pragma once

#include <cstddef>
#include <functional>
#include <vector>

#include <linux/ipmi.h>

namespace velktest {

// A request as it was handed to the driver.
struct SentRequest {
    ipmi_system_interface_addr address = {};
    std::size_t address_length = 0;
    long id = 0;
    unsigned char netfn = 0;
    unsigned char cmd = 0;
    std::vector<unsigned char> data;
};

// As long as it lives; one at a time.
class IpmiCalls {
  public:
    IpmiCalls();
    ~IpmiCalls();
    IpmiCalls(const IpmiCalls &) = delete;
    IpmiCalls &operator=(const IpmiCalls &) = delete;

    std::vector<SentRequest> sent;

    // Room that was offered to the latest answer.
    unsigned offered_address = 0;
    unsigned offered_data = 0;

    // So many of the next receive calls fail with EIO.
    int failing_receives = 0;
    // Applied to every answer that was received.
    std::function<void(ipmi_recv &)> change;
};

}  // namespace velktest
