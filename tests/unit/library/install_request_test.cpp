// InstallFromURI up to the registration of its job: arguments, flags, refusals. There is no job
// library, so that no thread is started.

#include "tests/unit/library/request_fixture.h"
#include "velk/debug_log.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::cim::NamedValue;
using velktest::cim::Value;

class InstallRequest : public velktest::RequestTest {
  protected:
    // A request that gets as far as the job.
    void expect_no_job(const velktest::cim::NamedValues &in) {
        const auto reply = install(in);
        EXPECT_EQ(reply.status.code, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(reply.status.message, "Fail to create job instance");
    }

    static NamedValue update_args(const std::string &text) {
        return {"UpdateArgs", Value::string(text)};
    }
};

}  // namespace

TEST_F(InstallRequest, RunningInstallRefusesAnother) {
    Velkchild_thread_num = 1;
    const auto reply = install({uri()});
    EXPECT_EQ(reply.status.code, 1);
    EXPECT_EQ(reply.status.message, "An installation process is running");
    EXPECT_TRUE(reply.return_done);
    EXPECT_EQ(pkgnum, 0);
    EXPECT_TRUE(log().ends_with(entry("calling Method: InstallFromURI.\n")));
}

TEST_F(InstallRequest, LocationsMustBeOneText) {
    const NamedValue array = {"URI", Value::array(CMPI_string, {Value::string("file:///a")})};
    const NamedValue number = {"URI", Value::uint32(7)};
    const NamedValue null = {"URI", Value::null(CMPI_string)};
    const NamedValue other = {"Url", Value::string("file:///a")};
    for (const NamedValue &argument : {array, number, null, other}) {
        const auto reply = install({argument});
        EXPECT_EQ(reply.status.code, 1);
        EXPECT_EQ(reply.status.message, "Invalid parameter URI.");
        EXPECT_TRUE(log().ends_with(entry("Get In parameter.\n"))) << "no closing entry";
    }
    EXPECT_EQ(pkgnum, 0);
}

TEST_F(InstallRequest, SynchronousOptionInstallsNothingAndSendsNoValue) {
    const auto reply = install({uri("a/x.xml|a/y.xml"), options({32768})});
    EXPECT_TRUE(reply.status.ok());
    EXPECT_FALSE(reply.return_value);
    EXPECT_FALSE(reply.return_done);
    EXPECT_EQ(pkgnum, 2) << "the list is filled";
    EXPECT_EQ(is_async_install, 0);
    EXPECT_TRUE(pauses().empty());
    EXPECT_TRUE(
        log().ends_with(entries({"Complete initPkgInstall.\n",
                                 "Complete ZEB_VMWarePackageInstallationProviderInvokeMethod"
                                 ".\n"})));
}

TEST_F(InstallRequest, SynchronousOptionHoldsForAllLaterRequests) {
    install({uri(), options({32768})});
    for (const auto &in :
         {velktest::cim::NamedValues{uri()}, velktest::cim::NamedValues{uri(), options({32769})},
          velktest::cim::NamedValues{uri(), options({})}}) {
        const auto reply = install(in);
        EXPECT_TRUE(reply.status.ok());
        EXPECT_FALSE(reply.return_value);
    }
}

TEST_F(InstallRequest, OptionsSetTheFlags) {
    struct {
        std::vector<std::uint16_t> options;
        int sync, async;
    } const cases[] = {
        {{}, 0, 1},     {{32769}, 0, 1},       {{32768}, 1, 0}, {{32768, 32769}, 1, 1},
        {{1, 2}, 0, 1}, {{7, 32768, 9}, 1, 0}, {{32770}, 0, 1}, {{0}, 0, 1},
    };
    for (const auto &row : cases) {
        is_sync_install = 0;
        is_async_install = 0;
        install({uri(), options(row.options)});
        EXPECT_EQ(is_sync_install, row.sync) << testing::PrintToString(row.options);
        EXPECT_EQ(is_async_install, row.async) << testing::PrintToString(row.options);
    }
}

