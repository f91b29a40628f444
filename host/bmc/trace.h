// What was said between host and controller.
#pragma once

#include "host/bmc/message.h"

#include <string>

namespace velkhost::bmc {

struct Exchange {
    std::int64_t time_us = 0;  // when the request came, microseconds since 1970 UTC
    Request request;
    Reply reply;
    std::string words;  // "create XFLASH -> handle 5"
};

// One line without its end, with the time in seconds since `origin_us`:
// "   12.100  3A F0 | 01 00 00 07 86 58 ... -> 00 01 01 ... | create XFLASH -> handle 5"
std::string in_words(const Exchange &exchange, std::int64_t origin_us);

}  // namespace velkhost::bmc
