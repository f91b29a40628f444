// Providers in libraries: found, loaded once, or not loadable with the cause.
#include "broker_testing.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>

namespace velkhost::broker::testing {
namespace {

class BrokerLoading : public BrokerTest {
  protected:
    BrokerLoading()
        : folder_(make_folder()),
          host_({.name = "loading", .provider_folders = {"/no/such", VELKBROKER_TEST_LIBRARIES}}) {
        add_test_classes(host_.repository());
    }
    ~BrokerLoading() override {
        host_.shutdown();
        EXPECT_EQ(host_.ledger().report(), "");
        std::filesystem::remove_all(folder_);
    }

    static std::filesystem::path make_folder() {
        std::string name = ::testing::TempDir() + "velkbroker-XXXXXX";
        return ::mkdtemp(name.data());
    }

    // Registers lib<location>.so for Test_Service.
    void serve(const std::string &location, const std::string &more = "") {
        const std::filesystem::path file = folder_ / "providerRegister";
        std::ofstream(file) << "[Test_Service]\n  provider: Test_Provider\n  location: " << location
                            << "\n  type: instance method\n  namespace: " << kNamespace << '\n'
                            << more;
        EXPECT_EQ(host_.register_providers(file), "");
    }
    MethodReply run() { return host_.invoke_method(path_of("Test_Service"), "Run"); }

    // What the library's method returns: how often its factories ran in this process.
    std::uint64_t factories_run() {
        const MethodReply reply = run();
        EXPECT_EQ(reply.status, Status{});
        return reply.return_value ? reply.return_value->as_unsigned().value_or(0) : 0;
    }

    // Not loadable: the status is 1 and its message has the cause.
    void expect_not_loadable(const std::string &cause) {
        const Status status = run().status;
        EXPECT_EQ(status.code, CMPI_RC_ERR_FAILED);
        EXPECT_NE(status.message.find("Provider not loadable: Test_Provider"), std::string::npos);
        EXPECT_NE(status.message.find(cause), std::string::npos) << status.message;
    }

    std::filesystem::path folder_;
    Broker host_;
};

TEST_F(BrokerLoading, AllFactoriesRunAtTheFirstRequest) {
    serve("velkbroker_test_good");
    const std::uint64_t made = factories_run();
    EXPECT_EQ(made % 2, 0U);
    EXPECT_EQ(factories_run(), made);
}

TEST_F(BrokerLoading, LoadProvidersLoadsThemNow) {
    serve("velkbroker_test_good");
    EXPECT_EQ(host_.load_providers(), Status{});
    serve("velkbroker_test_none");
    EXPECT_EQ(host_.load_providers().code, CMPI_RC_ERR_FAILED);
}

TEST_F(BrokerLoading, GenericFactoryComesFirst) {
    serve("velkbroker_test_generic");
    EXPECT_EQ(run().return_value, cim::Value::uint32(101));
}

TEST_F(BrokerLoading, MissingLibraryIsNotLoadable) {
    serve("velkbroker_test_none");
    expect_not_loadable("libvelkbroker_test_none.so is in no provider folder: /no/such ");
}

TEST_F(BrokerLoading, MissingFactoryIsNotLoadable) {
    serve("velkbroker_test_no_method");
    expect_not_loadable("neither _Generic_Create_MethodMI nor Test_Provider_Create_MethodMI");
    expect_not_loadable("neither _Generic_Create_MethodMI nor Test_Provider_Create_MethodMI");
}

TEST_F(BrokerLoading, FailingFactoryIsNotLoadable) {
    serve("velkbroker_test_refuses");
    expect_not_loadable("Test_Provider_Create_MethodMI failed with status 2: not today");
}

TEST_F(BrokerLoading, UnresolvedSymbolIsNotLoadable) {
    serve("velkbroker_test_unresolved");
    expect_not_loadable("velk_test_nobody_defines_this");
}

TEST_F(BrokerLoading, EmptySlotIsNotLoadable) {
    serve("velkbroker_test_empty_slot");
    expect_not_loadable("the table of Test_Provider_Create_MethodMI has an empty slot");
}

TEST_F(BrokerLoading, MalformedRegistrationIsNamed) {
    const std::filesystem::path file = folder_ / "broken";
    std::ofstream(file) << "[Test_Service]\nnonsense\n";
    EXPECT_EQ(host_.register_providers(file),
              file.string() + ":2: expected [Class] or \"key: value\", found \"nonsense\"");
}

// -- Unloading --

using Decision = UnloadAnswer::Decision;

TEST_F(BrokerLoading, ProviderThatIsNotLoadedIsNotAsked) {
    serve("velkbroker_test_good");
    EXPECT_TRUE(host_.idle().empty());
}

TEST_F(BrokerLoading, ProviderThatAgreesIsMadeAnewAtItsNextUse) {
    serve("velkbroker_test_good");
    const std::uint64_t made = factories_run();
    ASSERT_EQ(host_.idle().size(), 1U);
    EXPECT_TRUE(host_.idle().empty());
    EXPECT_EQ(factories_run(), made + 2);
}

TEST_F(BrokerLoading, UnloadNeverIsNotAsked) {
    serve("velkbroker_test_good", "  unload: never\n");
    run();
    EXPECT_TRUE(host_.idle().empty());
}

class BrokerUnload : public BrokerTest {
  protected:
    BrokerUnload() {
        provider.cleanup = [this](const std::string &kind, bool terminating) {
            log += kind + (terminating ? "! " : " ");
            return kind == "instance" ? instance_answer : method_answer;
        };
        broker.register_provider(kNamespace, "Test_Service", provider.all(), "asked");
    }

    std::string log;
    CMPIrc instance_answer = CMPI_RC_OK;
    CMPIrc method_answer = CMPI_RC_OK;
};

TEST_F(BrokerUnload, InstanceCleanUpIsAskedFirst) {
    const std::vector<UnloadAnswer> answers = broker.idle();
    ASSERT_EQ(answers.size(), 1U);
    EXPECT_EQ(answers[0].provider, "asked");
    EXPECT_EQ(answers[0].decision, Decision::kUnloads);
    EXPECT_EQ(log, "instance association method ");
}

TEST_F(BrokerUnload, RefusalEndsTheRoundAndFiftyOneForEver) {
    instance_answer = CMPI_RC_NEVER_UNLOAD;
    EXPECT_EQ(broker.idle().at(0).decision, Decision::kStaysForEver);
    EXPECT_TRUE(broker.idle().empty());
    EXPECT_EQ(log, "instance ");
}

TEST_F(BrokerUnload, FiftyIsAskedAgain) {
    method_answer = CMPI_RC_DO_NOT_UNLOAD;
    EXPECT_EQ(broker.idle().at(0).decision, Decision::kStays);
    method_answer = CMPI_RC_OK;
    EXPECT_EQ(broker.idle().at(0).decision, Decision::kUnloads);
}

TEST_F(BrokerUnload, ShutdownTellsEveryKindOnceWhateverItAnswers) {
    instance_answer = CMPI_RC_NEVER_UNLOAD;
    broker.shutdown();
    broker.shutdown();
    EXPECT_EQ(log, "instance! association! method! ");
}

}  // namespace
}  // namespace velkhost::broker::testing
