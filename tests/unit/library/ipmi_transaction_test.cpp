// The operations of a flash transaction: the exact request of each, and what becomes of its handle,
// its result and the log for each way in which it can end.
#include "ipmi/transaction.h"

#include <functional>

#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

using enum ControllerFault;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr int kHandle = 0x01020304;

class IpmiTransaction : public IpmiTest {
  protected:
    void connect(std::vector<FaultRule> faults = {}, velkhost::bmc::Settings settings = {}) {
        settings.first_handle = kHandle;
        attach(std::move(faults), std::move(settings));
        ASSERT_EQ(connect_kcs("/dev/ipmi0"), 0);
    }

    [[nodiscard]] std::string last_request() const { return requests().back(); }
};

// ---- Requests ----

TEST_F(IpmiTransaction, RequestsAreByteForByte) {
    connect();
    int handle = -1;
    int secure = -1;
    int type = -1;
    EXPECT_EQ(get_bmc_type(&type), 0);
    EXPECT_EQ(last_request(), "3A C1 | ");
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(last_request(), "3A F0 | 16 00 00 0C 8B 73 65 63 75 72 65 5F 6D 6F 64 65");
    EXPECT_EQ(create_ipmi_transaction(&handle), 0);
    EXPECT_EQ(last_request(), "3A F0 | 01 00 00 07 86 58 46 4C 41 53 48");
    EXPECT_EQ(handle, kHandle);
    EXPECT_EQ(open_ipmi_transaction(handle, "optfw", 1), 0);
    EXPECT_EQ(last_request(),
              "3A F0 | 03 00 00 10 44 01 02 03 04 85 6F 70 74 66 77 44 00 00 00 80");
    EXPECT_EQ(begin_opt_update(handle), 0);
    EXPECT_EQ(last_request(), "3A F0 | 08 00 00 05 44 01 02 03 04");
    EXPECT_EQ(cancel_ipmi_transaction(handle), 0);
    EXPECT_EQ(last_request(), "3A F0 | 0E 00 00 05 44 01 02 03 04");
    EXPECT_EQ(close_ipmi_transaction(handle), 0);
    EXPECT_EQ(last_request(), "3A F0 | 04 00 00 05 44 01 02 03 04");
    EXPECT_EQ(destroy_ipmi_transaction(&handle), 0);
    EXPECT_EQ(last_request(), "3A F0 | 02 00 00 05 44 01 02 03 04");
    EXPECT_EQ(handle, -1);
}

TEST_F(IpmiTransaction, OpenWithoutTheFlagSendsNoFlag) {
    connect();
    int handle = -1;
    create_ipmi_transaction(&handle);
    EXPECT_EQ(open_ipmi_transaction(handle, "optfw", 0), 0);
    EXPECT_EQ(last_request(), "3A F0 | 03 00 00 0B 44 01 02 03 04 85 6F 70 74 66 77");
}

TEST_F(IpmiTransaction, HandlesOfAllBitsTravelWhole) {
    connect();
    begin_opt_update(static_cast<int>(0x80000001U));
    EXPECT_EQ(last_request(), "3A F0 | 08 00 00 05 44 80 00 00 01");
}

TEST_F(IpmiTransaction, SuccessesAreLogged) {
    connect();
    int handle = -1;
    create_ipmi_transaction(&handle);
    open_ipmi_transaction(handle, "optfw", 1);
    begin_opt_update(handle);
    EXPECT_EQ(log(), "");
    cancel_ipmi_transaction(handle);
    close_ipmi_transaction(handle);
    destroy_ipmi_transaction(&handle);
    EXPECT_EQ(log(), dated({"cancel_ipmi_transaction successfully.",
                            "close_ipmi_transaction successfully.",
                            "destroy_ipmi_transaction successfully."}));
}

// ---- Handles that end a call at once ----

TEST_F(IpmiTransaction, NoHandleSendsNothing) {
    connect();
    int none = -1;
    EXPECT_EQ(open_ipmi_transaction(-1, "optfw", 1), -2);
    EXPECT_EQ(close_ipmi_transaction(-1), -2);
    EXPECT_EQ(begin_opt_update(-1), -2);
    EXPECT_EQ(cancel_ipmi_transaction(-1), -2);
    EXPECT_EQ(destroy_ipmi_transaction(&none), -2);
    EXPECT_EQ(none, -1);
    EXPECT_THAT(exchanges(), IsEmpty());
    EXPECT_EQ(log(), "");
}

TEST_F(IpmiTransaction, CreateNeedsAFreeHandle) {
    connect();
    for (const int used : {0, 5, -2}) {
        int handle = used;
        EXPECT_EQ(create_ipmi_transaction(&handle), -2);
        EXPECT_EQ(handle, used);
    }
    EXPECT_THAT(exchanges(), IsEmpty());
    EXPECT_EQ(log(), "");
}

// ---- The four ways to end, for every operation ----

struct Operation {
    const char *name;  // of its step at the controller
    int (*run)(int &value);
    int before;           // the value that the call is given
    const char *refused;  // what is logged when the result flag is clear
};

