// One call of the file transfer service, the same for both protocols.
#pragma once

#include <cmpi/cmpidt.h>

#include <cstdint>

#include "velk/cim.h"

namespace velk::transfer {

class TransferCall {
  public:
    // Builds the service's path; where that fails, `no_service_line` is logged and the call is made
    // all the same.
    TransferCall(const char *no_service_line, const char *source_uri, std::uint16_t option);

    [[nodiscard]] bool has_service() const { return has_service_; }

    // Returns the method's return value, -1 when it gave none. The service's path is released.
    int invoke(const CMPIContext *context, const char *method);

    // A copy of the job that the service started; null when it named none.
    [[nodiscard]] cim::Path job() const;

    // Stores "DestinationURI" as the package's local location, empty where it is no text; that is
    // reported with `invalid_message`. Returns whether it was a text.
    bool store_destination(int index, const char *invalid_message) const;

  private:
    cim::Path service_;
    bool has_service_;
    cim::Args in_;
    cim::Args out_;
};

// Reports a transfer that failed, and rejects the package.
void reject(int index, int code, const char *message);

}  // namespace velk::transfer
