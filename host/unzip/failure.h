// Why an archive is not unpacked.
#pragma once

#include <exception>

#include "host/unzip/unzipfile.h"

namespace velkhost::unzip {

// Thrown inside the library, never out of it.
class Failure : public std::exception {
  public:
    explicit Failure(MinizipResult result) : result_(result) {}

    [[nodiscard]] MinizipResult result() const { return result_; }
    [[nodiscard]] const char *what() const noexcept override { return "archive not unpacked"; }

  private:
    MinizipResult result_;
};

}  // namespace velkhost::unzip