TEST_F(InstallRequest, OptionsOfAnotherFormCountAsAbsent) {
    const NamedValue forms[] = {
        {"InstallOptions", Value::uint16(32768)},
        {"InstallOptions", Value::array(CMPI_uint32, {Value::uint32(32768)})},
        {"InstallOptions", Value::null(CMPI_uint16A)},
        {"InstallOptions", Value::string("32768")},
    };
    for (const NamedValue &form : forms) {
        is_async_install = 0;
        expect_no_job({uri(), form});
        EXPECT_EQ(is_async_install, 1);
        EXPECT_EQ(is_sync_install, 0);
    }
}

TEST_F(InstallRequest, UpdateArgsSetAndClearTheFlags) {
    struct {
        const char *text;
        int backup, no_reboot;
    } const cases[] = {
        {"--backup --no-reboot", 1, 1}, {"x", 0, 0}, {"--backup", 1, 0},
        {"--no-reboot", 0, 1},          {"", 0, 0},  {"a--backups--no-reboot-b", 1, 1},
        {"--BACKUP --no_reboot", 0, 0},
    };
    is_sync_install = 1;
    for (const auto &row : cases) {
        clear_log();
        install({uri(), update_args(row.text)});
        EXPECT_EQ(g_is_backup_update, row.backup) << row.text;
        EXPECT_EQ(g_is_noreboot_update, row.no_reboot) << row.text;
        const std::string expected =
            entry(std::string("UpdateArgs = ") + row.text + "\n") +
            entry(row.backup == 1 ? "--backup is selected.\n" : "--backup is not selected.\n") +
            entry(row.no_reboot == 1 ? "--no-reboot is selected.\n"
                                     : "--no_reboot is not selected.\n");
        EXPECT_NE(log().find(expected), std::string::npos) << row.text;
    }
}

TEST_F(InstallRequest, WithoutUpdateArgsTheFlagsStay) {
    is_sync_install = 1;
    g_is_backup_update = 1;
    g_is_noreboot_update = 1;
    install({uri()});
    install({uri(), {"UpdateArgs", Value::null(CMPI_string)}});
    install({uri(), {"UpdateArgs", Value::uint32(1)}});
    EXPECT_EQ(g_is_backup_update, 1);
    EXPECT_EQ(g_is_noreboot_update, 1);
    EXPECT_EQ(velktest::occurrences(log(), "UpdateArgs = "), 0);
}

TEST_F(InstallRequest, LongUpdateArgsAreSearchedWhole) {
    is_sync_install = 1;
    install({uri(), update_args(std::string(5000, ' ') + "--backup")});
    EXPECT_EQ(g_is_backup_update, 1);
}

TEST_F(InstallRequest, FirstLocationTellsTheClient) {
    struct {
        const char *list;
        int client;
    } const cases[] = {
        {"sftp://s/a.xml", 0},
        {"tftp://s/a.xml", 0},
        {"file:///a.xml", 1},
        {"ftp://s/a.xml", 1},
        {"a.xml", 1},
        {"file:///a.xml|tftp://s/b.xml", 1},
        {"tftp://s/a.xml|file:///b.xml", 0},
    };
    for (const auto &row : cases) {
        invoke_client = 7;
        clear_log();
        install({uri(row.list)});
        EXPECT_EQ(invoke_client, row.client) << row.list;
        const char *line =
            row.client == 0 ? "VELK is called by UM.\n" : "VELK is called by PAKRO client.\n";
        EXPECT_EQ(velktest::occurrences(log(), line), 1);
    }
}

TEST_F(InstallRequest, MissingJobLibraryFailsAfterFiveAttempts) {
    velktest::set_field(instanceID, "VELK-3");
    expect_no_job({uri()});
    EXPECT_EQ(pauses(), std::vector<int>(5, 12)) << "also after the fifth";
    std::string attempts;
    for (int i = 0; i < 5; ++i) {
        attempts += entry("instanceID is = VELK-3\n", 12 * i);
    }
    EXPECT_TRUE(log().ends_with(entry("using async installation.\n") + attempts));
    EXPECT_EQ(pkgnum, 1) << "the table stays as it was filled";
}

TEST_F(InstallRequest, EveryRequestLeavesOneHandleOfTheLogOpen) {
    is_sync_install = 1;
    const std::size_t before = velktest::open_descriptors();
    for (int i = 0; i < 3; ++i) {
        install({uri()});
    }
    call("ResetCimmon");
    EXPECT_EQ(velktest::open_descriptors(), before + 3);
}
