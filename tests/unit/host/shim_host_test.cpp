// The host's name, libraries at fixed paths, and the shim as a preload.
#include <dlfcn.h>
#include <sys/utsname.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstring>

#include "tests/unit/host/shim_fixture.h"

namespace velkhost::shim::test {
namespace {

std::string node_name() {
    utsname name{};
    EXPECT_EQ(uname(&name), 0);
    return name.nodename;
}

class ShimIdentity : public testing::Test {
  protected:
    ~ShimIdentity() override { velkshim_set_node_name(nullptr); }
};

TEST_F(ShimIdentity, UnameAndGethostnameTellTheGivenName) {
    velkshim_set_node_name("esx-07");
    EXPECT_EQ(node_name(), "esx-07");
    std::array<char, 16> name{};
    EXPECT_EQ(gethostname(name.data(), name.size()), 0);
    EXPECT_STREQ(name.data(), "esx-07");
}

TEST_F(ShimIdentity, RestOfUnameStaysTheMachines) {
    utsname before{};
    utsname after{};
    uname(&before);
    velkshim_set_node_name("esx-07");
    uname(&after);
    EXPECT_STREQ(after.release, before.release);
    EXPECT_STREQ(after.machine, before.machine);
}

TEST_F(ShimIdentity, LongNameIsCutToItsField) {
    velkshim_set_node_name(std::string(300, 'n').c_str());
    EXPECT_EQ(node_name(), std::string(64, 'n'));
}

TEST_F(ShimIdentity, NameThatDoesNotFitGethostnameIsCutAndReported) {
    velkshim_set_node_name("esx-07");
    std::array<char, 4> name{'-', '-', '-', '-'};
    EXPECT_EQ(gethostname(name.data(), 3), -1);
    EXPECT_EQ(errno, ENAMETOOLONG);
    EXPECT_EQ(std::string(name.data(), name.size()), "esx-");
}

TEST_F(ShimIdentity, NullBringsTheMachinesNameBack) {
    const std::string before = node_name();
    velkshim_set_node_name("esx-07");
    velkshim_set_node_name(nullptr);
    EXPECT_EQ(node_name(), before);
}

class ShimLibraries : public ShimRoot {};

TEST_F(ShimLibraries, FixedPathIsOpenedUnderTheRoot) {
    std::filesystem::copy_file(VELKSHIM_TEST_LIBRARY, root_ / "usr/lib/cim/libanswer.so");
    void *const library = dlopen("/usr/lib/cim/libanswer.so", RTLD_NOW);
    ASSERT_NE(library, nullptr) << dlerror();
    const auto answer = reinterpret_cast<int (*)()>(dlsym(library, "velkshim_test_answer"));
    ASSERT_NE(answer, nullptr);
    EXPECT_EQ(answer(), 42);
    EXPECT_EQ(dlclose(library), 0);
}

TEST_F(ShimLibraries, AbsentLibraryIsReportedByItsPlaceUnderTheRoot) {
    EXPECT_EQ(dlopen("/usr/lib/cim/libabsent.so", RTLD_NOW), nullptr);
    EXPECT_NE(std::string(dlerror()).find(root_ / "usr/lib/cim/libabsent.so"), std::string::npos);
}

TEST_F(ShimLibraries, BareNameIsSearchedForByTheSystem) {
    void *const library = dlopen("libm.so.6", RTLD_NOW);
    EXPECT_NE(library, nullptr);
    dlclose(library);
}

TEST_F(ShimLibraries, BareNameOfALibraryAmongTheHostsIsOpenedUnderTheRoot) {
    std::filesystem::copy_file(VELKSHIM_TEST_LIBRARY, root_ / "usr/lib/cim/libbare.so");
    void *const library = dlopen("libbare.so", RTLD_NOW);
    ASSERT_NE(library, nullptr) << dlerror();
    EXPECT_NE(dlsym(library, "velkshim_test_answer"), nullptr);
    dlclose(library);
    velkshim_set_root(nullptr);
    EXPECT_EQ(dlopen("libbare.so", RTLD_NOW), nullptr);
}

TEST_F(ShimLibraries, FaultOfAHostsLibraryStrikesItsBareName) {
    std::filesystem::copy_file(VELKSHIM_TEST_LIBRARY, root_ / "usr/lib/cim/libbare.so");
    const auto refuse = [](void *, const char *step) {
        return std::strcmp(step, "dlopen:/usr/lib/cim/libbare.so") == 0 ? ENOENT : 0;
    };
    velkshim_set_fault_hook(refuse, nullptr);
    EXPECT_EQ(dlopen("libbare.so", RTLD_NOW), nullptr);
    EXPECT_THAT(dlerror(), testing::HasSubstr("No such file or directory"));
    velkshim_set_fault_hook(nullptr, nullptr);
}

TEST_F(ShimLibraries, NullNameIsTheProgramItself) {
    void *const program = dlopen(nullptr, RTLD_NOW);
    EXPECT_NE(program, nullptr);
    dlclose(program);
}

// libc looks where the caller's own file says; the caller must not seem to be the shim.
TEST_F(ShimLibraries, BareNameIsSearchedForOnTheRunPathOfTheCaller) {
#if defined(__SANITIZE_ADDRESS__) || defined(__SANITIZE_THREAD__)
    GTEST_SKIP() << "the sanitizer's own dlopen stands between the caller and the shim";
#endif
    void *const caller = dlopen(VELKSHIM_TEST_CALLER, RTLD_NOW);
    ASSERT_NE(caller, nullptr) << dlerror();
    const auto open_neighbour = reinterpret_cast<void *(*)()>(dlsym(caller, "open_neighbour"));
    ASSERT_NE(open_neighbour, nullptr);
    void *const neighbour = open_neighbour();
    ASSERT_NE(neighbour, nullptr) << dlerror();
    dlclose(neighbour);
    dlclose(caller);
}

// Runs the preloaded program with the given variables and returns what it wrote to stdout and
// stderr, and its exit status.
class ShimPreload : public ShimRoot {
  protected:
    // By a link, since a preload's path can have no blank in it, as the checkout's may.
    ShimPreload() { std::filesystem::create_symlink(VELKSHIM_LIBRARY, shim_); }

