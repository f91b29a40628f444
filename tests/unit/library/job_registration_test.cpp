// What the job library is asked, and what becomes of its answer. No thread can be created, so that
// a request ends where it would start to install.

#include <array>
#include <cerrno>
#include <cstring>
#include <functional>

#include "provider/job_registration.h"
#include "tests/unit/library/request_fixture.h"

namespace {

using velktest::entries;
using velktest::entry;

std::function<int(char *id, int size, const char *record)> create_job;

class JobRegistration : public velktest::RequestTest {
  protected:
    JobRegistration() {
        const auto library = at("/usr/lib/cim/libconcretejob.so");
        std::filesystem::create_directories(library.parent_path());
        std::filesystem::create_symlink(VELK_FAKE_JOB_LIBRARY, library);
        fail_step("thread.create", EAGAIN);
    }
    void TearDown() override { create_job = nullptr; }
};

int name_job(char *id, const char *name) {
    std::strcpy(id, name);
    return 0;
}

}  // namespace

extern "C" [[gnu::visibility("default")]] int velktest_create_job(char *id, int size,
                                                                  const char *record) {
    return create_job(id, size, record);
}

TEST_F(JobRegistration, RecordHoldsFourTextsAndZeros) {
    std::string record;
    create_job = [&](char *id, int size, const char *given) {
        EXPECT_EQ(id, instanceID);
        EXPECT_EQ(size, 40);
        record.assign(given, 1024);
        return name_job(id, "VELK-7");
    };
    install({uri()});
    std::string expected(1024, '\0');
    expected.replace(0, 4, "VELK");
    const std::string library = "/usr/lib/cim/libvelkprovider.so";
    expected.replace(256, library.size(), library);
    expected.replace(512, 13, "getVELKStatus");
    expected.replace(768, 17, "VELKStatusCleanup");
    EXPECT_EQ(record, expected);
}

TEST_F(JobRegistration, FirstSuccessIsUsed) {
    create_job = [](char *id, int, const char *) { return name_job(id, "VELK-7"); };
    const auto reply = install({uri()});
    EXPECT_STREQ(instanceID, "VELK-7");
    EXPECT_EQ(reply.status.code, 1);
    EXPECT_EQ(reply.status.message, "Fail to create file transfer thread.");
    EXPECT_EQ(pauses(), std::vector<int>{1});
    EXPECT_TRUE(log().ends_with(
        entries({"dlopen successfully.\n", "dlsym successfully.\n", "instanceID is = VELK-7\n",
                 "New Job Created successfully.\n", "Creating new thread\n"}) +
        entry("Create new thread fail.\n", 1)));
}

TEST_F(JobRegistration, FailedAttemptIsRepeatedAfterTwelveSeconds) {
    int attempts = 0;
    create_job = [&](char *id, int, const char *) {
        return ++attempts < 5 ? 3 : name_job(id, "VELK-9");
    };
    const auto reply = install({uri()});
    EXPECT_EQ(attempts, 5);
    EXPECT_EQ(pauses(), (std::vector<int>{12, 12, 12, 12, 1}));
    EXPECT_EQ(reply.status.message, "Fail to create file transfer thread.");
}

TEST_F(JobRegistration, FiveRefusalsFail) {
    int attempts = 0;
    create_job = [&](char *, int, const char *) { return ++attempts; };
    const auto reply = install({uri()});
    EXPECT_EQ(attempts, 5);
    EXPECT_EQ(reply.status.message, "Fail to create job instance");
    EXPECT_EQ(pauses(), std::vector<int>(5, 12));
    EXPECT_EQ(velktest::occurrences(log(), "New Job Created"), 0);
}

TEST_F(JobRegistration, LibraryWithoutTheFunctionFails) {
    const auto library = at("/usr/lib/cim/libconcretejob.so");
    std::filesystem::remove(library);
    std::filesystem::create_symlink(VELK_OTHER_LIBRARY, library);
    const auto reply = install({uri()});
    EXPECT_EQ(reply.status.message, "Fail to create job instance");
    EXPECT_EQ(velktest::occurrences(log(), "dlopen successfully.\n"), 5);
    EXPECT_EQ(velktest::occurrences(log(), "dlsym successfully.\n"), 0);
}

TEST_F(JobRegistration, IdWithoutATerminatorIsCut) {
    create_job = [](char *id, int size, const char *) {
        std::memset(id, 'j', static_cast<std::size_t>(size));
        return 0;
    };
    install({uri()});
    EXPECT_EQ(std::string(instanceID), std::string(39, 'j'));
}
