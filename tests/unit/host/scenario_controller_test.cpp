// What a scenario says of the management controller: its settings, and the faults at its steps.
#include "tests/unit/host/scenario_testing.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

#include "host/scenario/scenario.h"

namespace velkhost::scenario {
namespace {

FaultRule fault(const std::string &keys) {
    return parse("[[fault]]\nstep = 'bmc.create'\n" + keys).faults.at(0);
}

std::string fault_error(const std::string &keys) {
    return error_of("[[fault]]\nstep = 'bmc.create'\n" + keys);
}

constexpr const char *kKnownActions =
    "known are no-answer, late, wrong-function, wrong-command, completion-code, refuse, longer, "
    "vanish";

TEST(ScenarioController, IsASecondGenerationWithoutSecureModeByDefault) {
    const ControllerSettings controller = parse("").controller;
    EXPECT_TRUE(controller.present);
    EXPECT_EQ(controller.type, 2U);
    EXPECT_EQ(controller.secure_mode, "no");
}

TEST(ScenarioController, TakesEveryKey) {
    const Description read =
        parse("[controller]\npresent = false\ntype = 1\nsecure_mode = 'Yes, it is'");
    const Scenario scenario(read);
    EXPECT_FALSE(scenario.controller.present);
    EXPECT_EQ(scenario.controller.type, 1U);
    EXPECT_EQ(scenario.controller.secure_mode, "Yes, it is");
}

TEST(ScenarioController, MistakesAreTold) {
    EXPECT_EQ(error_of("[controller]\ntype = 3"),
              "s.toml:2: [controller] \"type\" must be from 0 to 2, not 3");
    EXPECT_EQ(error_of("[controller]\npresent = 1"),
              "s.toml:2: [controller] \"present\" must be true or false, not a whole number");
    EXPECT_EQ(error_of("[controller]\nkind = 1"),
              "s.toml:2: [controller] unknown key \"kind\"; known are present, type, secure_mode");
    EXPECT_EQ(error_of("[controller]\nsecure_mode = '" + std::string(128, 'x') + "'"),
              "s.toml:2: [controller] \"secure_mode\" must be at most 127 bytes long");
    EXPECT_EQ(error_of("[controller]\nsecure_mode = '" + std::string(127, 'x') + "'"), "no error");
}

TEST(ScenarioControllerFault, TakesEveryAction) {
    using enum ControllerFault;
    EXPECT_EQ(fault("action = 'no-answer'").controller, kNoAnswer);
    EXPECT_EQ(fault("action = 'wrong-function'").controller, kWrongFunction);
    EXPECT_EQ(fault("action = 'wrong-command'").controller, kWrongCommand);
    EXPECT_EQ(fault("action = 'refuse'").controller, kRefuse);
    EXPECT_EQ(fault("action = 'vanish'").controller, kVanish);
}

TEST(ScenarioControllerFault, TakesTheNumberOfItsAction) {
    const FaultRule late = fault("action = 'late'\nseconds = 7\nafter = 2\ncount = 'always'");
    EXPECT_EQ(late.controller, ControllerFault::kLate);
    EXPECT_EQ(late.code, 7);
    EXPECT_EQ(late.after, 2U);
    EXPECT_EQ(late.count, FaultRule::kAlways);
    const FaultRule code = fault("action = 'completion-code'\ncode = 0xC0\nmatch = 'XFLASH'");
    EXPECT_EQ(code.controller, ControllerFault::kCompletionCode);
    EXPECT_EQ(code.code, 0xC0);
    EXPECT_EQ(code.match, "XFLASH");
    EXPECT_EQ(fault("action = 'longer'\nbytes = 300").code, 300);
}

TEST(ScenarioControllerFault, MistakesAreTold) {
    EXPECT_EQ(fault_error(""),
              std::string("s.toml:1: [fault] \"action\" is missing; ") + kKnownActions);
    EXPECT_EQ(fault_error("action = 'sleep'"),
              std::string("s.toml:3: [fault] \"action\" is unknown; ") + kKnownActions);
    EXPECT_EQ(fault_error("action = 'late'"),
              "s.toml:1: [fault] \"seconds\" is missing; \"late\" needs it");
    EXPECT_EQ(fault_error("action = 'late'\nseconds = 0"),
              "s.toml:4: [fault] \"seconds\" must be from 1 to 3600, not 0");
    EXPECT_EQ(fault_error("action = 'completion-code'\ncode = 256"),
              "s.toml:4: [fault] \"code\" must be from 1 to 255, not 256");
    EXPECT_EQ(fault_error("action = 'refuse'\ncode = 1"),
              "s.toml:4: [fault] unknown key \"code\"; known are step, match, after, count, "
              "action");
}

TEST(ScenarioControllerFault, RulesHandTheActionOn) {
    FaultRules rules({fault("action = 'late'\nseconds = 7")});
    const auto struck = rules.take("bmc.create", "create XFLASH");
    ASSERT_TRUE(struck);
    EXPECT_EQ(struck->controller, ControllerFault::kLate);
    EXPECT_EQ(struck->code, 7);
}

TEST(ScenarioControllerFault, OtherStepsKnowNoAction) {
    EXPECT_EQ(
        error_of("[[fault]]\nstep = 'zeb.job'\ncode = 1\naction = 'late'"),
        "s.toml:4: [fault] unknown key \"action\"; known are step, match, after, count, code, "
        "message");
}

}  // namespace
}  // namespace velkhost::scenario
