// What a part of the controller answers to a request, with the words for the trace.
#pragma once

#include "host/bmc/hex.h"
#include "host/bmc/message.h"

#include <string>

namespace velkhost::bmc {

struct Answer {
    Bytes data;  // the completion code first
    std::string words;
};

inline Answer not_completed(std::uint8_t code) {
    return {{code}, "completion code 0x" + hex(code)};
}

}  // namespace velkhost::bmc
