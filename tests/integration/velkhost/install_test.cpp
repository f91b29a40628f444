// `velkhost install` on pipes: lines, table, JSON, files, exit codes.
#include "tests/integration/velkhost/fixture.h"

#include <gmock/gmock.h>

#include <fstream>
#include <iterator>
#include <regex>

namespace velkhost::testing {
namespace {

namespace fs = std::filesystem;
using ::testing::HasSubstr;
using ::testing::Not;

class VelkhostInstall : public VelkhostTest {};

TEST_F(VelkhostInstall, OnePackageEndsWithZeroAndTheWholeStory) {
    const Finished finished = velkhost({"install", package()});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_EQ(finished.err, "");
    EXPECT_TRUE(finished.out.starts_with(
        "velkhost: 1 package for esxi-01.example.com, virtual clock, scenario built-in default\n"));
    for (const char *line :
         {"[+00:00:10] zeb_fw_rxc_r1ao58-3.10_anyos  62  Initialization and Package installation "
          "is running.\n",
          "[+00:01:10] zeb_fw_rxc_r1ao58-3.10_anyos  50  Package installation successfully.\n",
          "job             VELK-1: 7 Completed\n", "\n1 of 1 package installed\n"}) {
        EXPECT_THAT(finished.out, HasSubstr(line));
    }
    EXPECT_EQ(finished.out.find('\x1b'), std::string::npos);
}

TEST_F(VelkhostInstall, FinishedRunKeepsItsFolderAndNamesItsFiles) {
    const auto document = velkhost_json({package()});
    ASSERT_EQ(run_folders().size(), 1U);
    const fs::path folder = document["files"]["folder"].get<std::string>();
    EXPECT_EQ(run_folders()[0], folder);
    std::ifstream log(document["files"]["debug_log"].get<std::string>());
    const std::string text{std::istreambuf_iterator<char>(log), {}};
    EXPECT_THAT(text, HasSubstr("asyncInstallAllPkgs finish."));
    EXPECT_TRUE(fs::exists(document["files"]["status_file"].get<std::string>()));
}

// The library prints what it trims off the names of adapters.
TEST_F(VelkhostInstall, WhatTheLibraryPrintsIsKeptApart) {
    if (VELKHOST_READS_ARCHIVES == 0) {
        GTEST_SKIP() << "a host for an ABI without libzip cannot read adapter packages";
    }
    const std::string name = "brcd_fw_fc_1860-3.2.1.0_anyos";
    const Finished finished = velkhost(
        {"install", "--scenario", std::string(kScenarios) + "default.toml", package(name)});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, Not(HasSubstr("trimString")));
    ASSERT_EQ(run_folders().size(), 1U);
    std::ifstream printed(run_folders()[0] / "var/log/broker-stdout.txt");
    const std::string text{std::istreambuf_iterator<char>(printed), {}};
    EXPECT_THAT(text, HasSubstr("trimString: trimmed to \"1860-2P\"\n"));
}

TEST_F(VelkhostInstall, DiscardLeavesNothing) {
    const Finished finished = velkhost({"install", "--discard", package()});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_TRUE(run_folders().empty());
    EXPECT_THAT(finished.out, Not(HasSubstr("run folder")));
}

TEST_F(VelkhostInstall, RootIsUsedAndKept) {
    const fs::path root = place_ / "root";
    for (int i = 0; i < 2; ++i) {  // the second time with what the first one left
        const auto document = velkhost_json({"--root", root.string(), "--discard", package()});
        EXPECT_EQ(document["exit_code"], 0);
        EXPECT_EQ(document["files"]["folder"], root.string());
    }
    EXPECT_TRUE(fs::exists(root / "tmp/velkdebug.txt"));
    EXPECT_TRUE(run_folders().empty());
}

// What every run of a scenario has in common. The thread sanitizer begins threads in any order, so
// that there a job's state is seen one look earlier or later.
std::string without_chance(const std::string &output) {
    std::string text = output.substr(0, output.find("time "));
#if defined(__SANITIZE_THREAD__)
    text = std::regex_replace(text, std::regex("\\[[^\n]*\\] job [^\n]*\n"), "");
#endif
    return text;
}

TEST_F(VelkhostInstall, RunsOfAScenarioAreTheSame) {
    const auto uris = example_request("default");
    std::vector<std::string> arguments = {"install", "--discard", "--scenario",
                                          std::string(kScenarios) + "default.toml"};
    arguments.insert(arguments.end(), uris.begin(), uris.end());
    const std::string first = velkhost(arguments).out;
    EXPECT_EQ(without_chance(velkhost(arguments).out), without_chance(first));
}

TEST_F(VelkhostInstall, PackagesAreInstalledInTheirOrder) {
    const auto uris = example_request("firmware");
    const auto document = velkhost_json({uris.begin(), uris.end()});
    std::vector<std::string> order;
    for (const auto &entry : document["history"]) {
        if (entry["code"] == 50) {
            order.push_back(entry["package"]);
        }
    }
    EXPECT_EQ(order, (std::vector<std::string>{
                         "pakro_utl_diag_dsyt9k-9.30_anyos", "zeb_fw_uefi_d7e148-1.60_anyos",
                         "zeb_fw_uefi_d7e142-1.50_anyos", "zeb_fw_rxc_node2_r1ao58-3.10_anyos",
                         "zeb_fw_rxc2_r2ao14-1.22_anyos", "zeb_fw_rxc_r1ao58-3.10_anyos",
                         "zeb_fw_fpga_f4e031-2.04_anyos"}));
}

TEST_F(VelkhostInstall, PathsAndListsAreTakenAsWell) {
    const std::string uri = package();
    const std::string path = uri.substr(sizeof("file://") - 1);
    const auto document =
        velkhost_json({path, uri + "|" + package("zeb_fw_rxc_node2_r1ao58-3.10_anyos")});
    EXPECT_EQ(document["request"]["uris"][0], uri);
    EXPECT_EQ(document["packages"].size(), 3U);
}

TEST_F(VelkhostInstall, UnsupportedPackageIsNoSuccess) {
    const auto document = velkhost_json({package("pakro_dd_tape_t5h6-1.08_anyos")});
    EXPECT_EQ(document["exit_code"], 1);
    EXPECT_EQ(document["packages"][0]["outcome"], "not supported");
    EXPECT_EQ(document["packages"][0]["code"], 80);
}

TEST_F(VelkhostInstall, PackagesBeyondTheTwentiethAreNotTaken) {
    std::vector<std::string> arguments = {"install", "--json"};
    arguments.insert(arguments.end(), 22, package());
    const Finished finished = velkhost(arguments);
    EXPECT_EQ(finished.exit_code, 1);
    EXPECT_THAT(finished.err, HasSubstr("leaves the last 2 out"));
    const auto document = nlohmann::json::parse(finished.out);
    ASSERT_EQ(document["packages"].size(), 22U);
    EXPECT_EQ(document["packages"][19]["outcome"], "installed");
    EXPECT_EQ(document["packages"][20]["outcome"], "not taken");
}

TEST_F(VelkhostInstall, UpdateArgumentsReachTheController) {
    const Finished finished =
        velkhost({"install", "--log", "--update-args", "--backup --no-reboot", package()});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, HasSubstr("UpdateArgs = --backup --no-reboot"));
    EXPECT_THAT(finished.out, HasSubstr("This update is for backup bank."));
    EXPECT_THAT(finished.out, HasSubstr("This update with no rxc reboot"));
    EXPECT_THAT(finished.out, Not(HasSubstr("RXC rebooting and Package")));
}

