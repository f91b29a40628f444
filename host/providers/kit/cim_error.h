// A call that ends with a CIM status (DSP0200, 5.1.3) in place of a result.
#pragma once

#include <cmpi/cmpidt.h>

#include <stdexcept>
#include <string>

namespace velkhost::providers {

class CimError : public std::runtime_error {
  public:
    CimError(CMPIrc code, const std::string &message) : std::runtime_error(message), code_(code) {}

    [[nodiscard]] CMPIrc code() const { return code_; }

  private:
    CMPIrc code_;
};

}  // namespace velkhost::providers