    std::string run(const std::string &variables) {
        const std::string command =
            variables + " LD_PRELOAD=" + shim_.native() + " \"" VELKSHIM_TEST_PROGRAM "\" 2>&1";
        FILE *const pipe = popen(command.c_str(), "r");
        std::string output;
        for (int c = std::fgetc(pipe); c != EOF; c = std::fgetc(pipe)) {
            output += static_cast<char>(c);
        }
        status_ = pclose(pipe);
        return output;
    }

    std::filesystem::path shim_ = root_ / "libvelkshim.so";
    int status_ = -1;
};

TEST_F(ShimPreload, EnvironmentSetsRootClockAndName) {
    const std::string output = run("VELKSHIM_ROOT=" + root_.native() +
                                   " VELKSHIM_CLOCK=virtual VELKSHIM_EPOCH=1000"
                                   " VELKSHIM_NODE=esx-07");
    EXPECT_EQ(status_, 0);
    EXPECT_EQ(output, "start 1000\nend 8200\nnode esx-07\n");
    EXPECT_EQ(text_of("/tmp/sfcb/preloaded"), "written at 8200");
}

TEST_F(ShimPreload, VirtualClockBeginsNowWhereNoEpochIsGiven) {
    const auto before = time(nullptr);
    const std::string output =
        run("VELKSHIM_ROOT=" + root_.native() + " VELKSHIM_CLOCK=virtual VELKSHIM_NODE=x");
    const auto start = std::atoll(output.c_str() + std::strlen("start "));
    EXPECT_GE(start, before);
    EXPECT_LE(start, time(nullptr));
    EXPECT_EQ(output, "start " + std::to_string(start) + "\nend " + std::to_string(start + 7200) +
                          "\nnode x\n");
}

TEST_F(ShimPreload, BadEpochIsOneLineAndTheClockStaysTheMachines) {
    for (const std::string bad : {"-1", "12x", "99999999999999999999", "''"}) {
        const std::string output = run("VELKSHIM_ROOT=" + root_.native() +
                                       " VELKSHIM_CLOCK=virtual VELKSHIM_EPOCH=" + bad +
                                       " VELKSHIM_TEST_PAUSE=0 VELKSHIM_NODE=x");
        EXPECT_EQ(output.find("velkshim: VELKSHIM_EPOCH="), 0U) << output;
        EXPECT_EQ(std::count(output.begin(), output.end(), '\n'), 4) << output;
        EXPECT_EQ(status_, 0);
    }
}

TEST_F(ShimPreload, BadClockIsOneLineAndTheClockStaysTheMachines) {
    const std::string output = run("VELKSHIM_ROOT=" + root_.native() +
                                   " VELKSHIM_CLOCK=fast VELKSHIM_TEST_PAUSE=0 VELKSHIM_NODE=x");
    EXPECT_EQ(output.find("velkshim: VELKSHIM_CLOCK=fast: neither \"real\" nor \"virtual\"; the "
                          "clock stays the machine's\nstart "),
              0U)
        << output;
    EXPECT_EQ(status_, 0);
}

TEST_F(ShimPreload, BadRootIsOneLineAndPathsStayTheMachines) {
    const std::string output =
        run("VELKSHIM_ROOT=" + (root_ / "absent").native() +
            " VELKSHIM_TEST_PAUSE=0 VELKSHIM_TEST_FILE=" + (root_ / "outside").native() +
            " VELKSHIM_NODE=x");
    EXPECT_EQ(output.find("velkshim: VELKSHIM_ROOT=" + (root_ / "absent").native() +
                          ": No such file or directory; paths stay the machine's\nstart "),
              0U)
        << output;
    EXPECT_EQ(status_, 0);
}

TEST_F(ShimPreload, WithoutVariablesAllStaysTheMachines) {
    const std::string output =
        run("VELKSHIM_TEST_PAUSE=0 VELKSHIM_TEST_FILE=" + (root_ / "outside").native());
    EXPECT_EQ(status_, 0);
    EXPECT_EQ(output.find("start "), 0U);
    EXPECT_NE(output.find("\nnode " + node_name() + "\n"), std::string::npos);
    EXPECT_TRUE(std::filesystem::exists(root_ / "outside"));
}

}  // namespace
}  // namespace velkhost::shim::test
