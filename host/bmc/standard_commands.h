// The commands of the application function (IPMI 2.0, chapters 20 and 22) that an operating
// system's driver asks before it offers the controller as a device.
#pragma once

#include "host/bmc/answer.h"
#include "host/bmc/message.h"

#include <string_view>

namespace velkhost::bmc {

inline constexpr std::uint8_t kApplicationFunction = 0x06;

// "get device id"; "application command" for those that are not served.
std::string_view standard_command_name(std::uint8_t cmd);

class StandardCommands {
  public:
    Answer serve(const Request &request);

  private:
    std::uint8_t global_enables_ = 0;
};

}  // namespace velkhost::bmc
