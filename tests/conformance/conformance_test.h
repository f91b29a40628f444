// The fixture of the tests of the shipped library: a host with it, and the short forms in which
// requests are written. At the end of a test the broker's books must be clean.
#pragma once

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/conformance/provider_host.h"
#include "tests/support/log_text.h"

namespace velktest {

class ConformanceTest : public ::testing::Test {
  protected:
    ~ConformanceTest() override {
        host_.broker().shutdown();
        EXPECT_EQ(host_.broker().ledger().report(), "");
    }

    ProviderHost &host() { return host_; }
    velkhost::broker::Broker &broker() { return host_.broker(); }

    velkhost::broker::MethodReply install(const cim::NamedValues &in) {
        return host_.call("InstallFromURI", in);
    }

    // A request for these locations; it must be accepted.
    void start(const std::vector<std::string> &locations) {
        const auto reply = install({uri(joined(locations))});
        ASSERT_EQ(reply.return_value, cim::Value::uint32(4096)) << reply.status.message;
    }

    // The same, to its end.
    void run(const std::vector<std::string> &locations) {
        ASSERT_NO_FATAL_FAILURE(start(locations));
        ASSERT_TRUE(host_.wait_until_idle());
    }

    // Begins the debug log and the broker's record anew.
    void forget_so_far() {
        host_.clear_log();
        broker().trace().clear();
    }

    static std::string joined(const std::vector<std::string> &locations) {
        std::string list;
        for (const std::string &location : locations) {
            list += (&location == locations.data() ? "" : "|") + location;
        }
        return list;
    }

    static cim::NamedValue uri(const std::string &text = "file:///pkgs/a.xml") {
        return {"URI", cim::Value::string(text)};
    }

    static cim::NamedValue options(const std::vector<std::uint16_t> &numbers) {
        cim::Value::Array elements;
        for (const std::uint16_t number : numbers) {
            elements.push_back(cim::Value::uint16(number));
        }
        return {"InstallOptions", cim::Value::array(CMPI_uint16, elements)};
    }

    static cim::NamedValue update_args(const std::string &text) {
        return {"UpdateArgs", cim::Value::string(text)};
    }

  private:
    ProviderHost host_;
};

}  // namespace velktest
