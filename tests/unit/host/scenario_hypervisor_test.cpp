// What a scenario says of the hypervisor.
#include "host/scenario/scenario.h"
#include "tests/unit/host/scenario_testing.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace velkhost::scenario {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Optional;

HypervisorSettings read(const std::string &text) {
    return parse(text).hypervisor;
}

TEST(ScenarioHypervisor, IsTheHostAloneByDefault) {
    const HypervisorSettings settings = read("");
    EXPECT_EQ(settings.systems, std::nullopt);
    EXPECT_THAT(settings.installed, IsEmpty());
    EXPECT_THAT(settings.earlier_jobs, IsEmpty());
    EXPECT_THAT(settings.answers, IsEmpty());
}

TEST(ScenarioHypervisor, KeysAreRead) {
    const HypervisorSettings settings = read(
        "[hypervisor]\nsystems = ['a', 'b']\ninstalled = ['esx-base 5.1.0-0.5']\n"
        "earlier_jobs = ['done', '']\n[[hypervisor.answer]]\nreturn_value = 0\n");
    EXPECT_THAT(settings.systems, Optional(ElementsAre("a", "b")));
    EXPECT_THAT(settings.installed, ElementsAre("esx-base 5.1.0-0.5"));
    EXPECT_THAT(settings.earlier_jobs, ElementsAre("done", ""));
    ASSERT_EQ(settings.answers.size(), 1U);
    EXPECT_EQ(settings.answers[0].return_value, 0U);
}

TEST(ScenarioHypervisor, HostMayHaveNoService) {
    EXPECT_THAT(read("[hypervisor]\nsystems = []\n").systems, Optional(IsEmpty()));
}

TEST(ScenarioHypervisor, PackagesNeedANameAndAVersion) {
    for (const char *package : {"esx-base", "esx-base ", " 5.1", "", "a b c"}) {
        EXPECT_EQ(error_of("[hypervisor]\ninstalled = ['x 1', '" + std::string(package) + "']\n"),
                  "s.toml:2: [hypervisor] \"installed\" must hold names with a version, not \"" +
                      std::string(package) + '"');
    }
}

TEST(ScenarioHypervisor, UnknownKeysAndWrongTypesAreErrors) {
    EXPECT_THAT(error_of("[hypervisor]\nsystem = 'a'\n"),
                HasSubstr("s.toml:2: [hypervisor] unknown key \"system\""));
    EXPECT_THAT(error_of("[hypervisor]\nsystems = 'a'\n"), HasSubstr("s.toml:2: "));
    EXPECT_THAT(error_of("[hypervisor]\nearlier_jobs = [1]\n"), HasSubstr("s.toml:2: "));
}

TEST(ScenarioHypervisor, ItsStepsTakeFaults) {
    const Description description =
        parse_description("[[fault]]\nstep = 'hypervisor.install'\ncode = 4\n", "s.toml");
    ASSERT_EQ(description.faults.size(), 1U);
    EXPECT_EQ(description.faults[0].code, 4);
}

TEST(ScenarioHypervisor, ServiceDealsItsAnswersInTurn) {
    Scenario scenario(parse_description(
        "[[hypervisor.answer]]\nstatus = 1\n[[hypervisor.answer]]\nreturn_value = 7\n", "s.toml"));
    EXPECT_EQ(scenario.hypervisor_service.next("x").status, 1);
    EXPECT_EQ(scenario.hypervisor_service.next("x").return_value, 7U);
    EXPECT_EQ(scenario.hypervisor_service.next("x").return_value, 7U);
}

}  // namespace
}  // namespace velkhost::scenario
