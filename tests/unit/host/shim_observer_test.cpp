// What the file observer is told, and what the fault hook is asked.
#include <dirent.h>
#include <dlfcn.h>
#include <fcntl.h>
#include <unistd.h>

#include <cstdio>
#include <map>
#include <thread>
#include <vector>

#include "tests/unit/host/shim_fixture.h"

namespace velkhost::shim::test {
namespace {

constexpr const char *kLog = "/tmp/velkdebug.txt";
constexpr const char *kStatus = "/tmp/sfcb/velkstatVELK-1.txt";

struct Sighting {
    std::string path;
    std::int64_t time_us;
    bool operator==(const Sighting &) const = default;
};

class ShimObserver : public ShimRoot {
  protected:
    ShimObserver() {
        velkshim_use_virtual_clock(77'000'000);
        velkshim_observe_files(see, &seen_);
    }
    ~ShimObserver() override {
        velkshim_observe_files(nullptr, nullptr);
        velkshim_use_real_clock();
    }

    static void see(void *context, const char *path, std::int64_t now_us) {
        static_cast<std::vector<Sighting> *>(context)->push_back({path, now_us});
    }

    std::vector<Sighting> seen_;
};

TEST_F(ShimObserver, CloseOfAWrittenFileIsToldWithItsFixedPathAndTime) {
    const int file = open("//tmp//velkdebug.txt", O_WRONLY | O_CREAT, 0644);
    EXPECT_TRUE(seen_.empty());
    usleep(5);
    close(file);
    EXPECT_EQ(seen_, (std::vector<Sighting>{{kLog, 77'000'005}}));
}

TEST_F(ShimObserver, FcloseIsTold) {
    FILE *const file = std::fopen(kStatus, "w");
    std::fputs("0|", file);
    EXPECT_TRUE(seen_.empty());
    std::fclose(file);
    EXPECT_EQ(seen_, (std::vector<Sighting>{{kStatus, 77'000'000}}));
}

TEST_F(ShimObserver, AppendAndUpdateModesCountAsWriting) {
    put(kLog, "");
    for (const char *mode : {"a", "r+", "w+e"}) {
        std::fclose(std::fopen(kLog, mode));
    }
    close(open(kLog, O_RDWR));
    EXPECT_EQ(seen_.size(), 4U);
}

TEST_F(ShimObserver, DescriptorClosedThroughItsStreamIsTold) {
    std::fclose(fdopen(open(kLog, O_WRONLY | O_CREAT, 0644), "w"));
    EXPECT_EQ(seen_.size(), 1U);
}

TEST_F(ShimObserver, StandardStreamIsTold) {
    std::ofstream(kLog) << "x";
    EXPECT_EQ(seen_.size(), 1U);
}

TEST_F(ShimObserver, ReadingIsNotTold) {
    put(kLog, "");
    seen_.clear();
    close(open(kLog, O_RDONLY));
    std::fclose(std::fopen(kLog, "r"));
    closedir(opendir("/tmp/sfcb"));
    EXPECT_TRUE(seen_.empty());
}

TEST_F(ShimObserver, OtherPathsAreNotTold) {
    std::ofstream(root_ / "outside") << "x";
    EXPECT_TRUE(seen_.empty());
}

TEST_F(ShimObserver, NumberThatAnotherFileTookOverIsNotTold) {
    const int first = open(kLog, O_WRONLY | O_CREAT, 0644);
    close(first);
    const int second = open("/dev/null", O_WRONLY);
    EXPECT_EQ(second, first);
    close(second);
    EXPECT_EQ(seen_.size(), 1U);
}

TEST_F(ShimObserver, FailedOpenIsNotTold) {
    EXPECT_EQ(open("/tmp/sfcb/absent/x", O_WRONLY | O_CREAT, 0644), -1);
    EXPECT_TRUE(seen_.empty());
}

TEST_F(ShimObserver, FreopenTellsOfTheFileThatItLeaves) {
    FILE *file = std::fopen(kLog, "w");
    file = std::freopen(kStatus, "w", file);
    EXPECT_EQ(seen_.size(), 1U);
    std::fclose(file);
    ASSERT_EQ(seen_.size(), 2U);
    EXPECT_EQ(seen_[0].path, kLog);
    EXPECT_EQ(seen_[1].path, kStatus);
}

TEST_F(ShimObserver, FilesThatTheObserverWritesAreNotTold) {
    int calls = 0;
    const auto write_on = [](void *context, const char *, std::int64_t) {
        ++*static_cast<int *>(context);
        std::ofstream(kStatus) << "x";
    };
    velkshim_observe_files(write_on, &calls);
    close(open(kLog, O_WRONLY | O_CREAT, 0644));
    EXPECT_EQ(calls, 1);
    EXPECT_EQ(text_of(kStatus), "x");
}

// Under the thread sanitizer this also shows that the shim hands the context over in both ways.
TEST_F(ShimObserver, OtherThreadsAreToldWhereTheyClose) {
    std::thread writer([] { close(open(kLog, O_WRONLY | O_CREAT, 0644)); });
    writer.join();
    velkshim_observe_files(nullptr, nullptr);
    EXPECT_EQ(seen_.size(), 1U);
}

TEST_F(ShimObserver, SetterWaitsForTheCallbacksUnderWay) {
    struct Stage {
        std::atomic<bool> entered{false};
        std::atomic<bool> finished{false};
    } stage;
    velkshim_observe_files(
        [](void *context, const char *, std::int64_t) {
            auto &there = *static_cast<Stage *>(context);
            there.entered = true;
            for (int i = 0; i < 1000; ++i) {
                std::this_thread::yield();
            }
            there.finished = true;
        },
        &stage);
    std::thread writer([] { close(open(kLog, O_WRONLY | O_CREAT, 0644)); });
    while (!stage.entered) {
        std::this_thread::yield();
    }
    velkshim_observe_files(nullptr, nullptr);
    EXPECT_TRUE(stage.finished);
    writer.join();
}

// Strikes each step as often as it was told to, and counts how often it was asked.
class ShimFaults : public ShimRoot {
  protected:
    struct Rule {
        int error = 0;
        int count = 0;
    };

