// Why a stand-in host could not be set up.
#pragma once

#include <stdexcept>

namespace velkhost::rig {

// what() says what was attempted, on what, and why it failed, without a line end.
class RigError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

}  // namespace velkhost::rig
