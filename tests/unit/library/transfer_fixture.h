// Transfers of one file for package 0, by a double of the file transfer service.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <optional>
#include <string>
#include <vector>

#include "provider/transfer.h"
#include "tests/support/broker_test.h"
#include "tests/support/report_log.h"
#include "velk/request_state.h"

namespace velktest {

class TransferTest : public BrokerTest {
  protected:
    TransferTest() {
        use_packages(2);
        set_field(package().TFTPXMLPkgURIs, kLocation);
        set_field(package().LocalPkgURI, "file:///store/a-longer-name-of-the-file-before-it.xml");
        package().OrderFlag = 450;
    }

    static constexpr const char *kLocation = "tftp://server/pkgs/rxc.xml";
    static constexpr const char *kFetched = "file:///store/rxc.bin";

    static velk::PackageRecord &package() { return pkgInstance[0]; }

    // The service returns `value` and names this place; no value: none.
    void answer(std::uint32_t value, std::optional<kit::Value> place = kit::Text(kFetched)) {
        MethodEnd end = {CMPI_RC_OK, "", value, {}};
        if (place) {
            end.outputs.push_back({"DestinationURI", *std::move(place)});
        }
        set_end(end);
    }

    void set_end(const MethodEnd &end) {
        transfer().on_transfer = [=](const std::string &) { return end; };
    }

    using Client = int (*)(const char *source, int index, const CMPIContext *context);
    int run(Client client, const char *source, int index = 0) {
        int result = -99;
        in_request([&](const CMPIContext *context) { result = client(source, index, context); });
        return result;
    }

    // Codes and messages of the package's reports, in their order: "11: Package download failed.".
    [[nodiscard]] std::vector<std::string> reports() const { return reports_in(log(), "rxc"); }

    // Values that are no text.
    static std::vector<std::optional<kit::Value>> no_texts() {
        return {std::nullopt, kit::Text(), std::uint32_t{7}, kit::Reference{"ZEB_TransferJob", {}},
                std::vector<std::string>{kFetched}};
    }
};

}  // namespace velktest
