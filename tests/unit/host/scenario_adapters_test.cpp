// What a scenario says of adapters and of their vendors' services.
#include "host/scenario/scenario.h"
#include "tests/unit/host/scenario_testing.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <string>

namespace velkhost::scenario {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

std::string adapter_error(const std::string &keys) {
    return error_of("[[adapter]]\n" + keys);
}

const std::vector<ServiceAnswer> &answers(const Description &read, AdapterFamily family) {
    return read.adapter_answers.at(static_cast<std::size_t>(family));
}

TEST(ScenarioAdapters, HostHasNoneByDefault) {
    EXPECT_THAT(parse("").adapters, IsEmpty());
    EXPECT_THAT(Scenario().adapters, IsEmpty());
}

TEST(ScenarioAdapters, TakeEveryKeyAndKeepTheirOrder) {
    const Description read = parse(
        "[[adapter]]\nfamily = 'brocade'\nname = 'HBA'\ndfn = 'D'\nserial = 'S'\nfirmware = '1.0'\n"
        "fc_ports = ['a', 'b']\nport_name = 'P'\n[[adapter]]\nfamily = 'emulex_cna'\n"
        "nic_ports = ['c']\nconnectors = false\ncard = false\n");
    ASSERT_EQ(read.adapters.size(), 2U);
    const Adapter &first = read.adapters[0];
    EXPECT_EQ(first.family, AdapterFamily::kBrocade);
    EXPECT_EQ(first.name, "HBA");
    EXPECT_EQ(first.dfn, "D");
    EXPECT_EQ(first.serial, "S");
    EXPECT_EQ(first.firmware, "1.0");
    EXPECT_THAT(first.fc_ports, ElementsAre("a", "b"));
    EXPECT_EQ(first.port_name, "P");
    const Adapter &second = read.adapters[1];
    EXPECT_EQ(second.family, AdapterFamily::kEmulexCna);
    EXPECT_THAT(second.nic_ports, ElementsAre("c"));
    EXPECT_FALSE(second.connectors);
    EXPECT_FALSE(second.card);
}

TEST(ScenarioAdapters, WhatIsLeftOutIsNotTold) {
    const Adapter adapter = parse("[[adapter]]\nfamily = 'lsi'").adapters.at(0);
    EXPECT_EQ(adapter.name, "");
    EXPECT_FALSE(adapter.dfn.has_value());
    EXPECT_FALSE(adapter.serial.has_value());
    EXPECT_TRUE(adapter.connectors);
    EXPECT_TRUE(adapter.card);
}

TEST(ScenarioAdapters, FamilyMustBeOneThatIsKnown) {
    const std::string known = "known are emulex_fc, emulex_cna, qlogic, brocade, broadcom, lsi";
    EXPECT_EQ(adapter_error("family = 'intel'"),
              "s.toml:2: [adapter] \"family\" is unknown; " + known);
    EXPECT_EQ(adapter_error("name = 'x'"), "s.toml:1: [adapter] \"family\" is missing; " + known);
}

TEST(ScenarioAdapters, FamiliesKnowTheirKeysAlone) {
    EXPECT_EQ(adapter_error("family = 'lsi'\nfc_ports = ['a']"),
              "s.toml:3: [adapter] unknown key \"fc_ports\"; known are family, name, dfn, serial, "
              "firmware");
    EXPECT_EQ(adapter_error("family = 'emulex_fc'\nnic_ports = ['a']"),
              "s.toml:3: [adapter] unknown key \"nic_ports\"; known are family, name, dfn, serial, "
              "firmware, fc_ports");
    EXPECT_EQ(adapter_error("family = 'qlogic'\nnic_ports = ['a']\nfc_ports = ['a']"), "no error");
    EXPECT_EQ(adapter_error("family = 'qlogic'\ncard = true"),
              "s.toml:3: [adapter] unknown key \"card\"; known are family, name, dfn, serial, "
              "firmware, nic_ports, fc_ports");
}

TEST(ScenarioAdapters, PortsOfAFamilyAreTheirOwn) {
    EXPECT_EQ(adapter_error("family = 'brocade'\nfc_ports = ['a', 'a']"),
              "s.toml:3: [adapter] \"fc_ports\" names \"a\" twice");
    EXPECT_EQ(adapter_error("family = 'brocade'\nfc_ports = ['']"),
              "s.toml:3: [adapter] \"fc_ports\" must not hold an empty id");
    EXPECT_EQ(adapter_error("family = 'brocade'\nfc_ports = ['a']\n"
                            "[[adapter]]\nfamily = 'brocade'\nfc_ports = ['b', 'a']"),
              "s.toml:5: [adapter] \"family\" has an adapter with one of these ports already");
    EXPECT_EQ(adapter_error("family = 'brocade'\nfc_ports = ['a']\n"
                            "[[adapter]]\nfamily = 'emulex_fc'\nfc_ports = ['a']"),
              "no error");
}

struct UsualAnswer {
    const char *table;
    AdapterFamily family;
    std::uint32_t return_value;
};

class ScenarioAdapterService : public ::testing::TestWithParam<UsualAnswer> {};

TEST_P(ScenarioAdapterService, AnswersAsUsualUnlessItIsToldOtherwise) {
    Scenario host(parse("[[" + std::string(GetParam().table) + ".answer]]\nmatch = 'x'\n[[" +
                        GetParam().table + ".answer]]\nmatch = 'y'\nreturn_value = 3\n"));
    AnswerBook &book = host.adapter_service(GetParam().family);
    EXPECT_EQ(book.next("a").return_value, GetParam().return_value);
    EXPECT_EQ(book.next("x").return_value, GetParam().return_value);
    EXPECT_EQ(book.next("y").return_value, 3U);
}

INSTANTIATE_TEST_SUITE_P(Every, ScenarioAdapterService,
                         ::testing::Values(UsualAnswer{"emulex_fc", AdapterFamily::kEmulexFc, 0},
                                           UsualAnswer{"emulex_cna", AdapterFamily::kEmulexCna, 0},
                                           UsualAnswer{"qlogic", AdapterFamily::kQlogic, 4096},
                                           UsualAnswer{"brocade", AdapterFamily::kBrocade, 0},
                                           UsualAnswer{"broadcom", AdapterFamily::kBroadcom, 4096},
                                           UsualAnswer{"lsi", AdapterFamily::kLsi, 0}),
                         [](const auto &about) { return std::string(about.param.table); });

TEST(ScenarioAdapterServices, JobsHaveAStateAStatusAndAPercentage) {
    const Description read =
        parse("[[qlogic.answer]]\njob = [{}, { percent = 100, status = 'x' }]");
    const auto &job = *answers(read, AdapterFamily::kQlogic).at(0).job;
    EXPECT_EQ(job.at(0).job_state, 4U);
    EXPECT_FALSE(job.at(0).percent.has_value());
    EXPECT_EQ(job.at(1).percent, 100U);
    EXPECT_EQ(job.at(1).job_status, "x");
}

TEST(ScenarioAdapterServices, UpdatesHaveAStatusNumberAlone) {
    const Description read = parse("[[broadcom.answer]]\njob = [{ looks = 2 }, { state = 0 }]");
    const auto &job = *answers(read, AdapterFamily::kBroadcom).at(0).job;
    EXPECT_EQ(job.at(0).job_state, kUpdateRunning);
    EXPECT_EQ(job.at(1).job_state, kUpdateDone);
    EXPECT_EQ(error_of("[[broadcom.answer]]\njob = [{ status = 'x' }]"),
              "s.toml:2: [broadcom.answer.job] unknown key \"status\"; known are state, looks, "
              "absent");
}

TEST(ScenarioAdapterServices, WhatIsOverAtOnceHasNoJob) {
    EXPECT_EQ(error_of("[[lsi.answer]]\nreturn_value = 4096\njob = []"),
              "s.toml:3: [lsi.answer] unknown key \"job\"; known are match, return_value, status, "
              "message");
}

TEST(ScenarioAdapterServices, PercentageIsOneOfAHundred) {
    EXPECT_EQ(error_of("[[qlogic.answer]]\njob = [{ percent = 101 }]"),
              "s.toml:2: [qlogic.answer.job] \"percent\" must be from 0 to 100, not 101");
}

TEST(ScenarioAdapterServices, FaultsStrikeAtTheirSteps) {
    for (const char *family : {"emulex_fc", "emulex_cna", "qlogic", "brocade", "broadcom", "lsi"}) {
        EXPECT_EQ(error_of("[[fault]]\nstep = '" + std::string(family) + ".install'\ncode = 1"),
                  "no error");
    }
}

}  // namespace
}  // namespace velkhost::scenario