    ShimFaults() { velkshim_set_fault_hook(ask, this); }
    ~ShimFaults() override { velkshim_set_fault_hook(nullptr, nullptr); }

    static int ask(void *context, const char *step) {
        auto &self = *static_cast<ShimFaults *>(context);
        ++self.asked_[step];
        const auto rule = self.rules_.find(step);
        if (rule == self.rules_.end() || rule->second.count-- <= 0) {
            return 0;
        }
        return rule->second.error;
    }

    std::map<std::string, Rule> rules_;
    std::map<std::string, int> asked_;
};

TEST_F(ShimFaults, OpenFailsAsOftenAsTheHookSays) {
    rules_["open:/tmp/velkdebug.txt"] = {EACCES, 2};
    EXPECT_EQ(open(kLog, O_WRONLY | O_CREAT, 0644), -1);
    EXPECT_EQ(errno, EACCES);
    EXPECT_EQ(std::fopen(kLog, "a"), nullptr);
    EXPECT_EQ(errno, EACCES);
    FILE *const file = std::fopen(kLog, "a");
    EXPECT_NE(file, nullptr);
    std::fclose(file);
    EXPECT_EQ(asked_["open:/tmp/velkdebug.txt"], 3);
}

TEST_F(ShimFaults, FailedStepTouchesNoFile) {
    rules_["open:/tmp/velkdebug.txt"] = {ENOSPC, 1};
    rules_["unlink:/tmp/sfcb/velkstatVELK-1.txt"] = {EBUSY, 1};
    put(kStatus, "x");
    EXPECT_EQ(open(kLog, O_WRONLY | O_CREAT, 0644), -1);
    EXPECT_FALSE(std::filesystem::exists(under_root(kLog)));
    EXPECT_EQ(unlink(kStatus), -1);
    EXPECT_EQ(errno, EBUSY);
    EXPECT_TRUE(std::filesystem::exists(under_root(kStatus)));
    EXPECT_EQ(unlink(kStatus), 0);
}

TEST_F(ShimFaults, FolderStepsFail) {
    rules_["opendir:/tmp/sfcb"] = {EMFILE, 1};
    rules_["mkdir:/var/tmp/ZEB"] = {EROFS, 1};
    rules_["rmdir:/tmp/sfcb"] = {EBUSY, 2};
    rules_["closedir:/tmp/sfcb"] = {EIO, 1};
    EXPECT_EQ(opendir("/tmp/sfcb"), nullptr);
    EXPECT_EQ(errno, EMFILE);
    EXPECT_EQ(mkdir("/var/tmp/ZEB", 0755), -1);
    EXPECT_EQ(errno, EROFS);
    EXPECT_EQ(rmdir("/tmp/sfcb"), -1);
    EXPECT_EQ(errno, EBUSY);
    EXPECT_EQ(std::remove("/tmp/sfcb"), -1);
    EXPECT_EQ(closedir(opendir("/tmp/sfcb")), -1);
    EXPECT_EQ(errno, EIO);
    EXPECT_EQ(closedir(opendir("/tmp/sfcb")), 0);
}

TEST_F(ShimFaults, CloseFailsAndTheDescriptorIsGone) {
    rules_["close:/tmp/velkdebug.txt"] = {ENOSPC, 2};
    const int file = open(kLog, O_WRONLY | O_CREAT, 0644);
    EXPECT_EQ(close(file), -1);
    EXPECT_EQ(errno, ENOSPC);
    EXPECT_EQ(fcntl(file, F_GETFD), -1);
    EXPECT_EQ(std::fclose(std::fopen(kLog, "w")), EOF);
    EXPECT_EQ(errno, ENOSPC);
}

TEST_F(ShimFaults, EitherNameOfARenameFails) {
    put(kLog, "");
    rules_["rename:/tmp/sfcb/velkstatVELK-1.txt"] = {EXDEV, 1};
    EXPECT_EQ(rename(kLog, kStatus), -1);
    EXPECT_EQ(errno, EXDEV);
    EXPECT_EQ(asked_["rename:/tmp/velkdebug.txt"], 1);
}

TEST_F(ShimFaults, ThreadCreationFails) {
    rules_["thread.create"] = {EAGAIN, 1};
    pthread_t thread{};
    const auto body = [](void *argument) -> void * { return argument; };
    EXPECT_EQ(pthread_create(&thread, nullptr, body, nullptr), EAGAIN);
    ASSERT_EQ(pthread_create(&thread, nullptr, body, &thread), 0);
    void *result = nullptr;
    EXPECT_EQ(pthread_join(thread, &result), 0);
    EXPECT_EQ(result, &thread);
}

TEST_F(ShimFaults, DlopenFailsWithAText) {
    rules_["dlopen:/usr/lib/cim/libx.so"] = {EACCES, 1};
    EXPECT_EQ(dlopen("/usr/lib/cim/libx.so", RTLD_NOW), nullptr);
    const char *const text = dlerror();
    ASSERT_NE(text, nullptr);
    EXPECT_NE(std::string(text).find("Permission denied"), std::string::npos) << text;
}

TEST_F(ShimFaults, HookIsNotAskedAboutOtherPathsNorWithinItself) {
    std::ofstream(root_ / "outside") << "x";
    EXPECT_TRUE(asked_.empty());
    int calls = 0;
    velkshim_set_fault_hook(
        [](void *context, const char *) {
            ++*static_cast<int *>(context);
            return access(kLog, F_OK) == 0 ? EEXIST : 0;
        },
        &calls);
    close(open(kLog, O_WRONLY | O_CREAT, 0644));
    EXPECT_EQ(calls, 2);  // its open and its close
}

}  // namespace
}  // namespace velkhost::shim::test
