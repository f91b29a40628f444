// velkhost with packages on real servers.
#pragma once

#include "tests/integration/transfers/relay.h"
#include "tests/integration/transfers/servers.h"
#include "tests/integration/velkhost/fixture.h"

#include <gmock/gmock.h>

#include <string>
#include <vector>

namespace velkhost::testing {

class TransferTest : public VelkhostTest {
  protected:
    static constexpr const char *kUefi = "zeb_fw_uefi_d7e148-1.60_anyos";
    static constexpr const char *kDiagnostics = "pakro_utl_diag_dsyt9k-9.30_anyos";

    void SetUp() override {
        VelkhostTest::SetUp();
        // Servers run as another user.
        std::filesystem::permissions(place_, std::filesystem::perms(0755));
        served_ = place_ / "s";
        std::filesystem::copy(VELK_PACKAGES_DIR, served_);
        server_place_ = place_ / "server";
        std::filesystem::create_directory(server_place_);
    }

    // Installs with a scenario of that text, in the root of the test.
    nlohmann::json install(const std::vector<std::string> &uris, const std::string &scenario) {
        std::vector<std::string> arguments = {"--log", "--root", root().string(), "--scenario",
                                              write_file("scenario.toml", scenario).string()};
        arguments.insert(arguments.end(), uris.begin(), uris.end());
        return velkhost_json(arguments);
    }

    [[nodiscard]] std::filesystem::path root() const { return place_ / "root"; }
    [[nodiscard]] bool has_store() const {
        return std::filesystem::exists(root() / "var/tmp/filestore");
    }
    [[nodiscard]] bool has_lock() const {
        return std::filesystem::exists(root() / "tmp/sfcb/velk.safelock");
    }

    // The codes that the package went through after its initialisation, in their order.
    static std::vector<int> codes(const nlohmann::json &document, const std::string &package) {
        std::vector<int> out;
        for (const auto &entry : document["history"]) {
            if (entry["package"] == package && entry["code"] != 0) {
                out.push_back(entry["code"].is_null() ? -1 : entry["code"].get<int>());
            }
        }
        return out;
    }
    static std::vector<int> final_codes(const nlohmann::json &document) {
        std::vector<int> out;
        for (const auto &package : document["packages"]) {
            out.push_back(package["code"].is_null() ? -1 : package["code"].get<int>());
        }
        return out;
    }
    static std::string log(const nlohmann::json &document) {
        std::string text;
        for (const auto &line : document["log"]) {
            text += line.get<std::string>() + "\n";
        }
        return text;
    }
    static void expect_clean(const nlohmann::json &document) {
        EXPECT_EQ(document["findings"], nlohmann::json::array());
        EXPECT_EQ(document["unfired_faults"], nlohmann::json::array());
    }

    std::filesystem::path served_;
    std::filesystem::path server_place_;
};

}  // namespace velkhost::testing
