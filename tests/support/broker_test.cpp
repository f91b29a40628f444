#include "tests/support/broker_test.h"

#include <gmock/gmock.h>

#include "velk/cim.h"

namespace velktest {
namespace {

using velkhost::broker::Fault;
using velkhost::broker::TraceEntry;
namespace cim = velkhost::cim;

constexpr const char *kServices = "zeb/cimv2";
constexpr const char *kOwn = "velk/cimv2";
constexpr const char *kFrame = "TEST_RequestFrame";

}  // namespace

BrokerTest::BrokerTest() {
    add_provider(kOwn, kFrame, frame_.interfaces());
    add_service(controller_);
    add_service(job_);
    add_service(transfer_);
    add_service(transfer_job_);
    ZEB_VMWarePackageInstallationBroker = watch_.broker();
}

BrokerTest::~BrokerTest() {
    broker_.shutdown();
    EXPECT_EQ(broker_.ledger().report(), "");
}

void BrokerTest::add_provider(const std::string &name_space, const std::string &class_name,
                              const velkhost::broker::ManagementInterfaces &interfaces) {
    cim::ClassDecl declaration;
    declaration.name = class_name;
    EXPECT_EQ(broker_.repository().add_class(name_space, declaration), "");
    broker_.register_provider(name_space, class_name, interfaces);
}

void BrokerTest::add_service(DoubleBase &service) {
    add_provider(kServices, service.class_name(), service.interfaces(broker_.cmpi()));
}

void BrokerTest::in_request(const std::function<void(const CMPIContext *)> &work) {
    frame_.work = [&](const CMPIContext *context) {
        work(context);
        EXPECT_EQ(broker_.ledger().report(), "");
        EXPECT_THAT(watch_.unreleased(), ::testing::IsEmpty());
        broker_.ledger().clear_findings();  // made by asking
    };
    const auto reply = broker_.invoke_method({"", kOwn, kFrame, {}}, "Run");
    EXPECT_TRUE(reply.status.ok()) << reply.status.message;
}

void BrokerTest::fail_service(const std::string &step, const std::string &subject, int code,
                              const std::string &message) {
    broker_.set_fault_hook([=](std::string_view asked_step, std::string_view asked_subject) {
        const bool is_meant = asked_step == step && asked_subject == subject;
        return is_meant ? std::optional(Fault{code, message}) : std::nullopt;
    });
}

std::vector<std::string> BrokerTest::up_calls() {
    std::vector<std::string> calls;
    for (const TraceEntry &entry : broker_.trace().entries()) {
        if (entry.side == TraceEntry::Side::kUpCall) {
            const std::string method = entry.method.empty() ? "" : "." + entry.method;
            calls.push_back(entry.operation + " " + entry.name_space + ":" + entry.class_name +
                            method + "(" + entry.arguments + ")");
        }
    }
    return calls;
}

}  // namespace velktest
