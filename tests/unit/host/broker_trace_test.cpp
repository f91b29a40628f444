// The record of calls, and faults put into services.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

class BrokerTrace : public BrokerTest {
  protected:
    BrokerTrace() {
        provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *,
                             const auto *, CMPIArgs *out) {
            out->ft->addArg(out, "Job", chars("job-1"), CMPI_chars);
            CMPIValue value{};
            value.uint32 = 4096;
            return result->ft->returnData(result, &value, CMPI_uint32);
        };
        broker.register_provider(kNamespace, "Test_Service", provider.methods());
    }
    std::vector<std::string> lines() {
        std::vector<std::string> texts;
        for (const TraceEntry &entry : broker.trace().entries()) {
            texts.push_back(to_text(entry));
        }
        return texts;
    }
};

TEST_F(BrokerTrace, CallsAreRecordedInTheOrderInWhichTheyBegan) {
    in_request([this](const CMPIContext *context) {
        CMPIArgs *in = make().newArgs(cmpi, nullptr);
        in->ft->addArg(in, "URI", chars("file:///a"), CMPI_chars);
        CMPIObjectPath *path = new_path("Test_Service");
        cmpi->bft->invokeMethod(cmpi, context, path, "Install", in, nullptr, nullptr);
        path->ft->addKey(path, "Name", chars("x"), CMPI_chars);
        cmpi->bft->getInstance(cmpi, context, path, nullptr, nullptr);
    });
    EXPECT_EQ(lines(),
              (std::vector<std::string>{
                  "#1 client invokeMethod test/cimv2:Test_Runner.Body() -> 0",
                  "#2 up-call invokeMethod test/cimv2:Test_Service.Install(URI=\"file:///a\") -> "
                  "0 4096, Job=\"job-1\"",
                  "#3 up-call getInstance test/cimv2:Test_Service(Name=\"x\") -> 6 \"The "
                  "requested object could not be found\""}));
}

TEST_F(BrokerTrace, EntriesHaveThreadStatusAndNumber) {
    broker.invoke_method(path_of("Test_Service"), "Run");
    const std::vector<TraceEntry> entries = broker.trace().entries();
    ASSERT_EQ(entries.size(), 1U);
    EXPECT_EQ(entries[0].number, 1U);
    EXPECT_GT(entries[0].thread, 0U);
    EXPECT_TRUE(entries[0].finished);
    EXPECT_EQ(entries[0].side, TraceEntry::Side::kClient);
    broker.trace().clear();
    EXPECT_TRUE(broker.trace().entries().empty());
}

TEST_F(BrokerTrace, SubscriberSeesBeginAndEnd) {
    std::vector<std::string> seen;
    broker.trace().subscribe([&seen](const TraceEntry &entry) { seen.push_back(to_text(entry)); });
    broker.invoke_method(path_of("Test_Service"), "Run");
    broker.trace().subscribe({});
    broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_EQ(seen, (std::vector<std::string>{
                        "#1 client invokeMethod test/cimv2:Test_Service.Run() ...",
                        "#1 client invokeMethod test/cimv2:Test_Service.Run() -> 0 4096, "
                        "Job=\"job-1\""}));
}

TEST_F(BrokerTrace, SubscriberMayAskTheBroker) {
    std::size_t count = 0;
    broker.trace().subscribe([&](const TraceEntry &) { count = broker.trace().entries().size(); });
    broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_EQ(count, 1U);
}

TEST_F(BrokerTrace, ClearedWhileACallRunsDoesNoHarm) {
    provider.invoke = [this](const auto *, const auto *, const auto *, const char *, const auto *,
                             auto *) {
        broker.trace().clear();
        return ok();
    };
    broker.invoke_method(path_of("Test_Service"), "Run");
    EXPECT_TRUE(broker.trace().entries().empty());
}

TEST_F(BrokerTrace, OldestEntriesAreDropped) {
    Trace trace;
    for (std::size_t i = 0; i < Trace::kMaxEntries + 5; ++i) {
        const std::uint64_t number = trace.begin({});
        trace.finish(number, {}, "x");
    }
    const std::vector<TraceEntry> entries = trace.entries();
    ASSERT_EQ(entries.size(), Trace::kMaxEntries);
    EXPECT_EQ(entries.front().number, 6U);
    EXPECT_EQ(entries.back().result, "x");
}

// -- Faults --

class BrokerFaults : public BrokerTrace {
  protected:
    // Strikes at that step for subjects that contain `match`, and nowhere else.
    void strike(const std::string &step, const std::string &match = "") {
        broker.set_fault_hook(
            [this, step, match](std::string_view asked,
                                std::string_view subject) -> std::optional<Fault> {
                asked_.push_back(std::string(asked) + ' ' + std::string(subject));
                if (asked != step || subject.find(match) == std::string_view::npos) {
                    return std::nullopt;
                }
                return Fault{CMPI_RC_ERR_ACCESS_DENIED, "struck"};
            });
    }
    void expect_struck() {
        EXPECT_EQ(status_.rc, CMPI_RC_ERR_ACCESS_DENIED);
        EXPECT_EQ(text(status_.msg), "struck");
    }

