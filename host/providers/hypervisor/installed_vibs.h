// The packages that the hypervisor has.
#pragma once

#include "host/providers/hypervisor/depot.h"

#include <map>
#include <mutex>
#include <string>
#include <vector>

namespace velkhost::providers {

// Whether a version is later than another: numbers in them are compared as such.
bool is_later(const std::string &version, const std::string &than);

// Safe to use from any thread.
class InstalledVibs {
  public:
    // Each as "NAME VERSION".
    explicit InstalledVibs(const std::vector<std::string> &packages);

    // Takes the packages over that are new or later than what is there; whether there was any.
    bool take_later(const std::vector<Vib> &vibs);

  private:
    std::mutex mutex_;
    std::map<std::string, std::string> versions_;
};

}  // namespace velkhost::providers