TEST_F(VelkhostInstall, LogIsAPartOfTheDocumentWhenAskedFor) {
    const auto document = velkhost_json({"--log", package()});
    ASSERT_TRUE(document["log"].is_array());
    EXPECT_GT(document["log"].size(), 50U);
}

TEST_F(VelkhostInstall, SynchronousOptionInstallsNothingAndSaysSo) {
    const Finished finished = velkhost({"install", "--options", "32768", package()});
    EXPECT_EQ(finished.exit_code, 1);
    EXPECT_THAT(finished.out, HasSubstr("installs nothing and sends no return value."));
    const auto document = velkhost_json({"--options", "32768,32769", package()});
    EXPECT_TRUE(document["answer"]["return_value"].is_null());
    EXPECT_EQ(document["answer"]["status"], 0);
}

TEST_F(VelkhostInstall, RealClockAnswersAtOnceWhereThereIsNothingToWaitFor) {
    const auto document =
        velkhost_json({"--clock", "real", "--options", "32768", "--discard", package()});
    EXPECT_EQ(document["request"]["clock"], "real");
    EXPECT_NE(document["request"]["started"], "2026-03-02T08:00:00Z");
}

TEST_F(VelkhostInstall, RefusedRequestShowsStatusMessageAndValue) {
    const Finished finished = velkhost(
        {"install", "--scenario", std::string(kScenarios) + "job-library-lost.toml", package()});
    EXPECT_EQ(finished.exit_code, 3);
    EXPECT_THAT(finished.out, HasSubstr("CIM status      1 Fail to create job instance\n"));
    EXPECT_THAT(finished.out, HasSubstr("return value    none\n"));
    EXPECT_THAT(finished.out, HasSubstr("The request was refused.\n"));
}

TEST_F(VelkhostInstall, FaultThatNeverStrikesFailsTheRun) {
    const auto scenario = write_file("unmet.toml",
                                     "[[fault]]\nstep = \"broker.newArgs\"\nafter = 100000\n"
                                     "code = 1\n");
    const Finished finished = velkhost({"install", "--scenario", scenario.string(), package()});
    EXPECT_EQ(finished.exit_code, 4);
    EXPECT_THAT(finished.out, HasSubstr("unmet.toml:1: broker.newArgs"));
    EXPECT_THAT(finished.out, HasSubstr("1 of 1 package installed"));
}

TEST_F(VelkhostInstall, RequestThatNeverEndsIsLeftAtTheLimit) {
    const auto document =
        velkhost_json({"--scenario", endless_scenario(), "--limit", "2h", "--discard", package()});
    EXPECT_EQ(document["exit_code"], 1);
    EXPECT_TRUE(document["limit_reached"]);
    EXPECT_EQ(document["host_seconds"], 7200.0);
    EXPECT_EQ(document["packages"][0]["outcome"], "unfinished");
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostInstall, LimitIsSaidInWords) {
    const Finished finished =
        velkhost({"install", "--scenario", endless_scenario(), "--limit", "90s", package()});
    EXPECT_EQ(finished.exit_code, 1);
    EXPECT_THAT(finished.out, HasSubstr("the request was still at work after 00:01:30"));
    EXPECT_EQ(run_folders().size(), 1U);
}

}  // namespace
}  // namespace velkhost::testing