    CMPIStatus status_{};
    std::vector<std::string> asked_;
};

TEST_F(BrokerFaults, FactoriesAnswerNull) {
    const CMPIObjectPath *path = new_path("Test_Service");
    strike("broker.newObjectPath", "Service");
    EXPECT_EQ(make().newObjectPath(cmpi, kNamespace, "Test_Service", &status_), nullptr);
    expect_struck();
    EXPECT_NE(make().newObjectPath(cmpi, kNamespace, "Test_Base", &status_), nullptr);
    EXPECT_EQ(status_.rc, CMPI_RC_OK);
    strike("broker.newArgs");
    EXPECT_EQ(make().newArgs(cmpi, &status_), nullptr);
    expect_struck();
    strike("broker.newInstance");
    EXPECT_EQ(make().newInstance(cmpi, path, &status_), nullptr);
    expect_struck();
    strike("broker.newArray", "uint16");
    EXPECT_EQ(make().newArray(cmpi, 1, CMPI_uint16, &status_), nullptr);
    expect_struck();
    strike("broker.newString", "abc");
    EXPECT_EQ(make().newString(cmpi, "xabcx", &status_), nullptr);
    expect_struck();
    strike("broker.newDateTime");
    EXPECT_EQ(make().newDateTime(cmpi, &status_), nullptr);
    expect_struck();
    strike("broker.newDateTimeFromBinary");
    EXPECT_EQ(make().newDateTimeFromBinary(cmpi, 1, 0, &status_), nullptr);
    expect_struck();
    strike("broker.newDateTimeFromChars");
    EXPECT_EQ(make().newDateTimeFromChars(cmpi, "x", &status_), nullptr);
    expect_struck();
    strike("broker.newSelectExp");
    EXPECT_EQ(make().newSelectExp(cmpi, "x", "WQL", nullptr, &status_), nullptr);
    expect_struck();
}

TEST_F(BrokerFaults, UpCallsAnswerNullOrTheStatus) {
    in_request([this](const CMPIContext *context) {
        const CMPIBrokerFT &bft = *cmpi->bft;
        const CMPIObjectPath *path = new_path("Test_Service");
        const CMPIInstance *instance = make().newInstance(cmpi, path, nullptr);
        strike("broker.enumerateInstances");
        EXPECT_EQ(bft.enumerateInstances(cmpi, context, path, nullptr, &status_), nullptr);
        expect_struck();
        strike("broker.enumerateInstanceNames");
        EXPECT_EQ(bft.enumerateInstanceNames(cmpi, context, path, &status_), nullptr);
        expect_struck();
        strike("broker.getInstance");
        EXPECT_EQ(bft.getInstance(cmpi, context, path, nullptr, &status_), nullptr);
        expect_struck();
        strike("broker.createInstance");
        EXPECT_EQ(bft.createInstance(cmpi, context, path, instance, &status_), nullptr);
        expect_struck();
        strike("broker.modifyInstance");
        status_ = bft.modifyInstance(cmpi, context, path, instance, nullptr);
        expect_struck();
        strike("broker.deleteInstance");
        status_ = bft.deleteInstance(cmpi, context, path);
        expect_struck();
        strike("broker.associators", "Test_Service");
        EXPECT_EQ(bft.associators(cmpi, context, path, nullptr, nullptr, nullptr, nullptr, nullptr,
                                  &status_),
                  nullptr);
        expect_struck();
    });
}

TEST_F(BrokerFaults, MethodIsNotInvokedAndItsSubjectNamesClassAndMethod) {
    bool called = false;
    provider.invoke = [&called](const auto *, const auto *, const auto *, const char *,
                                const auto *, auto *) {
        called = true;
        return ok();
    };
    in_request([this](const CMPIContext *context) {
        strike("broker.invokeMethod", "Install");
        const CMPIData data = cmpi->bft->invokeMethod(cmpi, context, new_path("Test_Service"),
                                                      "InstallFromURI", nullptr, nullptr, &status_);
        expect_struck();
        EXPECT_EQ(data.state, CMPI_nullValue);
        EXPECT_EQ(asked_.back(), "broker.invokeMethod Test_Service.InstallFromURI");
    });
    EXPECT_FALSE(called);
}

TEST_F(BrokerFaults, ContextIsNotCloned) {
    in_request([this](const CMPIContext *context) {
        strike("broker.cloneContext");
        EXPECT_EQ(cmpi->bft->prepareAttachThread(cmpi, context), nullptr);
    });
}

TEST_F(BrokerFaults, ClientsRequestsAreNotAsked) {
    strike("broker.invokeMethod");
    EXPECT_EQ(broker.invoke_method(path_of("Test_Service"), "Run").status, Status{});
}

TEST_F(BrokerFaults, HookCanBeTakenAway) {
    strike("broker.newArgs");
    broker.set_fault_hook({});
    EXPECT_NE(make().newArgs(cmpi, nullptr), nullptr);
}

}  // namespace
}  // namespace velkhost::broker::testing
