// An unpacked package: its configuration file and the adapters that this host has.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>
#include <string_view>
#include <vector>

#include "catalog/applicability.h"
#include "tests/support/library_test.h"
#include "tests/unit/library/payload_config.h"

namespace velktest {

class ApplicabilityTest : public LibraryTest {
  protected:
    ApplicabilityTest() { use_packages(1); }

    static velk::PackageRecord &package() { return pkgInstance[0]; }

    void write_config(std::string_view text) const { write_file(at(kPayloadConfig), text); }

    static void add_adapter(std::string_view dfn, std::string_view device) {
        velk::DfnDevice &entry = package().DFNDeviceIDArray[package().dfnnumber++];
        set_field(entry.DFN, dfn);
        set_field(entry.DeviceID, device);
    }

    static int parse() { return parsePayloadDeviceIDArray(0); }

    // Whether the log has an entry of this text.
    [[nodiscard]] bool logged(std::string_view message) const {
        return log().find("] " + std::string(message)) != std::string::npos;
    }

    // What is to be installed, in order: "fw.bin for dev".
    static std::vector<std::string> to_install() {
        std::vector<std::string> out;
        for (int i = 0; i < package().payloadnum; ++i) {
            const velk::PayloadDevice &entry = package().PayloadDeviceIDArray[i];
            out.push_back(std::string(entry.PayloadPath) + " for " + entry.DeviceID);
        }
        return out;
    }
};

}  // namespace velktest
