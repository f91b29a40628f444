// What the job library is asked, when, and what becomes of its answer.

#include <dlfcn.h>

#include <cerrno>
#include <cstring>

#include "tests/conformance/conformance_test.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::Pause;
using velktest::Seconds;
namespace fs = std::filesystem;

constexpr const char *kLoad = "dlopen:/usr/lib/cim/libconcretejob.so";

// No thread can be created, so that a request ends where it would start to install.
class JobRegistration : public velktest::ConformanceTest {
  protected:
    JobRegistration() { allow_threads(false); }

    void allow_threads(bool allowed) { host().fail_step("thread.create", allowed ? 0 : EAGAIN); }

    // Runs `work` beside the request.
    std::thread beside(std::function<void()> work) {
        allow_threads(true);
        std::thread thread(std::move(work));
        allow_threads(false);
        return thread;
    }

    // The job library answers `results` one after the other, the last one for ever.
    void answer_with(const std::vector<int> &results) {
        host().create_job() = [=, this](char *id, int size, const char *) {
            const std::size_t turn = std::min(attempts_.size(), results.size() - 1);
            attempts_.push_back(host().now());
            if (results[turn] == 0) {
                std::strncpy(id, "VELK-7", static_cast<std::size_t>(size));
            }
            return results[turn];
        };
    }

    // When the job library was asked.
    [[nodiscard]] const std::vector<Seconds> &attempts() const { return attempts_; }

    std::string instance_id() { return {host().data<char[40]>("instanceID"), 40}; }

    static std::vector<Pause> pauses_of_twelve(int count, Seconds last_at = -1) {
        std::vector<Pause> pauses;
        for (int i = 0; i < count; ++i) {
            pauses.push_back({12.0 * i, 12});
        }
        if (last_at >= 0) {
            pauses.push_back({last_at, 1});
        }
        return pauses;
    }

  private:
    std::vector<Seconds> attempts_;
};

// The descriptors that are open on the debug log, and those on anything else.
struct Descriptors {
    std::size_t log = 0;
    std::size_t other = 0;
};

Descriptors open_descriptors() {
    Descriptors counts;
    for (const auto &entry : fs::directory_iterator("/proc/self/fd")) {
        std::error_code ignored;
        const fs::path target = fs::read_symlink(entry.path(), ignored);
        ++(target.filename() == "velkdebug.txt" ? counts.log : counts.other);
    }
    return counts;
}

}  // namespace

TEST_F(JobRegistration, RecordHoldsFourTextsAndZeros) {
    std::string record;
    const char *id_buffer = nullptr;
    host().create_job() = [&](char *id, int size, const char *given) {
        EXPECT_EQ(size, 40);
        id_buffer = id;
        record.assign(given, 1024);
        return 0;
    };
    install({uri()});
    EXPECT_EQ(id_buffer, host().data<char[40]>("instanceID"));
    std::string expected(1024, '\0');
    const std::pair<std::size_t, std::string> fields[] = {
        {0, "VELK"},
        {256, "/usr/lib/cim/libvelkprovider.so"},
        {512, "getVELKStatus"},
        {768, "VELKStatusCleanup"},
    };
    for (const auto &[offset, text] : fields) {
        expected.replace(offset, text.size(), text);
    }
    EXPECT_EQ(record, expected);
}

TEST_F(JobRegistration, FirstSuccessIsUsedWithoutAPauseOfTwelve) {
    answer_with({0});
    install({uri()});
    EXPECT_EQ(attempts(), std::vector<Seconds>{0});
    EXPECT_STREQ(instance_id().c_str(), "VELK-7");
    EXPECT_EQ(host().own_pauses(), pauses_of_twelve(0, 0));
    EXPECT_TRUE(host().log().ends_with(
        entry("using async installation.\n") +
        entries({"dlopen successfully.\n", "dlsym successfully.\n", "instanceID is = VELK-7\n",
                 "New Job Created successfully.\n", "Creating new thread\n"}) +
        entry("Create new thread fail.\n", 1)));
}

TEST_F(JobRegistration, FailedAttemptIsRepeatedAfterTwelveSeconds) {
    answer_with({3, -1, 1, 1, 0});
    EXPECT_EQ(install({uri()}).status.message, "Fail to create file transfer thread.");
    EXPECT_EQ(attempts(), (std::vector<Seconds>{0, 12, 24, 36, 48}));
    EXPECT_EQ(host().own_pauses(), pauses_of_twelve(4, 48));
}

TEST_F(JobRegistration, FiveRefusalsFailAfterAFifthPause) {
    answer_with({1});
    EXPECT_EQ(install({uri()}).status.message, "Fail to create job instance");
    EXPECT_EQ(attempts(), (std::vector<Seconds>{0, 12, 24, 36, 48}));
    EXPECT_EQ(host().own_pauses(), pauses_of_twelve(5));
    EXPECT_DOUBLE_EQ(host().now(), 60);
    EXPECT_EQ(velktest::occurrences(host().log(), "New Job Created"), 0);
    EXPECT_EQ(host().passes("thread.create"), 0);
}

