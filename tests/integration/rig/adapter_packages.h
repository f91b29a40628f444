// Adapter packages for requests to a rig: descriptors, and archives that a Minizip of the test's
// own unpacks, which the provider library takes before the host's unzip library.
#pragma once

#include "host/rig/run_folder.h"

#include <filesystem>
#include <fstream>
#include <string>

namespace velkhost::rig::testing {

class AdapterPackages {
  public:
    // Writes a descriptor and an archive with one payload, `name`.bin, for the adapters of that
    // model; the descriptor's location.
    std::string add(const std::string &name, const std::string &product,
                    const std::string &category, const std::string &dfn) const {
        const std::filesystem::path folder = folder_.path();
        std::ofstream(folder / (name + ".zip")) << name << '\n' << dfn << '\n';
        std::ofstream(folder / (name + ".xml"))
            << "<INSTANCE>\n"
            << property("Name", product) << property("type", "1") << property("category", category)
            << property("payload", name + ".zip") << property("identificationCode", "PAKRO_" + name)
            << "</INSTANCE>\n";
        return "file://" + (folder / (name + ".xml")).string();
    }

  private:
    static std::string property(const std::string &name, const std::string &value) {
        return "  <PROPERTY NAME=\"" + name + "\" TYPE=\"" +
               (name == "type" ? "uint16" : "string") + "\">\n    <VALUE>" + value +
               "</VALUE>\n  </PROPERTY>\n";
    }

    RunFolder folder_ = RunFolder::make_temporary();
};

}  // namespace velkhost::rig::testing
