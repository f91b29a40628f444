// What the broker's tests share: a broker with a few classes, providers made of lambdas, and a
// ledger that must be clean at the end.
#pragma once

#include "host/broker/broker.h"

#include <cmpi/cmpift.h>
#include <gtest/gtest.h>

#include <functional>
#include <ostream>
#include <string>
#include <vector>

namespace velkhost::broker {

inline void PrintTo(const Status &status, std::ostream *out) {
    *out << status.code << " \"" << status.message << '"';
}

}  // namespace velkhost::broker

namespace velkhost::broker::testing {

inline constexpr char kNamespace[] = "test/cimv2";

// Test_Service <- Test_Base; Test_Link is an association class; Test_Runner is in_request's own.
inline void add_test_classes(Repository &repository) {
    const cim::Qualifier key{"Key", {"true"}};
    cim::ClassDecl base{
        .name = "Test_Base", .superclass = "", .qualifiers = {}, .properties = {}, .methods = {}};
    base.properties = {{"Name", {CMPI_string, ""}, {key}, std::nullopt},
                       {"Caption", {CMPI_string, ""}, {{"MaxLen", {"64"}}}, std::nullopt}};
    cim::ClassDecl service{.name = "Test_Service",
                           .superclass = "Test_Base",
                           .qualifiers = {},
                           .properties = {},
                           .methods = {}};
    service.properties = {
        {"Count", {CMPI_uint32, ""}, {}, std::nullopt},
        {"Mode", {CMPI_uint16, ""}, {}, std::vector<std::string>{"7"}},
        {"Numbers", {CMPI_uint16A, ""}, {{"Values", {"one", "two"}}}, std::nullopt}};
    service.methods = {{"Run", {CMPI_uint32, ""}, {}, {}}};
    cim::ClassDecl link{
        .name = "Test_Link", .superclass = "", .qualifiers = {}, .properties = {}, .methods = {}};
    cim::ClassDecl runner = link;
    runner.name = "Test_Runner";
    for (const cim::ClassDecl &declaration : {base, service, link, runner}) {
        ASSERT_EQ(repository.add_class(kNamespace, declaration), "");
    }
}

inline cim::ObjectPath path_of(const std::string &class_name, cim::NamedValues keys = {}) {
    return {"", kNamespace, class_name, std::move(keys)};
}

// A provider whose operations are set by the test; what is not set answers NOT_SUPPORTED.
class ScriptedProvider {
  public:
    using Invoke =
        std::function<CMPIStatus(const CMPIContext *, const CMPIResult *, const CMPIObjectPath *,
                                 const char *, const CMPIArgs *, CMPIArgs *)>;
    using Operation =
        std::function<CMPIStatus(const CMPIContext *, const CMPIResult *, const CMPIObjectPath *)>;
    using WithInstance = std::function<CMPIStatus(const CMPIContext *, const CMPIResult *,
                                                  const CMPIObjectPath *, const CMPIInstance *)>;
    using Traverse = std::function<CMPIStatus(const CMPIResult *, const CMPIObjectPath *,
                                              const char *, const char *)>;

    Invoke invoke;
    Operation enumerate_names;
    Operation enumerate;
    Operation get;
    Operation remove;
    Operation query;
    WithInstance create;
    WithInstance modify;
    Traverse associators;
    Traverse references;
    std::function<CMPIrc(const std::string &kind, bool terminating)> cleanup;

    ManagementInterfaces methods();
    ManagementInterfaces instances();
    ManagementInterfaces all();

  private:
    CMPIMethodMI method_mi_{this, nullptr};
    CMPIInstanceMI instance_mi_{this, nullptr};
    CMPIAssociationMI association_mi_{this, nullptr};
};

class BrokerTest : public ::testing::Test {
  protected:
    BrokerTest() {
        add_test_classes(broker.repository());
        context_provider_.invoke = [this](const CMPIContext *context, const auto *, const auto *,
                                          const char *, const CMPIArgs *, CMPIArgs *) {
            body_(context);
            return CMPIStatus{CMPI_RC_OK, nullptr};
        };
    }

    void TearDown() override {
        broker.shutdown();
        EXPECT_EQ(broker.ledger().report(), expected_findings);
    }

    // Runs `work` as a provider's method, with the context of a request.
    void in_request(std::function<void(const CMPIContext *)> work) {
        body_ = std::move(work);
        if (!registered_) {
            broker.register_provider(kNamespace, "Test_Runner", context_provider_.methods());
            registered_ = true;
        }
        EXPECT_EQ(broker.invoke_method(path_of("Test_Runner"), "Body").status, Status{});
    }

    // A test that wants findings looks at them and then takes them away.
    std::vector<FindingKind> take_findings() {
        std::vector<FindingKind> kinds;
        for (const Finding &finding : broker.ledger().findings()) {
            kinds.push_back(finding.kind);
        }
        broker.ledger().clear_findings();
        return kinds;
    }

    // -- Short forms of the tables --
    const CMPIBrokerEncFT &make() const { return *cmpi->eft; }
    CMPIObjectPath *new_path(const char *class_name) {
        return make().newObjectPath(cmpi, kNamespace, class_name, nullptr);
    }
    static const CMPIValue *chars(const char *text) {
        return reinterpret_cast<const CMPIValue *>(text);
    }
    static std::string text(const CMPIData &data) { return text(data.value.string); }
    static std::string text(const CMPIString *string) {
        const char *chars = string != nullptr ? string->ft->getCharPtr(string, nullptr) : nullptr;
        return chars != nullptr ? chars : "(null)";
    }

    Broker broker;
    const CMPIBroker *cmpi = broker.cmpi();
    ScriptedProvider provider;
    std::string expected_findings;

  private:
    ScriptedProvider context_provider_;
    std::function<void(const CMPIContext *)> body_;
    bool registered_ = false;
};

}  // namespace velkhost::broker::testing