TEST_F(JobRegistration, MissingLibraryIsLookedForFiveTimes) {
    host().remove_job_library();
    install({uri()});
    EXPECT_EQ(host().passes(kLoad), 5);
    EXPECT_EQ(host().own_pauses(), pauses_of_twelve(5));
    std::string attempts;
    for (int i = 0; i < 5; ++i) {
        attempts += entry("instanceID is = \n", 12 * i);
    }
    EXPECT_TRUE(host().log().ends_with(entry("using async installation.\n") + attempts));
}

TEST_F(JobRegistration, LibraryThatAppearsInTimeIsUsed) {
    host().fail_step(kLoad, ENOENT);
    int loads = 0;
    host().create_job() = [&](char *id, int, const char *) {
        ++loads;
        std::strcpy(id, "VELK-3");
        return 0;
    };
    std::thread repair = beside([&] {
        host().pause(30);
        host().fail_step(kLoad, 0);
    });
    EXPECT_EQ(install({uri()}).status.message, "Fail to create file transfer thread.");
    repair.join();
    EXPECT_EQ(host().passes(kLoad), 4) << "at 0, 12, 24 and 36 seconds";
    EXPECT_EQ(loads, 1);
}

TEST_F(JobRegistration, LibraryWithoutTheFunctionFails) {
    host().install_job_library(VELK_OTHER_LIBRARY);
    EXPECT_EQ(install({uri()}).status.message, "Fail to create job instance");
    EXPECT_EQ(velktest::occurrences(host().log(), "dlopen successfully.\n"), 5);
    EXPECT_EQ(velktest::occurrences(host().log(), "dlsym successfully.\n"), 0);
    EXPECT_EQ(velktest::occurrences(host().log(), "instanceID is = \n"), 5);
    EXPECT_EQ(host().own_pauses(), pauses_of_twelve(5));
}

TEST_F(JobRegistration, LibraryIsOpenedAndClosedForEveryAttempt) {
    const auto is_loaded = [] {
        void *library = dlopen(VELK_FAKE_JOB_LIBRARY, RTLD_NOW | RTLD_NOLOAD);
        if (library != nullptr) {
            dlclose(library);
        }
        return library != nullptr;
    };
    int loaded = 0;
    host().create_job() = [&](char *, int, const char *) {
        loaded += is_loaded() ? 1 : 0;
        return 1;
    };
    std::vector<bool> between;
    std::thread observer = beside([&] {
        for (int i = 0; i < 5; ++i) {
            host().pause(i == 0 ? 6 : 12);
            between.push_back(is_loaded());
        }
    });
    install({uri()});
    observer.join();
    EXPECT_EQ(host().passes(kLoad), 5);
    EXPECT_EQ(loaded, 5) << "while it is asked";
    EXPECT_EQ(between, std::vector<bool>(5, false)) << "in the pauses";
}

TEST_F(JobRegistration, IdWithoutATerminatorIsCut) {
    host().create_job() = [](char *id, int size, const char *) {
        std::memset(id, 'j', static_cast<std::size_t>(size));
        return 0;
    };
    install({uri()});
    EXPECT_EQ(instance_id(), std::string(39, 'j') + '\0');
}

TEST_F(JobRegistration, IdOfAnEarlierJobIsLoggedByAttemptsThatFail) {
    answer_with({0, 1});
    install({uri()});
    host().clear_log();
    install({uri()});
    EXPECT_EQ(velktest::occurrences(host().log(), "instanceID is = VELK-7\n"), 5);
}

TEST_F(JobRegistration, EveryRequestLeavesOneDescriptorOfTheLogOpenAndNoOther) {
    answer_with({0});
    install({uri()});
    const Descriptors before = open_descriptors();
    for (int i = 0; i < 3; ++i) {
        install({uri()});
    }
    host().call("ResetCimmon");
    host().call("NoSuchMethod");
    const Descriptors after = open_descriptors();
    EXPECT_EQ(before.log, 1U);
    EXPECT_EQ(after.log, before.log + 3);
    EXPECT_EQ(after.other, before.other);
}

TEST_F(JobRegistration, RefusedRequestsLeaveTheirDescriptorOfTheLogAsWell) {
    const Descriptors before = open_descriptors();
    install({});
    install({uri(), options({32768})});
    const Descriptors after = open_descriptors();
    EXPECT_EQ(after.log, before.log + 2);
    EXPECT_EQ(after.other, before.other);
}

TEST_F(JobRegistration, JobOfTheHostsOwnLibraryIsNamedAfterTheProduct) {
    host().install_job_library(VELK_JOB_LIBRARY);
    allow_threads(true);
    EXPECT_EQ(install({uri()}).return_value, velktest::cim::Value::uint32(4096));
    EXPECT_STREQ(instance_id().c_str(), "VELK-1");
    EXPECT_TRUE(host().wait_until_idle());
}
