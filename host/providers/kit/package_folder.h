// An unpacked adapter package, as services see it that pick their own targets in it. Its file
// image/payload.xml says which payload files apply to which adapters:
//
//   <payload order="1">image/fw_a.bin</payload>
//     <applicability type="DFN">1234ABCD</applicability>
//   </payload>
#pragma once

#include "host/scenario/model.h"

#include <optional>
#include <string>
#include <vector>

namespace velkhost::providers {

class PackageFolder {
  public:
    // `place` is an absolute path or a file URI. No value when no package can be read there.
    static std::optional<PackageFolder> open(const std::string &place);

    // The payload files, by their absolute paths, that apply to an adapter of the family.
    [[nodiscard]] std::vector<std::string> payloads_for(scenario::AdapterFamily family) const;

  private:
    struct Payload {
        std::string file;
        std::vector<std::string> dfns;  // of the adapters that it is for
    };

    PackageFolder(std::string path, const std::string &configuration);
    void read_line(const std::string &line);

    std::string path_;
    std::vector<Payload> payloads_;
};

}  // namespace velkhost::providers
