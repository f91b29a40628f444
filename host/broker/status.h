// Outcome of a request outside of the CMPI tables.
#pragma once

#include <cmpi/cmpidt.h>

#include <string>

namespace velkhost::broker {

struct Status {
    CMPIrc code = CMPI_RC_OK;
    std::string message;  // empty: none

    [[nodiscard]] bool ok() const { return code == CMPI_RC_OK; }
    bool operator==(const Status &) const = default;
};

}  // namespace velkhost::broker
