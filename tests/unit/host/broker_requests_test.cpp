// Requests of clients: what reaches a provider and what comes back.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

using BrokerRequests = BrokerTest;

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

TEST_F(BrokerRequests, MethodReturnsValueAndOutputArguments) {
    provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *method,
                         const CMPIArgs *in, CMPIArgs *out) {
        EXPECT_STREQ(method, "Run");
        CMPIStatus status{};
        const CMPIData speed = in->ft->getArg(in, "speed", &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        EXPECT_EQ(speed.type, CMPI_uint16);
        CMPIValue twice{};
        twice.uint16 = static_cast<CMPIUint16>(speed.value.uint16 * 2);
        out->ft->addArg(out, "Twice", &twice, CMPI_uint16);
        CMPIValue value{};
        value.uint32 = 4096;
        result->ft->returnData(result, &value, CMPI_uint32);
        return result->ft->returnDone(result);
    };
    broker.register_provider(kNamespace, "Test_Service", provider.methods());
    const MethodReply reply =
        broker.invoke_method(path_of("Test_Service"), "Run", {{"Speed", cim::Value::uint16(21)}});
    EXPECT_EQ(reply.status, Status{});
    EXPECT_EQ(reply.return_value, cim::Value::uint32(4096));
    EXPECT_EQ(reply.out, (cim::NamedValues{{"Twice", cim::Value::uint16(42)}}));
    EXPECT_TRUE(reply.return_done);
}

TEST_F(BrokerRequests, MethodWithoutReturnDoneIsSeen) {
    provider.invoke = [](const auto *, const auto *, const auto *, const char *, const auto *,
                         auto *) { return ok(); };
    broker.register_provider(kNamespace, "Test_Service", provider.methods());
    const MethodReply reply = broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_EQ(reply.status, Status{});
    EXPECT_EQ(reply.return_value, std::nullopt);
    EXPECT_FALSE(reply.return_done);
}

}  // namespace
}  // namespace velkhost::broker::testing
