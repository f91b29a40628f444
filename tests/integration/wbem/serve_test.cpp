// velkhost serve as a command: arguments, authentication, its end.
#include "tests/integration/wbem/wbem_fixture.h"

#include <gmock/gmock.h>
#include <sys/stat.h>

#include <csignal>

namespace velkhost::testing {
namespace {

using ::testing::HasSubstr;

class VelkhostServe : public WbemTest {
  protected:
    std::string password_file(mode_t mode = 0600) {
        const auto path = write_file("password", "secret\n");
        chmod(path.c_str(), mode);
        return path.string();
    }
    // `velkhost serve ARGUMENTS...`, which is to end by itself.
    Finished failing(std::vector<std::string> arguments) {
        arguments.insert(arguments.begin(), "serve");
        return velkhost(arguments);
    }
};

TEST_F(VelkhostServe, EverySignalEndsItInGoodOrder) {
    for (const int signal : {SIGTERM, SIGINT, SIGHUP}) {
        serve();
        ask({"ein", place() + kService});
        const Finished finished = stop(signal);
        EXPECT_EQ(finished.exit_code, 0) << finished.out;
        EXPECT_THAT(finished.out, HasSubstr("velkhost: ended after 1 request\n"));
        EXPECT_EQ(finished.err, "");
        EXPECT_TRUE(run_folders().empty());
    }
}

TEST_F(VelkhostServe, NamedRootStays) {
    const auto root = place_ / "root";
    serve({"--root", root.string()});
    ask({"ein", place() + kService});
    EXPECT_EQ(stop().exit_code, 0);
    EXPECT_TRUE(std::filesystem::exists(root / "tmp/velkdebug.txt"));
}

TEST_F(VelkhostServe, UserAndPasswordAreAskedFor) {
    serve({"--user", "root", "--password-file", password_file()});
    EXPECT_EQ(complaint({"ein", place() + kService}),
              "Http Exception: Username/password required.");
    const std::string rest = place().substr(7) + kService;
    EXPECT_EQ(complaint({"ein", "http://root:wrong@" + rest}),
              "Http Exception: Invalid username/password.");
    EXPECT_THAT(ask({"ein", "http://root:secret@" + rest}), HasSubstr("SystemName="));
}

TEST_F(VelkhostServe, OtherMachinesAreLetInOnlyWithAPassword) {
    const Finished finished = failing({"--listen", "0.0.0.0:0"});
    EXPECT_EQ(finished.exit_code, 2);
    EXPECT_THAT(finished.err, HasSubstr("takes --user and --password-file"));
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostServe, WrongArgumentsAreRefused) {
    EXPECT_EQ(failing({"--listen", "nowhere"}).exit_code, 2);
    EXPECT_EQ(failing({"--clock", "slow"}).exit_code, 2);
    EXPECT_EQ(failing({"--speed", "0"}).exit_code, 2);
    EXPECT_EQ(failing({"--user", "root"}).exit_code, 2);
    EXPECT_EQ(failing({"--user", "a:b", "--password-file", password_file()}).exit_code, 2);
    EXPECT_EQ(failing({"surplus"}).exit_code, 2);
    EXPECT_TRUE(run_folders().empty());
}

TEST_F(VelkhostServe, TroubleWithItsFilesAndItsAddressIsTold) {
    const Finished open = failing(
        {"--user", "root", "--password-file", password_file(0644), "--listen", "127.0.0.1:0"});
    EXPECT_EQ(open.exit_code, 4);
    EXPECT_THAT(open.err, HasSubstr("open to others than its owner"));
    EXPECT_EQ(failing({"--scenario", "no/such.toml"}).exit_code, 4);
    serve();
    const Finished taken = failing({"--listen", "127.0.0.1:" + std::to_string(port())});
    EXPECT_EQ(taken.exit_code, 4);
    EXPECT_THAT(taken.err, HasSubstr("cannot listen on 127.0.0.1:"));
}

TEST_F(VelkhostServe, FaultThatNeverStruckIsToldAndNoFailure) {
    const auto scenario = write_file("fault.toml", "[[fault]]\nstep = \"job.create\"\ncode = 1\n");
    serve({"--scenario", scenario.string()});
    const Finished finished = stop();
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, HasSubstr("a fault never struck: "));
    EXPECT_THAT(finished.out, HasSubstr("job.create"));
}

TEST_F(VelkhostServe, HelpTellsTheExitCodes) {
    const Finished finished = failing({"--help"});
    EXPECT_EQ(finished.exit_code, 0);
    EXPECT_THAT(finished.out, HasSubstr("Exit codes:"));
}

}  // namespace
}  // namespace velkhost::testing
