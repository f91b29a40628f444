// The controller as a user of its commands sees it: exact answers, and the trace.
#include "host/bmc/controller.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "tests/unit/host/bmc_testing.h"

namespace velkhost::bmc::test {
namespace {

using ::testing::SizeIs;

TEST(BmcController, TypeQueryTellsTheGeneration) {
    const auto type_of = [](Generation generation) {
        Controller controller({.generation = generation});
        return ask(controller, type_query());
    };
    EXPECT_EQ(type_of(Generation::kNone), "00 00 00");
    EXPECT_EQ(type_of(Generation::kFirst), "00 80 00");
    EXPECT_EQ(type_of(Generation::kSecond), "00 00 01");
}

TEST(BmcController, TypeQueryTakesNoData) {
    Controller controller({});
    EXPECT_EQ(ask(controller, {kOem, 0xC1, {0}}), "C7");
}

TEST(BmcController, AnswersWithTheResponseFunctionAndTheCommand) {
    Controller controller({});
    const Reply reply = controller.handle(type_query(), 0);
    ASSERT_TRUE(reply.response);
    EXPECT_EQ(reply.response->netfn, 0x3B);
    EXPECT_EQ(reply.response->cmd, 0xC1);
    EXPECT_EQ(reply.delay.count(), 0);
    EXPECT_FALSE(reply.device_gone);
}

TEST(BmcController, WholeSession) {
    Controller controller({.first_handle = 0x01020304});
    EXPECT_EQ(ask(controller, create()), "00 01 01 00 05 44 01 02 03 04");
    EXPECT_EQ(ask(controller, open(0x01020304)), "00 03 01 00 00");
    EXPECT_EQ(ask(controller, with_handle(0x08, 0x01020304)), "00 08 01 00 00");
    EXPECT_EQ(controller.transaction_state(), TransactionState::kBegun);
    EXPECT_EQ(ask(controller, with_handle(0x09, 0x01020304)), "00 09 01 00 00");
    EXPECT_EQ(ask(controller, with_handle(0x0E, 0x01020304)), "00 0E 01 00 00");
    EXPECT_EQ(ask(controller, with_handle(0x04, 0x01020304)), "00 04 01 00 00");
    EXPECT_EQ(ask(controller, with_handle(0x02, 0x01020304)), "00 02 01 00 00");
    EXPECT_EQ(controller.transaction_state(), TransactionState::kNone);
}

TEST(BmcController, StepsOutOfOrderAnswerWithTheFlagClear) {
    Controller controller({});
    EXPECT_EQ(ask(controller, open(1)), "00 03 00 00 00");
    EXPECT_EQ(ask(controller, create()), "00 01 01 00 05 44 00 00 00 01");
    EXPECT_EQ(ask(controller, create()), "00 01 00 00 00");
    EXPECT_EQ(ask(controller, with_handle(0x08, 1)), "00 08 00 00 00");
    EXPECT_EQ(ask(controller, with_text(0x01, "OTHER")), "00 01 00 00 00");
}

TEST(BmcController, SecureModeIsYesInAnyLetterCase) {
    for (const char *text : {"yes", "YES", "Secure: Yes!"}) {
        Controller controller({.secure_mode = text});
        ask(controller, create());
        EXPECT_EQ(ask(controller, open(1)), "00 03 00 00 00") << text;
        EXPECT_EQ(ask(controller, with_handle(0x08, 1)), "00 08 01 00 00") << text;
    }
}

TEST(BmcController, VariableReturnsItsText) {
    Controller controller({.secure_mode = "no"});
    EXPECT_EQ(ask(controller, with_text(0x16, "secure_mode")), "00 16 01 00 03 82 6E 6F");
    EXPECT_EQ(ask(controller, with_text(0x16, "other")), "00 16 00 00 00");
}

TEST(BmcController, WrongLengthsAreTold) {
    Controller controller({});
    EXPECT_EQ(ask(controller, {kOem, 0xF0, {}}), "C7");
    EXPECT_EQ(ask(controller, {kOem, 0xF0, {0x01, 0, 0}}), "C7");
    EXPECT_EQ(ask(controller, {kOem, 0xF0, {0x01, 0, 0, 2, 0x81}}), "C7");
    EXPECT_EQ(ask(controller, {kOem, 0xF0, {0x01, 0, 0, 1, 0x81, 'X'}}), "C7");
}

TEST(BmcController, WrongFieldsAreTold) {
    Controller controller({});
    EXPECT_EQ(ask(controller, flash(0x77, {})), "CC") << "unknown operation";
    EXPECT_EQ(ask(controller, flash(0x01, {0x86, 'X'})), "CC") << "element cut off";
    EXPECT_EQ(ask(controller, flash(0x01, {})), "CC") << "no name";
    EXPECT_EQ(ask(controller, with_handle(0x01, 5)), "CC") << "a number for a name";
    EXPECT_EQ(ask(controller, with_text(0x08, "5")), "CC") << "a name for a number";
    EXPECT_EQ(ask(controller, with_handle(0x16, 5)), "CC");
    EXPECT_EQ(ask(controller, with_handle(0x03, 5)), "CC") << "no name";
    EXPECT_EQ(ask(controller, flash(0x03, {0x44, 0, 0, 0, 5, 0x81, 'n', 0x44, 0, 0, 0, 1})), "CC")
        << "another flag";
}

TEST(BmcController, OpenNeedsNoFlag) {
    Controller controller({});
    ask(controller, create());
    EXPECT_EQ(ask(controller, flash(0x03, {0x44, 0, 0, 0, 1, 0x81, 'n'})), "00 03 01 00 00");
}

TEST(BmcController, UnknownCommandsAreTold) {
    Controller controller({});
    EXPECT_EQ(ask(controller, {kOem, 0x01, {}}), "C1");
    EXPECT_EQ(ask(controller, {0x2E, 0xF0, {}}), "C1");
    EXPECT_EQ(ask(controller, {kApplicationFunction, 0x42, {0}}), "C1");
}

TEST(BmcController, OnlyTheSecondGenerationHasSessions) {
    for (const Generation generation : {Generation::kNone, Generation::kFirst}) {
        Controller controller({.generation = generation});
        EXPECT_EQ(ask(controller, create()), "C1");
    }
}

TEST(BmcController, StandardCommandsServeADriversProbe) {
    Controller controller({});
    const auto app = [&](std::uint8_t cmd, Bytes data) {
        return ask(controller, {kApplicationFunction, cmd, std::move(data)});
    };
    EXPECT_EQ(app(0x01, {}), "00 20 01 05 01 02 00 00 00 00 00 00 00 00 00 00");
    EXPECT_EQ(app(0x2F, {}), "00 00");
    EXPECT_EQ(app(0x2E, {0x0D}), "00");
    EXPECT_EQ(app(0x2F, {}), "00 0D") << "the value is kept";
    EXPECT_EQ(app(0x30, {0x08}), "00");
    EXPECT_EQ(app(0x31, {}), "00 00");
    EXPECT_EQ(app(0x01, {1}), "C7");
    EXPECT_EQ(app(0x2E, {}), "C7");
}

TEST(BmcController, TraceTellsEveryExchangeInWords) {
    Controller controller({.first_handle = 5});
    ask(controller, create(), 1'000'000);
    ask(controller, type_query(), 3'100'000);
    const auto trace = controller.trace();
    ASSERT_THAT(trace, SizeIs(2));
    EXPECT_EQ(trace[0].time_us, 1'000'000);
    EXPECT_EQ(trace[0].words, "create XFLASH -> handle 5");
    EXPECT_EQ(in_words(trace[0], 0),
              "    1.000  3A F0 | 01 00 00 07 86 58 46 4C 41 53 48 -> 00 01 01 00 05 44 00 00 00 "
              "05 | create XFLASH -> handle 5");
    EXPECT_EQ(in_words(trace[1], 1'000'000),
              "    2.100  3A C1 | -> 00 00 01 | type query -> second generation");
}

TEST(BmcController, AnyBytesGetAnAnswer) {
    Controller controller({});
    for (int length = 0; length < 12; ++length) {
        for (int value = 0; value < 256; ++value) {
            const Bytes data(static_cast<std::size_t>(length), static_cast<std::uint8_t>(value));
            const Reply reply = controller.handle({kOem, 0xF0, data}, 0);
            ASSERT_TRUE(reply.response);
            ASSERT_FALSE(reply.response->data.empty());
        }
    }
}

}  // namespace
}  // namespace velkhost::bmc::test
