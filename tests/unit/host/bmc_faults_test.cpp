// Faults of the controller: what each does to the answer, and whether the request was served.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/unit/host/bmc_testing.h"

namespace velkhost::bmc::test {
namespace {

using enum scenario::ControllerFault;

// A controller whose create is struck by one fault.
class BmcFaults : public ::testing::Test {
  protected:
    Reply create_with(scenario::ControllerFault fault, int code = 0) {
        rules_.emplace(std::vector{rule("bmc.create", fault, code)});
        controller_.emplace(Settings{}, rules_->source());
        return controller_->handle(create(), 0);
    }

    [[nodiscard]] bool was_served() const {
        return controller_->transaction_state() == TransactionState::kCreated;
    }
    [[nodiscard]] std::string words() const { return controller_->trace().back().words; }

    std::optional<Rules> rules_;
    std::optional<Controller> controller_;
};

TEST_F(BmcFaults, NoAnswerIsSilence) {
    EXPECT_FALSE(create_with(kNoAnswer).response);
    EXPECT_FALSE(was_served());
    EXPECT_EQ(words(), "create XFLASH -> no answer");
}

TEST_F(BmcFaults, LateAnswerIsServedAtOnce) {
    const Reply reply = create_with(kLate, 7);
    EXPECT_TRUE(reply.response);
    EXPECT_EQ(reply.delay, std::chrono::seconds(7));
    EXPECT_TRUE(was_served());
    EXPECT_EQ(words(), "create XFLASH -> handle 1, 7 s late");
}

TEST_F(BmcFaults, WrongFunctionIsAnotherResponseFunction) {
    const Reply reply = create_with(kWrongFunction);
    EXPECT_EQ(reply.response->netfn, 0x39);
    EXPECT_EQ(reply.response->cmd, 0xF0);
    EXPECT_TRUE(was_served());
    EXPECT_EQ(words(), "create XFLASH -> handle 1, with function 0x39");
}

TEST_F(BmcFaults, WrongCommandKeepsTheFunction) {
    const Reply reply = create_with(kWrongCommand);
    EXPECT_EQ(reply.response->netfn, 0x3B);
    EXPECT_EQ(reply.response->cmd, 0xF1);
    EXPECT_EQ(words(), "create XFLASH -> handle 1, with command 0xF1");
}

TEST_F(BmcFaults, CompletionCodeIsAllThereIs) {
    const Reply reply = create_with(kCompletionCode, 0xC0);
    EXPECT_EQ(reply.response->data, (Bytes{0xC0}));
    EXPECT_FALSE(was_served());
    EXPECT_EQ(words(), "create XFLASH -> completion code 0xC0");
}

TEST_F(BmcFaults, RefusalClearsTheResultFlag) {
    const Reply reply = create_with(kRefuse);
    EXPECT_EQ(reply.response->data, (Bytes{0, 1, 0, 0, 0}));
    EXPECT_FALSE(was_served());
    EXPECT_EQ(words(), "create XFLASH -> refused");
}

TEST_F(BmcFaults, LongerAnswerIsFilledUp) {
    const Reply reply = create_with(kLonger, 300);
    ASSERT_EQ(reply.response->data.size(), 300U);
    EXPECT_EQ(reply.response->data[9], 1) << "the answer itself";
    EXPECT_EQ(reply.response->data[299], 0);
    EXPECT_EQ(words(), "create XFLASH -> handle 1, 300 bytes long");
}

TEST_F(BmcFaults, LongerNeverShortens) {
    EXPECT_EQ(create_with(kLonger, 1).response->data.size(), 10U);
}

TEST_F(BmcFaults, AVanishedDeviceStaysAway) {
    EXPECT_TRUE(create_with(kVanish).device_gone);
    EXPECT_EQ(words(), "create XFLASH -> the device is gone");
    EXPECT_EQ(ask(*controller_, type_query()), "gone");
    EXPECT_EQ(controller_->trace().size(), 1U) << "nothing reaches it any more";
}

TEST(BmcFaultSteps, EveryRequestIsAStep) {
    std::vector<std::string> steps;
    Controller controller({}, [&](std::string_view step, std::string_view subject) {
        steps.push_back(std::string(step) + " " + std::string(subject));
        return std::optional<scenario::Fault>();
    });
    for (const Request &request :
         {type_query(), create(), with_handle(0x02, 1), open(1), with_handle(0x04, 1),
          with_handle(0x08, 1), with_handle(0x09, 1), with_handle(0x0E, 1),
          with_text(0x16, "secure_mode"), flash(0x55, {}), Request{6, 1, {}}, Request{4, 1, {}}}) {
        controller.handle(request, 0);
    }
    EXPECT_THAT(steps,
                ::testing::ElementsAre("bmc.type type query", "bmc.create create XFLASH",
                                       "bmc.destroy destroy 1", "bmc.open open 1 optfw 128",
                                       "bmc.close close 1", "bmc.begin begin 1",
                                       "bmc.status status 1", "bmc.cancel cancel 1",
                                       "bmc.variable variable secure_mode", "bmc.unknown unknown",
                                       "bmc.standard get device id", "bmc.unknown 0x04/0x01"));
}

TEST(BmcFaultSteps, RefusedTypeQueryIsOfNoGeneration) {
    Rules rules({rule("bmc.type", kRefuse)});
    Controller controller({}, rules.source());
    EXPECT_EQ(ask(controller, type_query()), "00 00 00");
}

}  // namespace
}  // namespace velkhost::bmc::test
