// A host with several nodes: its mapping file, written as the test wants it.
#pragma once

#include "ipmi/network_config.h"
#include "ipmi/network_table.h"
#include "ipmi/node_mapping.h"
#include "tests/support/library_test.h"

namespace velktest {

inline constexpr const char *kFlagFile = "/tmp/networkflag";

// The clock's seconds since the epoch when a test begins: 2024-10-04, 08:05:03 UTC.
inline constexpr int kTestBegin = 20'000 * 86'400 + kStartSecond;

inline const std::string kMarker = "RXC IN-Band Network Mappings: ";
inline const std::string kHeading = "Label Node IPMI Mask ESXi RXC\n";

class NetworkTest : public LibraryTest {
  protected:
    [[nodiscard]] std::filesystem::path mapping() const { return at(velk::kNodeMapping); }

    void write_mapping(std::string_view text) const { write_file(mapping(), text); }

    // With this stamp, the heading and these node lines.
    void write_nodes(int stamp, std::string_view nodes) const {
        write_mapping(kMarker + std::to_string(stamp) + "\n" + kHeading + std::string(nodes));
    }

    [[nodiscard]] std::string mapping_text() const { return read_file(mapping()); }
    [[nodiscard]] bool mapping_exists() const { return std::filesystem::exists(mapping()); }
};

}  // namespace velktest
