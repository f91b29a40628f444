// What becomes of a registration: ids, refusals, and the thread behind it.
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <thread>

#include <gmock/gmock.h>

#include "tests/unit/host/jobs_fixture.h"

namespace velkhost::jobs::test {
namespace {

using testing::ElementsAre;

class JobRegistrations : public Jobs {};

TEST_F(JobRegistrations, IdsAreTheProvidersNameAndANumberThatCountsPerProcess) {
    EXPECT_EQ(create(), "VELK-1");
    EXPECT_EQ(create(), "VELK-2");
    EXPECT_EQ(create(registration("OTHER")), "OTHER-3");
}

TEST_F(JobRegistrations, FirstNumberIsTheScenarios) {
    play("[jobs]\nfirst_number = 7\n");
    EXPECT_EQ(create(), "VELK-7");
    EXPECT_EQ(create(), "VELK-8");
}

TEST_F(JobRegistrations, EmptyFieldIsRefused) {
    JobRegistration record = registration();
    record.provider_name[0] = '\0';
    EXPECT_EQ(create_fails(record), EINVAL);
    record = registration();
    record.library_path[0] = '\0';
    EXPECT_EQ(create_fails(record), EINVAL);
    record = registration();
    record.status_function[0] = '\0';
    EXPECT_EQ(create_fails(record), EINVAL);
    record = registration();
    record.cleanup_function[0] = '\0';
    EXPECT_EQ(create_fails(record), EINVAL);
    EXPECT_EQ(job_count(), 0U);
    EXPECT_EQ(create(), "VELK-1");
}

TEST_F(JobRegistrations, FieldWithoutTerminatorIsRefused) {
    JobRegistration record = registration();
    std::memset(record.provider_name, 'x', sizeof(record.provider_name));
    EXPECT_EQ(create_fails(record), EINVAL);
    record = registration();
    std::memset(record.library_path, 'x', sizeof(record.library_path));
    EXPECT_EQ(create_fails(record), EINVAL);
    record = registration();
    std::memset(record.status_function, 'x', sizeof(record.status_function));
    EXPECT_EQ(create_fails(record), EINVAL);
    record = registration();
    std::memset(record.cleanup_function, 'x', sizeof(record.cleanup_function));
    EXPECT_EQ(create_fails(record), EINVAL);
    EXPECT_EQ(job_count(), 0U);
}

TEST_F(JobRegistrations, NullArgumentIsRefused) {
    JobRegistration record = registration();
    std::array<char, 40> id{};
    EXPECT_EQ(create_in(nullptr, 40, &record), EINVAL);
    EXPECT_EQ(create_in(id.data(), 40, nullptr), EINVAL);
    EXPECT_EQ(job_count(), 0U);
}

TEST_F(JobRegistrations, IdIsWrittenWithItsTerminatorAndNotBeyond) {
    JobRegistration record = registration();
    std::array<char, 8> id{'-', '-', '-', '-', '-', '-', '-', '-'};
    EXPECT_EQ(create_in(id.data(), 6, &record), ERANGE);
    EXPECT_EQ(create_in(id.data(), 0, &record), ERANGE);
    EXPECT_EQ(create_in(id.data(), -40, &record), ERANGE);
    EXPECT_EQ(std::string(id.data(), id.size()), "--------");
    EXPECT_EQ(job_count(), 0U);
    EXPECT_EQ(create_in(id.data(), 7, &record), 0);
    EXPECT_EQ(std::string(id.data(), id.size()), std::string("VELK-1\0-", 8));
}

TEST_F(JobRegistrations, WithoutAThreadThereIsNoJob) {
    velkshim_set_fault_hook(
        [](void *, const char *step) {
            return std::strcmp(step, "thread.create") == 0 ? EAGAIN : 0;
        },
        nullptr);
    EXPECT_EQ(create_fails(registration()), EAGAIN);
    velkshim_set_fault_hook(nullptr, nullptr);
    EXPECT_EQ(job_count(), 0U);
    EXPECT_EQ(create(), "VELK-1");
}

TEST_F(JobRegistrations, FaultOfTheScenarioRefusesTheJob) {
    play("[[fault]]\nstep = \"job.create\"\ncode = 4\nmatch = \"VELK-1\"\n");
    EXPECT_EQ(create_fails(registration()), 4);
    EXPECT_EQ(create(), "VELK-1");
}

TEST_F(JobRegistrations, LibraryThatCannotBeOpenedIsAnExceptionOfTheJob) {
    JobRegistration record = registration();
    std::strcpy(record.library_path, "/usr/lib/cim/libabsent.so");
    const std::string id = create(record);
    sleep(15);
    EXPECT_EQ(number(id, "JobState"), 10U);
    EXPECT_NE(text(id, "JobStatus").find("libabsent.so"), std::string::npos);
    EXPECT_TRUE(broker_.delete_instance(path_of(id)).ok());
}

TEST_F(JobRegistrations, LibraryThatComesLateCuresTheJob) {
    JobRegistration record = registration();
    std::strcpy(record.library_path, "/usr/lib/cim/liblate.so");
    const std::string id = create(record);
    sleep(15);
    EXPECT_EQ(number(id, "JobState"), 10U);
    std::filesystem::create_symlink(VELK_JOB_TEST_PROVIDER, under_root(record.library_path));
    EXPECT_EQ(number(id, "JobState"), 4U);
    EXPECT_EQ(text(id, "JobStatus"), "0|a: 10: on its way|");
}

TEST_F(JobRegistrations, AbsentStatusFunctionIsAnExceptionOfTheJob) {
    JobRegistration record = registration();
    std::strcpy(record.status_function, "no_such_function");
    const std::string id = create(record);
    sleep(15);
    EXPECT_EQ(number(id, "JobState"), 10U);
    EXPECT_NE(text(id, "JobStatus").find("no_such_function"), std::string::npos);
}

TEST_F(JobRegistrations, AbsentCleanupFunctionIsNotMissed) {
    JobRegistration record = registration();
    std::strcpy(record.cleanup_function, "no_such_function");
    const std::string id = create(record);
    sleep(15);
    EXPECT_TRUE(broker_.delete_instance(path_of(id)).ok());
    EXPECT_THAT(asked(), ElementsAre(10));
}

// Under the thread sanitizer this shows that the table needs no help from its callers.
TEST_F(JobRegistrations, ManyThreadsRegisterReadAndDelete) {
    std::vector<std::thread> threads;
    for (int i = 0; i < 8; ++i) {
        threads.emplace_back([this] {
            for (int k = 0; k < 10; ++k) {
                const std::string id = create();
                usleep(3'000'000);
                EXPECT_EQ(text(id, "InstanceID"), id);
                if (k % 2 == 0) {
                    EXPECT_TRUE(broker_.delete_instance(path_of(id)).ok());
                }
            }
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(job_count(), 40U);
    EXPECT_EQ(cleaned_up().size(), 40U);
}

}  // namespace
}  // namespace velkhost::jobs::test
