// Outcomes, exit codes, the result table and the JSON document of a run.
#include "host/cli/json_report.h"
#include "host/cli/lines.h"
#include "host/cli/report.h"
#include "host/cli/result_table.h"
#include "host/cli/text.h"

#include <gmock/gmock.h>
#include <nlohmann/json.hpp>

#include <sstream>

namespace velkhost::cli {
namespace {

using testing::HasSubstr;
using testing::Not;

PackageReport package(const char *id, std::optional<int> code, const char *message,
                      std::optional<std::int64_t> changed_us) {
    const rig::PackageStatus status{id, code, message};
    return {status, outcome_of(status), changed_us};
}

RunReport good_run() {
    RunReport report;
    report.request = {{"file:///p/a.xml", "file:///p/b.xml"},
                      {32769},
                      std::nullopt,
                      "default.toml",
                      "esxi-01",
                      true,
                      1772438400'000'000};
    report.answer = {0, "", 4096};
    report.job = JobReport{"VELK-1", std::uint16_t{7}, "1|a: 50: ok|b: 59: ok|"};
    report.packages = {package("a", 50, "Package installation successfully.", 70'000'000),
                       package("b", 59, "already there", 140'000'000)};
    report.history = {{10'000'000, {"a", 62, "busy"}}, {70'000'000, {"a", 50, "ok"}}};
    report.host_us = 140'000'000;
    report.real_seconds = 0.25;
    report.folder = "/run";
    report.debug_log = "/run/tmp/velkdebug.txt";
    report.status_file = "/run/tmp/sfcb/velkstatVELK-1.txt";
    return report;
}

TEST(CliReport, OutcomeFollowsTheCode) {
    const std::vector<std::pair<std::optional<int>, Outcome>> rows = {
        {std::nullopt, Outcome::kSkipped},
        {0, Outcome::kSkipped},
        {10, Outcome::kUnfinished},
        {15, Outcome::kUnfinished},
        {60, Outcome::kUnfinished},
        {61, Outcome::kUnfinished},
        {62, Outcome::kUnfinished},
        {50, Outcome::kInstalled},
        {59, Outcome::kInstalled},
        {80, Outcome::kNotSupported},
        {11, Outcome::kFailed},
        {53, Outcome::kFailed},
        {-1, Outcome::kFailed},
        {1000, Outcome::kFailed}};
    for (const auto &[code, outcome] : rows) {
        EXPECT_EQ(outcome_of({"x", code, ""}), outcome) << code.value_or(-999);
    }
}

TEST(CliReport, EveryOutcomeHasANameThatFitsItsColumn) {
    for (int i = 0; i <= static_cast<int>(Outcome::kNotTaken); ++i) {
        const auto name = outcome_name(static_cast<Outcome>(i));
        EXPECT_FALSE(name.empty()) << i;
        EXPECT_LE(name.size(), 13U) << name;
    }
}

TEST(CliReport, JobStatesHaveTheirNames) {
    EXPECT_EQ(job_state_name(4), "Running");
    EXPECT_EQ(job_state_name(7), "Completed");
    EXPECT_EQ(job_state_name(10), "Exception");
    EXPECT_EQ(job_state_name(999), "unknown");
}

TEST(CliReport, ExitCodeIsZeroOnlyWhenAllIsWell) {
    EXPECT_EQ(exit_code_of(good_run()), 0);
    RunReport failed = good_run();
    failed.packages[1] = package("b", 53, "no", 1);
    EXPECT_EQ(exit_code_of(failed), 1);
    EXPECT_EQ(verdict_of(failed), "1 of 2 packages installed");
}

TEST(CliReport, RunWithoutPackagesIsNoSuccess) {
    RunReport report = good_run();
    report.packages.clear();
    EXPECT_EQ(exit_code_of(report), 1);
}

TEST(CliReport, LimitIsNoSuccessEvenWhenAllPackagesAreIn) {
    RunReport report = good_run();
    report.limit_reached = true;
    EXPECT_EQ(exit_code_of(report), 1);
}

TEST(CliReport, RefusedRequest) {
    RunReport report = good_run();
    report.answer = {1, "Fail to create job instance", std::nullopt};
    report.packages.clear();
    EXPECT_EQ(exit_code_of(report), 3);
    report.answer = {0, "", 5};
    EXPECT_EQ(exit_code_of(report), 3);
}

TEST(CliReport, SynchronousOptionIsSaidForWhatItIs) {
    RunReport report = good_run();
    report.answer = {0, "", std::nullopt};
    report.packages.clear();
    EXPECT_EQ(exit_code_of(report), 1);
    EXPECT_THAT(verdict_of(report), HasSubstr("installs nothing and sends no return value"));
    EXPECT_THAT(result_table(report, {}, kUnlimited), Not(HasSubstr("CIM status")));
}

TEST(CliReport, FindingsAndUnmetFaultsComeBeforeEverything) {
    RunReport report = good_run();
    report.findings = {"second-release: x"};
    EXPECT_EQ(exit_code_of(report), 4);
    report = good_run();
    report.unfired_faults = {"s.toml:3: broker.newArgs"};
    EXPECT_EQ(exit_code_of(report), 4);
    const std::string text = result_table(report, {}, kUnlimited);
    EXPECT_THAT(text, HasSubstr("s.toml:3: broker.newArgs"));
}

TEST(CliTable, PlainTableHasEveryFactAndNoEscapes) {
    const std::string text = result_table(good_run(), {}, kUnlimited);
    EXPECT_THAT(text, HasSubstr("+ a        installed        50  +00:01:10  Package installation "
                                "successfully.\n"));
    EXPECT_THAT(text, HasSubstr("VELK-1: 7 Completed"));
    EXPECT_THAT(text,
                HasSubstr("00:02:20 on the host's virtual clock, less than a second of real time"));
    EXPECT_THAT(text, HasSubstr("/run/tmp/velkdebug.txt"));
    EXPECT_THAT(text, HasSubstr("2 of 2 packages installed\n"));
    EXPECT_EQ(text.find('\x1b'), std::string::npos);
}

TEST(CliTable, RowsAreCutToTheWidthAndPathsAreNot) {
    const Terminal terminal{true, false, true};
    std::istringstream lines(result_table(good_run(), terminal, 50));
    for (std::string line; std::getline(lines, line);) {
        if (line.starts_with("✓") || line.starts_with("  package")) {
            EXPECT_LE(columns(line), 50U) << line;
        }
    }
    const std::string text = result_table(good_run(), terminal, 50);
    EXPECT_THAT(text, HasSubstr("…"));
    EXPECT_THAT(text, HasSubstr("/run/tmp/sfcb/velkstatVELK-1.txt"));
}

TEST(CliTable, ColourIsUsedWhereThereIsSome) {
    const std::string text = result_table(good_run(), {true, true, true}, 100);
    EXPECT_THAT(text, HasSubstr("\x1b[32m✓ a"));
}

TEST(CliTable, TextsOfTheHostCannotDriveTheTerminal) {
    RunReport report = good_run();
    report.packages[0].status.message =
        "\x1b[2J\x07"
        "gone";
    const std::string text = result_table(report, {}, kUnlimited);
    EXPECT_EQ(text.find('\x1b'), std::string::npos);
    EXPECT_THAT(text, HasSubstr("?[2J?gone"));
}

TEST(CliTable, DiscardedFolderIsNotShown) {
    RunReport report = good_run();
    report.folder.clear();
    EXPECT_THAT(result_table(report, {}, kUnlimited), Not(HasSubstr("run folder")));
}

TEST(CliLines, ChangeLine) {
    EXPECT_EQ(change_line({}, 31'000'000, 8, {"zeb_rxc", 62, "Updating"}, kUnlimited),
              "[+00:00:31] zeb_rxc   62  Updating");
    EXPECT_EQ(change_line({}, 0, 3, {"a", std::nullopt, ""}, kUnlimited), "[+00:00:00] a     -  ");
    EXPECT_EQ(columns(change_line({true, false, true}, 0, 3, {"abc", 5, std::string(90, 'x')}, 40)),
              40U);
}

TEST(CliLines, TitleCountsPackages) {
    EXPECT_EQ(title_line(good_run().request, 1),
              "1 package for esxi-01, virtual clock, scenario default.toml");
}

TEST(CliJson, DocumentHasEverythingInItsPlace) {
    const auto document = nlohmann::json::parse(json_report(good_run()));
    EXPECT_EQ(document["request"]["uris"].size(), 2U);
    EXPECT_EQ(document["request"]["options"][0], 32769);
    EXPECT_TRUE(document["request"]["update_args"].is_null());
    EXPECT_EQ(document["request"]["started"], "2026-03-02T08:00:00Z");
    EXPECT_EQ(document["answer"]["return_value"], 4096);
    EXPECT_EQ(document["job"]["state"], 7);
    EXPECT_EQ(document["job"]["state_name"], "Completed");
    EXPECT_EQ(document["packages"][0]["outcome"], "installed");
    EXPECT_EQ(document["packages"][0]["at"], 70.0);
    EXPECT_EQ(document["history"][0]["code"], 62);
    EXPECT_EQ(document["host_seconds"], 140.0);
    EXPECT_EQ(document["files"]["folder"], "/run");
    EXPECT_TRUE(document["findings"].empty());
    EXPECT_EQ(document["exit_code"], 0);
    EXPECT_FALSE(document.contains("log"));
}

TEST(CliJson, WhatIsNotKnownIsNull) {
    RunReport report = good_run();
    report.job.reset();
    report.folder.clear();
    report.answer.return_value.reset();
    report.packages = {package("a", std::nullopt, "", std::nullopt)};
    const auto document = nlohmann::json::parse(json_report(report));
    EXPECT_TRUE(document["job"].is_null());
    EXPECT_TRUE(document["files"]["folder"].is_null());
    EXPECT_TRUE(document["answer"]["return_value"].is_null());
    EXPECT_TRUE(document["packages"][0]["code"].is_null());
    EXPECT_TRUE(document["packages"][0]["at"].is_null());
}

TEST(CliJson, BytesThatAreNoUtf8DoNotBreakTheDocument) {
    RunReport report = good_run();
    report.packages[0].status.message = "\xff\x01";
    const auto document = nlohmann::json::parse(json_report(report));
    EXPECT_EQ(document["packages"][0]["message"], "\uFFFD\x01");
}

}  // namespace
}  // namespace velkhost::cli
