// What a scenario says of the in-band network.
#include "tests/unit/host/scenario_testing.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace velkhost::scenario {
namespace {

using ::testing::HasSubstr;
using ::testing::IsEmpty;

NetworkSettings read(const std::string &text) {
    return parse(text).network;
}

TEST(ScenarioNetwork, HasNoNodesByDefault) {
    const NetworkSettings settings = read("");
    EXPECT_THAT(settings.nodes, IsEmpty());
    EXPECT_EQ(settings.age_seconds, 0U);
    EXPECT_EQ(settings.configure_seconds, 12U);
}

TEST(ScenarioNetwork, KeysAreRead) {
    const NetworkSettings settings = read(
        "[network]\nage = 900\nconfigure = 3600\n"
        "[[network.node]]\ndevice = 'd'\nhypervisor = 'h'\ncontroller = 'c'\n"
        "[[network.node]]\ndevice = 'd2'\nhypervisor = 'h2'\ncontroller = 'c2'\n");
    EXPECT_EQ(settings.age_seconds, 900U);
    EXPECT_EQ(settings.configure_seconds, 3600U);
    ASSERT_EQ(settings.nodes.size(), 2U);
    EXPECT_EQ(settings.nodes[0].device, "d");
    EXPECT_EQ(settings.nodes[1].hypervisor, "h2");
    EXPECT_EQ(settings.nodes[1].controller, "c2");
}

TEST(ScenarioNetwork, MayNeverBeConfigured) {
    EXPECT_EQ(read("[network]\nconfigure = 'never'\n").configure_seconds, std::nullopt);
    EXPECT_THAT(error_of("[network]\nconfigure = 'soon'\n"),
                HasSubstr("s.toml:2: [network] \"configure\" must be a whole number of seconds or "
                          "\"never\""));
    EXPECT_THAT(error_of("[network]\nconfigure = 0\n"), HasSubstr("s.toml:2: "));
    EXPECT_THAT(error_of("[network]\nconfigure = 3601\n"), HasSubstr("s.toml:2: "));
}

TEST(ScenarioNetwork, NodesNeedEachOfTheirTexts) {
    EXPECT_THAT(error_of("[[network.node]]\ndevice = 'd'\nhypervisor = 'h'\n"),
                HasSubstr("\"controller\" is missing"));
    EXPECT_THAT(error_of("[[network.node]]\ndevice = ''\nhypervisor = 'h'\ncontroller = 'c'\n"),
                HasSubstr("s.toml:2: "));
    EXPECT_THAT(error_of("[[network.node]]\ndevice = 'd'\nhypervisor = 'a b'\ncontroller = 'c'\n"),
                HasSubstr("must be a text without blanks"));
    EXPECT_THAT(error_of("[[network.node]]\ndevice = 'd'\nhypervisor = 'h'\ncontroller = 'c'\n"
                         "rxc = 'x'\n"),
                HasSubstr("unknown key \"rxc\""));
}

}  // namespace
}  // namespace velkhost::scenario