const std::vector<Operation> kOperations = {
    {"create", [](int &value) { return create_ipmi_transaction(&value); }, -1,
     "smm : create_ipmi_transaction failed"},
    {"destroy", [](int &value) { return destroy_ipmi_transaction(&value); }, 7, nullptr},
    {"open", [](int &value) { return open_ipmi_transaction(value, "optfw", 1); }, 7, nullptr},
    {"close", [](int &value) { return close_ipmi_transaction(value); }, 7, nullptr},
    {"begin", [](int &value) { return begin_opt_update(value); }, 7, nullptr},
    {"cancel", [](int &value) { return cancel_ipmi_transaction(value); }, 7, nullptr},
    {"variable", [](int &value) { return get_secure_mode(&value); }, 7, "SMM :smm_ipmi_error"},
};

class IpmiOperation : public IpmiTransaction, public ::testing::WithParamInterface<Operation> {
  protected:
    // The result with one fault at the operation; `value_` is the handle or the mode afterwards.
    int run_with(ControllerFault kind, int code = 0) {
        connect({fault(std::string("bmc.") + GetParam().name, kind, code)});
        value_ = GetParam().before;
        return GetParam().run(value_);
    }

    int value_ = 0;
};

TEST_P(IpmiOperation, TransportFailureIsAFailure) {
    EXPECT_EQ(run_with(kNoAnswer), -2);
    EXPECT_EQ(value_, GetParam().before);
    EXPECT_EQ(elapsed_ms(), 5000);
    EXPECT_EQ(log(), "");
}

TEST_P(IpmiOperation, CompletionCodeCountsAsDone) {
    EXPECT_EQ(run_with(kCompletionCode, 0xC1), 0);
    EXPECT_EQ(value_, GetParam().before) << "nothing is taken from the answer";
    EXPECT_EQ(log(), "");
}

TEST_P(IpmiOperation, ClearResultFlagIsAFailure) {
    EXPECT_EQ(run_with(kRefuse), -2);
    EXPECT_EQ(value_, GetParam().before);
    EXPECT_EQ(log(), GetParam().refused == nullptr ? "" : dated(GetParam().refused));
}

TEST_P(IpmiOperation, AnswerOfAnotherFunctionCountsAsDone) {
    EXPECT_EQ(run_with(kWrongFunction), 0) << "the driver makes a completion code of it";
    EXPECT_EQ(value_, GetParam().before);
}

TEST_P(IpmiOperation, ClosedChannelIsAFailure) {
    attach();
    value_ = GetParam().before;
    EXPECT_EQ(GetParam().run(value_), -2);
    EXPECT_EQ(value_, GetParam().before);
    EXPECT_THAT(exchanges(), IsEmpty());
}

INSTANTIATE_TEST_SUITE_P(Every, IpmiOperation, ::testing::ValuesIn(kOperations),
                         [](const auto &about) { return std::string(about.param.name); });

// ---- Secure mode ----

struct Mode {
    const char *text;
    int secure;
};

class IpmiSecureMode : public IpmiTransaction, public ::testing::WithParamInterface<Mode> {};

TEST_P(IpmiSecureMode, IsAYesAnywhereInTheText) {
    connect({}, {.secure_mode = GetParam().text});
    int secure = 7;
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(secure, GetParam().secure);
    EXPECT_EQ(log(), dated("smm : rxc_flash secure mode.\n"));
}

INSTANTIATE_TEST_SUITE_P(Texts, IpmiSecureMode,
                         ::testing::Values(Mode{"yes", 1}, Mode{"YES", 1}, Mode{"no, or yEs?", 1},
                                           Mode{"no", 0}, Mode{"", 0}, Mode{"ye s", 0},
                                           Mode{"NO", 0}, Mode{"enabled", 0}));

TEST_F(IpmiTransaction, SecureModeTextOfFullLengthIsRead) {
    connect({}, {.secure_mode = std::string(119, 'x') + "yes"});
    int secure = 0;
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(secure, 1) << "the answer fills its 128 bytes";
}

TEST_F(IpmiTransaction, SecureModeTextBeyondTheAnswersRoomIsCut) {
    connect({}, {.secure_mode = std::string(124, 'x') + "yes"});
    int secure = 7;
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(secure, 0);
}

// ---- Type ----

TEST_F(IpmiTransaction, TypeIsReadFromTwoBits) {
    for (const auto &[generation, expected] :
         {std::pair{Generation::kNone, 0}, {Generation::kFirst, 1}, {Generation::kSecond, 2}}) {
        connect({}, {.generation = generation});
        int type = 7;
        EXPECT_EQ(get_bmc_type(&type), 0);
        EXPECT_EQ(type, expected);
        disconnect_kcs();
    }
}

TEST_F(IpmiTransaction, TypeQueryFailsOnSilenceAndOnCompletionCodes) {
    connect({fault("bmc.type", kCompletionCode, 0xC1, 1), fault("bmc.type", kNoAnswer)});
    int type = 7;
    EXPECT_EQ(get_bmc_type(&type), -1) << "completion code";
    EXPECT_EQ(elapsed_ms(), 0);
    EXPECT_EQ(get_bmc_type(&type), -1) << "silence";
    EXPECT_EQ(elapsed_ms(), 5000);
    EXPECT_EQ(type, 7);
    disconnect_kcs();
    EXPECT_EQ(get_bmc_type(&type), -1) << "closed channel";
    EXPECT_EQ(log(), "");
}

}  // namespace
}  // namespace velktest
