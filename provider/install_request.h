// InstallFromURI: from the client's arguments to a running install thread.
#pragma once

#include <cmpi/cmpidt.h>

namespace velk {

// What a method answers: the CMPI status, and the uint32 return value unless none is sent.
struct MethodAnswer {
    CMPIStatus status = {CMPI_RC_OK, nullptr};
    unsigned return_value = 0;
    bool sends_value = true;
    bool logs_completion = true;  // the dispatcher's closing log entry
};

// A failure status with a message made by the broker, and the return value that goes with it.
MethodAnswer refuse(CMPIrc code, const char *message, unsigned return_value);

// One invocation of a method as the broker hands it over.
struct Invocation {
    const CMPIContext *context;
    const CMPIObjectPath *reference;
    const CMPIArgs *in;
    CMPIArgs *out;
};

MethodAnswer install_from_uri(const Invocation &invocation);

}  // namespace velk
