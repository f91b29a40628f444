// A bundle of the hypervisor's updates (an offline bundle), unpacked in a folder:
//
//     index.xml            <indexfile>vendor-index.xml</indexfile>
//     vendor-index.xml     <url>metadata.zip</url>
//     metadata.zip         one vibs/NAME.xml for every package: <name>, <version>, <relative-path>,
//                          <packed-size>
//     vib20/...            the packages (VIBs), which are ar(5) archives
//
// Of the XML only the elements named here are looked at, and they hold plain text.
#pragma once

#include <cstdint>
#include <stdexcept>
#include <string>
#include <vector>

namespace velkhost::providers {

// A package of a bundle.
struct Vib {
    std::string name;
    std::string version;
};

// Why a bundle cannot be installed from.
class DepotError : public std::runtime_error {
  public:
    using std::runtime_error::runtime_error;
};

// The packages of the bundle whose metadata lie in the file at `metadata`, an absolute path. Throws
// DepotError unless everything is there and undamaged.
std::vector<Vib> read_depot(const std::string &metadata);

}  // namespace velkhost::providers
