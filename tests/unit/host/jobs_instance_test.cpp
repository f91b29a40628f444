// Jobs as CIM instances, and what their status line says of their progress.
#include <gmock/gmock.h>

#include "host/jobs/status_line.h"
#include "tests/unit/host/jobs_fixture.h"

namespace velkhost::jobs::test {
namespace {

using testing::ElementsAre;

TEST(JobProgress, IsTheShareOfPackagesWithAFinalCode) {
    EXPECT_EQ(percent_complete("0|a: 0: x|b: 0: x|"), 0);
    EXPECT_EQ(percent_complete("0|a: 50: x|b: 0: x|c: 10: x|"), 33);
    EXPECT_EQ(percent_complete("1|a: 50: x|b: 57: x|"), 100);
}

TEST(JobProgress, ProgressCodesAreNotFinal) {
    for (const std::string code : {"0", "10", "15", "60", "61", "62"}) {
        EXPECT_EQ(percent_complete("0|a: " + code + ": x|"), 0) << code;
    }
    for (const std::string code : {"11", "18", "50", "53", "59", "80"}) {
        EXPECT_EQ(percent_complete("0|a: " + code + ": x|"), 100) << code;
    }
}

TEST(JobProgress, NamesAndTextsMayHoldSeparators) {
    EXPECT_EQ(percent_complete("0|a: b: 50: x: 10: y|"), 100);
    EXPECT_EQ(percent_complete("0|: 50: |"), 100);
}

TEST(JobProgress, PackageThatIsCutOffDoesNotCount) {
    EXPECT_EQ(percent_complete("0|a: 50: x|b: 10: y"), 100);
}

TEST(JobProgress, LineOfAnotherFormTellsNothing) {
    for (const char *line : {"", "|", "0|", "working", "a: 50: x", "0|a|b|", "0|a: fifty: x|"}) {
        EXPECT_EQ(percent_complete(line), std::nullopt) << line;
    }
}

class JobInstances : public Jobs {
  protected:
    std::string time(const std::string &id, const char *name) { return text(id, name); }
};

TEST_F(JobInstances, FreshJobIsNewAndHasNoText) {
    const std::string id = create();
    EXPECT_EQ(text(id, "InstanceID"), "VELK-1");
    EXPECT_EQ(text(id, "Name"), "VELK");
    EXPECT_EQ(number(id, "JobState"), 2U);
    EXPECT_EQ(text(id, "JobStatus"), "");
    EXPECT_EQ(number(id, "PercentComplete"), 0U);
}

TEST_F(JobInstances, StateAndTextAreTheLastOnesTold) {
    tell(4, "0|a: 50: done|b: 10: on its way|");
    const std::string id = create();
    sleep(15);
    EXPECT_EQ(number(id, "JobState"), 4U);
    EXPECT_EQ(text(id, "JobStatus"), "0|a: 50: done|b: 10: on its way|");
    EXPECT_EQ(number(id, "PercentComplete"), 50U);
}

TEST_F(JobInstances, PercentNeverFalls) {
    tell(4, "0|a: 50: done|b: 10: on its way|");
    const std::string id = create();
    sleep(15);
    tell(4, "0|a: 60: again|b: 10: on its way|");
    sleep(10);
    EXPECT_EQ(number(id, "PercentComplete"), 50U);
    tell(4, "of another form");
    sleep(10);
    EXPECT_EQ(number(id, "PercentComplete"), 50U);
}

TEST_F(JobInstances, PercentOfALineOfAnotherFormIsWholeAtTheEnd) {
    tell(7, "all done");
    const std::string id = create();
    sleep(15);
    EXPECT_EQ(number(id, "PercentComplete"), 100U);
}

// The status line knows better than the state, which one good package completes.
TEST_F(JobInstances, PercentOfACompletedJobIsThatOfItsPackages) {
    tell(7, "0|a: 50: done|b: 10: on its way|");
    const std::string id = create();
    sleep(15);
    EXPECT_EQ(number(id, "PercentComplete"), 50U);
}

TEST_F(JobInstances, TimesAreTheClocks) {
    sleep(60);
    const std::string id = create();
    sleep(15);  // running since 10 s
    EXPECT_EQ(time(id, "StartTime"), "20200913122740.000000+000");
    EXPECT_EQ(time(id, "ElapsedTime"), "00000000000015.000000:000");
    EXPECT_EQ(time(id, "TimeOfLastStateChange"), "20200913122750.000000+000");
    EXPECT_EQ(time(id, "TimeBeforeRemoval"), "00000000000500.000000:000");
    sleep(10);
    EXPECT_EQ(time(id, "TimeOfLastStateChange"), "20200913122750.000000+000");
}

TEST_F(JobInstances, ElapsedTimeStandsStillAfterTheEnd) {
    tell(7, "1|a: 50: done|");
    const std::string id = create();
    sleep(135);
    EXPECT_EQ(time(id, "ElapsedTime"), "00000000000010.000000:000");
}

TEST_F(JobInstances, OperationalStatusFollowsTheState) {
    const auto status = [this](const std::string &id) {
        std::vector<std::uint64_t> numbers;
        const cim::NamedValues values = read(id);
        for (const cim::Value &entry : *values.find("OperationalStatus")->as_array()) {
            numbers.push_back(entry.as_unsigned().value());
        }
        return numbers;
    };
    const std::string id = create();
    EXPECT_THAT(status(id), ElementsAre(15));
    sleep(15);
    EXPECT_THAT(status(id), ElementsAre(2));
    tell(10, "1|a: 57: failed|");
    sleep(10);
    EXPECT_THAT(status(id), ElementsAre(17, 6));
    tell(7, "1|a: 50: done|");
    EXPECT_THAT(status(id), ElementsAre(17, 2));
}

TEST_F(JobInstances, EndedJobsGoByThemselves) {
    const std::string id = create();
    const cim::NamedValues values = read(id);
    EXPECT_EQ(values.find("DeleteOnCompletion")->as_bool(), true);
}

TEST_F(JobInstances, EnumerationsHaveEveryJob) {
    create();
    create(registration("OTHER"));
    const auto paths = broker_.enumerate_instance_names(class_path());
    ASSERT_EQ(paths.paths.size(), 2U);
    EXPECT_EQ(paths.paths[0].keys.find("InstanceID")->as_text(), "OTHER-2");
    EXPECT_EQ(paths.paths[1].keys.find("InstanceID")->as_text(), "VELK-1");
    const auto instances = broker_.enumerate_instances(class_path());
    ASSERT_EQ(instances.instances.size(), 2U);
    EXPECT_EQ(instances.instances[0].properties.find("Name")->as_text(), "OTHER");
}

TEST_F(JobInstances, WithoutJobsEnumerationsAreEmpty) {
    EXPECT_TRUE(broker_.enumerate_instances(class_path()).status.ok());
    EXPECT_EQ(job_count(), 0U);
}

TEST_F(JobInstances, AbsentJobIsNotFound) {
    create();
    EXPECT_EQ(broker_.get_instance(path_of("VELK-2")).status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.get_instance(path_of("")).status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.get_instance(class_path()).status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.delete_instance(class_path()).code, CMPI_RC_ERR_NOT_FOUND);
    cim::ObjectPath surplus = path_of("VELK-1");
    surplus.keys.set("Name", cim::Value::string("VELK"));
    EXPECT_EQ(broker_.get_instance(surplus).status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.delete_instance(surplus).code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(job_count(), 1U);
}

TEST_F(JobInstances, PropertyListIsHonouredWithoutRegardToCase) {
    const std::string id = create();
    const auto reply =
        broker_.get_instance(path_of(id), std::vector<std::string>{"jobstate", "Nothing"});
    ASSERT_TRUE(reply.instance.has_value());
    const cim::NamedValues &values = reply.instance->properties;
    ASSERT_NE(values.find("JobState"), nullptr);
    EXPECT_EQ(values.find("JobState")->as_unsigned(), 2U);
    for (const char *left_out : {"Name", "JobStatus", "PercentComplete", "StartTime"}) {
        const cim::Value *const value = values.find(left_out);
        EXPECT_TRUE(value == nullptr || value->is_null()) << left_out;
    }
    const auto all =
        broker_.enumerate_instances(class_path(), std::vector<std::string>{"JobStatus"});
    ASSERT_EQ(all.instances.size(), 1U);
    const cim::Value *const state = all.instances[0].properties.find("JobState");
    EXPECT_TRUE(state == nullptr || state->is_null());
}

TEST_F(JobInstances, OtherOperationsAreNotSupported) {
    const std::string id = create();
    const auto reply = broker_.get_instance(path_of(id));
    EXPECT_EQ(broker_.modify_instance(*reply.instance).code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(broker_.create_instance(*reply.instance).status.code, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(JobInstances, FaultsOfTheScenarioStrikeReadsAndDeletions) {
    play(
        "[[fault]]\nstep = \"job.get\"\ncode = 6\nmatch = \"VELK-1\"\n"
        "[[fault]]\nstep = \"job.delete\"\ncode = 2\nmessage = \"No.\"\n");
    const std::string id = create();
    EXPECT_EQ(broker_.get_instance(path_of(id)).status.code, CMPI_RC_ERR_NOT_FOUND);
    const auto refused = broker_.delete_instance(path_of(id));
    EXPECT_EQ(refused.code, CMPI_RC_ERR_ACCESS_DENIED);
    EXPECT_EQ(refused.message, "No.");
    EXPECT_EQ(number(id, "JobState"), 2U);
}

TEST_F(JobInstances, ProviderStaysLoadedWhileItHasJobs) {
    const std::string id = create();
    EXPECT_EQ(number(id, "JobState"), 2U);
    const auto answers = broker_.idle();
    ASSERT_EQ(answers.size(), 1U);
    EXPECT_EQ(answers[0].decision, broker::UnloadAnswer::Decision::kStaysForEver);
    EXPECT_EQ(job_count(), 1U);
}

TEST_F(JobInstances, ProviderWithoutJobsMayGo) {
    EXPECT_EQ(job_count(), 0U);
    const auto answers = broker_.idle();
    ASSERT_EQ(answers.size(), 1U);
    EXPECT_EQ(answers[0].decision, broker::UnloadAnswer::Decision::kUnloads);
    EXPECT_EQ(create(), "VELK-1");
    EXPECT_EQ(job_count(), 1U);
}

}  // namespace
}  // namespace velkhost::jobs::test
