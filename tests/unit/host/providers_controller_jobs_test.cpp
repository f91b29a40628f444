// The jobs of the management controller: what each read of one sees.
#include "providers_controller_fixture.h"

#include <thread>

namespace velkhost::providers::testing {
namespace {

using cim::Value;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

TEST_F(ControllerProvider, UsualJobGoesThroughEveryStage) {
    const auto job = start(make_file("a.upd"));
    EXPECT_THAT(reads(job, 8), ElementsAre("0x00|Initialization", "0x01|Transfering file to RXC",
                                           "0x02|updating firmware", "0x02|updating firmware",
                                           "0x02|updating firmware", "0x03|RXC rebooting",
                                           "0x04|Process Completed", "0x04|Process Completed"));
    EXPECT_EQ(number(broker_.get_instance(job).instance->properties, "JobState"), 7U);
}

TEST_F(ControllerProvider, JobWithoutRebootDoesNotReboot) {
    EXPECT_THAT(reads(start(make_file("a.upd"), 0), 6).back(), HasSubstr("Process Completed"));
}

TEST_F(ControllerProvider, FpgaImageCompletesWithARestartOfTheSystem) {
    const auto job = start(make_file("zeb_FPGA_1.upd"));
    EXPECT_EQ(reads(job, 7).back(), "0x05|Completed, need restart system to active FPGA.");
}

TEST_F(ControllerProvider, ScenarioDecidesWhatEachReadSees) {
    play(
        "[[management_controller.answer]]\njob = [{ looks = 2 }, { absent = true },"
        " { status = '0x45|Get active lock failed', state = 10 }]");
    const auto job = start(make_file("a.upd"));
    EXPECT_THAT(reads(job, 4),
                ElementsAre("(none)", "(none)", "(absent)", "0x45|Get active lock failed"));
    EXPECT_EQ(number(broker_.get_instance(job).instance->properties, "JobState"), 10U);
}

TEST_F(ControllerProvider, NullStatusIsANullProperty) {
    play("[[management_controller.answer]]\njob = [{}]");
    const auto reply = broker_.get_instance(start(make_file("a.upd")));
    ASSERT_TRUE(reply.instance.has_value());
    const Value *status = reply.instance->properties.find("JobStatus");
    EXPECT_TRUE(status == nullptr || status->is_null());
}

TEST_F(ControllerProvider, EnumerationUsesNoLookUp) {
    const auto job = start(make_file("a.upd"));
    for (int round = 0; round < 3; ++round) {
        const auto all = broker_.enumerate_instances(path_of("ZEB_SoftwareInstallationJob"));
        ASSERT_EQ(all.instances.size(), 1U);
        EXPECT_EQ(text(all.instances[0].properties, "JobStatus"), "0x00|Initialization");
    }
    EXPECT_EQ(broker_.enumerate_instance_names(path_of("ZEB_SoftwareInstallationJob")).paths.at(0),
              job);
}

TEST_F(ControllerProvider, UnknownJobIsNotFound) {
    auto job = start(make_file("a.upd"));
    job.keys.set("InstanceID", Value::string("ZEB:SoftwareInstallationJob:9"));
    EXPECT_EQ(broker_.get_instance(job).status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.get_instance(path_of("ZEB_SoftwareInstallationJob")).status.code,
              CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(ControllerProvider, PropertyListNarrowsAndKeepsTheKeys) {
    const auto job = start(make_file("a.upd"));
    const auto reply = broker_.get_instance(job, {{"jobSTATE"}});
    ASSERT_TRUE(reply.instance.has_value());
    EXPECT_EQ(number(reply.instance->properties, "JobState"), 4U);
    EXPECT_NE(text(reply.instance->properties, "InstanceID"), "(none)");
    EXPECT_EQ(text(reply.instance->properties, "URI"), "(none)");
    EXPECT_EQ(text(reply.instance->properties, "JobStatus"), "(none)");
}

TEST_F(ControllerProvider, JobFaultStrikesOneReadAndUsesNoLookUp) {
    play("[[fault]]\nstep = 'zeb.job'\nafter = 1\ncode = 6\nmessage = 'gone'");
    const auto job = start(make_file("a.upd"));
    EXPECT_THAT(reads(job, 3),
                ElementsAre("0x00|Initialization", "(absent)", "0x01|Transfering file to RXC"));
}

TEST_F(ControllerProvider, JobsOutliveIdlenessOfTheBroker) {
    const auto job = start(make_file("a.upd"));
    for (const broker::UnloadAnswer &answer : broker_.idle()) {
        EXPECT_EQ(answer.decision, broker::UnloadAnswer::Decision::kStaysForEver);
    }
    EXPECT_THAT(reads(job, 1), ElementsAre("0x00|Initialization"));
}

TEST_F(ControllerProvider, InstancesAreOnlyRead) {
    const auto job = start(make_file("a.upd"));
    const cim::Instance instance{job, {}};
    EXPECT_EQ(broker_.create_instance(instance).status.code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker_.modify_instance(instance).code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker_.delete_instance(job).code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker_.delete_instance(job).message,
              "Instances of this class are made by the service itself and only read");
}

TEST_F(ControllerProvider, LatestJobsAreRemembered) {
    constexpr int kMostJobs = 256;
    const std::string uri = make_file("a.upd");
    const auto first = start(uri);
    const auto second = start(uri);
    for (int job = 2; job <= kMostJobs; ++job) {
        start(uri);
    }
    EXPECT_EQ(broker_.get_instance(first).status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_TRUE(broker_.get_instance(second).status.ok());
}

TEST_F(ControllerProvider, JobsOfManyThreadsDoNotMix) {
    play("[[management_controller.answer]]\njob = [{ status = '0x00|a' }, { status = '0x00|b' }]");
    const std::string uri = make_file("a.upd");
    constexpr int kWorkers = 4;
    std::vector<std::thread> threads;
    threads.reserve(kWorkers);
    for (int worker = 0; worker < kWorkers; ++worker) {
        threads.emplace_back([&] {
            for (int round = 0; round < 20; ++round) {
                EXPECT_THAT(reads(start(uri), 3), ElementsAre("0x00|a", "0x00|b", "0x00|b"));
            }
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
}

}  // namespace
}  // namespace velkhost::providers::testing
