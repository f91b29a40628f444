// InstallFromURI: what its arguments ask for, and what it answers in every case.

#include <cerrno>

#include "tests/conformance/conformance_test.h"
#include "tests/conformance/recorded_call.h"

namespace {

using velktest::entries;
using velktest::entry;
using velktest::RecordedCalls;
using velktest::RecordedReply;
using velktest::cim::NamedValue;
using velktest::cim::NamedValues;
using velktest::cim::Value;
using Sent = std::vector<std::string>;

constexpr const char *kInstall = "InstallFromURI";
const std::string kEnd = entry("Complete ZEB_VMWarePackageInstallationProviderInvokeMethod.\n");

class Request : public velktest::ConformanceTest {
  protected:
    // The whole answer of one case: status, message, what was sent, whether a job came with it.
    static void expect_answer(const RecordedReply &answer, int code, const std::string &message,
                              const Sent &sent, bool has_job = false) {
        EXPECT_EQ(answer.reply.status.code, code);
        EXPECT_EQ(answer.reply.status.message, message);
        EXPECT_EQ(answer.sent, sent);
        EXPECT_EQ(answer.reply.out.find("Job") != nullptr, has_job);
    }

    // Everything up to the start of a thread, which cannot be had: nothing is installed.
    void expect_asynchronous(const NamedValues &in) {
        host().fail_step("thread.create", EAGAIN);
        EXPECT_EQ(install(in).status.message, "Fail to create file transfer thread.");
    }

    void expect_synchronous(const NamedValues &in) {
        const auto reply = install(in);
        EXPECT_TRUE(reply.status.ok());
        EXPECT_FALSE(reply.return_value);
        EXPECT_FALSE(reply.return_done);
    }
};

Sent sends(int value) {
    return {"returnData uint32 " + std::to_string(value), "returnDone"};
}

}  // namespace

// -- Answers --

TEST_F(Request, WhileAnInstallRunsIsRefusedWithOne) {
    host().controller().end.value = 0;  // the package takes ten seconds to fail
    const auto descriptor = host().folder() / "uefi.xml";
    velktest::write_file(descriptor,
                         "  <PROPERTY NAME=\"type\" TYPE=\"uint16\">\n"
                         "    <VALUE>1</VALUE>\n"
                         "  <PROPERTY NAME=\"category\" TYPE=\"string\">\n"
                         "    <VALUE>UEFI</VALUE>\n");
    ASSERT_NO_FATAL_FAILURE(start({"file://" + descriptor.string()}));
    RecordedCalls calls(host());
    const auto answer = calls.call(kInstall, {uri()});
    expect_answer(answer, 1, "An installation process is running", sends(1));
    EXPECT_TRUE(host().log().ends_with(entry("calling Method: InstallFromURI.\n", 1)))
        << "no closing entry";
    EXPECT_TRUE(host().wait_until_idle());
}

TEST_F(Request, WithoutInputArgumentsIsRefusedWithTheClosingEntry) {
    RecordedCalls calls(host());
    expect_answer(calls.call_without_arguments(kInstall), 17, "IN Parameter is NULL", sends(0));
    EXPECT_TRUE(host().log().ends_with(entry("calling Method: InstallFromURI.\n") + kEnd));
}

TEST_F(Request, WhoseLocationsAreNoTextIsRefusedWithThree) {
    RecordedCalls calls(host());
    const NamedValues forms[] = {
        {},
        {{"Url", Value::string("file:///a")}},
        {{"URI", Value::array(CMPI_string, {Value::string("file:///a")})}},
        {{"URI", Value::null(CMPI_string)}},
        {{"URI", Value::uint32(7)}},
        {{"URI", Value::boolean(true)}},
    };
    for (const NamedValues &in : forms) {
        expect_answer(calls.call(kInstall, in), 1, "Invalid parameter URI.", sends(3));
        EXPECT_TRUE(host().log().ends_with(
            entries({"calling Method: InstallFromURI.\n", "Get In parameter.\n"})));
    }
    EXPECT_EQ(host().value("pkgnum"), 0);
}

TEST_F(Request, ForASynchronousInstallSendsNothing) {
    RecordedCalls calls(host());
    expect_answer(calls.call(kInstall, {uri(), options({32768})}), 0, "", {});
    EXPECT_TRUE(host().log().ends_with(entry("Complete initPkgInstall.\n") + kEnd));
}

TEST_F(Request, WithoutAJobLibraryFailsAfterAMinute) {
    host().remove_job_library();
    RecordedCalls calls(host());
    expect_answer(calls.call(kInstall, {uri()}), 1, "Fail to create job instance", sends(1));
    EXPECT_DOUBLE_EQ(host().now(), 60);
    EXPECT_TRUE(host().log().ends_with(entry("instanceID is = \n", 48))) << "no closing entry";
    EXPECT_EQ(host().value("pkgnum"), 1) << "the table stays as it was filled";
}

TEST_F(Request, WithoutAThreadFailsAfterASecond) {
    host().fail_step("thread.create", EAGAIN);
    RecordedCalls calls(host());
    expect_answer(calls.call(kInstall, {uri()}), 1, "Fail to create file transfer thread.",
                  sends(1));
    EXPECT_DOUBLE_EQ(host().now(), 1);
    EXPECT_TRUE(host().log().ends_with(entry("Create new thread fail.\n", 1)));
}

TEST_F(Request, ThatIsAcceptedReturnsItsJob) {
    RecordedCalls calls(host());
    const auto answer = calls.call(kInstall, {uri()});
    EXPECT_TRUE(host().wait_until_idle());
    expect_answer(answer, 0, "", sends(4096), true);
    const auto *job = answer.reply.out.find("Job");
    EXPECT_EQ(job->type(), CMPI_ref);
    EXPECT_EQ(*job->as_path(),
              (velktest::cim::ObjectPath{
                  "", "velk/cimv2", "ZEB_ConcreteJob", {{"InstanceID", Value::string("VELK-1")}}}));
    EXPECT_TRUE(host().log().ends_with(
        entries({"Create new thread success.\n", "Job accomplished.\n"}, 1) +
        entry("Complete ZEB_VMWarePackageInstallationProviderInvokeMethod.\n", 1)))
        << host().log();
}

// -- InstallOptions --

struct OptionsCase {
    const char *name;
    std::vector<NamedValue> options;
};

void PrintTo(const OptionsCase &row, std::ostream *out) {
    *out << row.name;
}

class RequestForAsynchronous : public Request, public testing::WithParamInterface<OptionsCase> {};

TEST_P(RequestForAsynchronous, InstallsInTheBackground) {
    NamedValues in = {uri()};
    for (const NamedValue &argument : GetParam().options) {
        in.set(argument.name, argument.value);
    }
    const auto reply = install(in);
    EXPECT_EQ(reply.return_value, Value::uint32(4096));
    EXPECT_EQ(host().value("is_async_install"), 1);
    EXPECT_EQ(host().value("is_sync_install"), 0);
    EXPECT_TRUE(host().wait_until_idle());
}

Value numbers(const std::vector<std::uint16_t> &values) {
    Value::Array elements;
    for (const std::uint16_t value : values) {
        elements.push_back(Value::uint16(value));
    }
    return Value::array(CMPI_uint16, elements);
}

const OptionsCase kAsynchronous[] = {
    {"Absent", {}},
    {"NullArray", {{"InstallOptions", Value::null(CMPI_uint16A)}}},
    {"EmptyArray", {{"InstallOptions", numbers({})}}},
    {"Asynchronous", {{"InstallOptions", numbers({32769})}}},
    {"OtherValues", {{"InstallOptions", numbers({7, 0, 32767, 32770, 65535})}}},
    {"NullElements",
     {{"InstallOptions",
       Value::array(CMPI_uint16, {Value::null(CMPI_uint16), Value::null(CMPI_uint16)})}}},
    {"Scalar", {{"InstallOptions", Value::uint16(32768)}}},
    {"WiderNumbers", {{"InstallOptions", Value::array(CMPI_uint32, {Value::uint32(32768)})}}},
    {"Texts", {{"InstallOptions", Value::array(CMPI_string, {Value::string("32768")})}}},
};

INSTANTIATE_TEST_SUITE_P(Options, RequestForAsynchronous, testing::ValuesIn(kAsynchronous),
                         [](const auto &row) { return std::string(row.param.name); });

TEST_F(Request, SynchronousOptionCountsAmongOthersAndNullElements) {
    expect_synchronous({uri(),
                        {"InstallOptions",
                         Value::array(CMPI_uint16, {Value::null(CMPI_uint16), Value::uint16(7),
                                                    Value::uint16(32768), Value::uint16(32769)})}});
    EXPECT_EQ(host().value("is_sync_install"), 1);
    EXPECT_EQ(host().value("is_async_install"), 1);
}

TEST_F(Request, SynchronousOptionHoldsForAllLaterRequestsOfTheProcess) {
    expect_synchronous({uri("file:///a|file:///b"), options({32768})});
    EXPECT_EQ(host().value("pkgnum"), 2) << "the list is filled";
    EXPECT_EQ(host().value("is_async_install"), 0);
    expect_synchronous({uri()});
    expect_synchronous({uri(), options({})});
    expect_synchronous({uri(), options({32769})});
    EXPECT_EQ(host().value("is_sync_install"), 1);
    EXPECT_TRUE(host().own_pauses().empty());
    EXPECT_EQ(host().passes("dlopen:/usr/lib/cim/libconcretejob.so"), 0);
    EXPECT_EQ(host().passes("thread.create"), 0);
}

TEST_F(Request, AsynchronousOptionDoesNotKeepALaterOneFromBeingSynchronous) {
    expect_asynchronous({uri(), options({32769})});
    expect_synchronous({uri(), options({32768})});
    EXPECT_EQ(host().value("is_async_install"), 1) << "never cleared";
}

// -- UpdateArgs --

TEST_F(Request, UpdateArgsSetAndClearBothFlags) {
    struct {
        const char *text;
        bool backup, no_reboot;
    } const cases[] = {
        {"--backup --no-reboot", true, true},
        {"x", false, false},
        {"--backup", true, false},
        {"--no-reboot", false, true},
        {"", false, false},
        {"a--backups--no-reboot-b", true, true},
        {"--BACKUP --no_reboot", false, false},
    };
    for (const auto &row : cases) {
        host().clear_log();
        expect_synchronous({uri(), options({32768}), update_args(row.text)});
        EXPECT_EQ(host().value("g_is_backup_update"), row.backup) << row.text;
        EXPECT_EQ(host().value("g_is_noreboot_update"), row.no_reboot) << row.text;
        const std::string expected =
            entry(std::string("UpdateArgs = ") + row.text + "\n") +
            entry(row.backup ? "--backup is selected.\n" : "--backup is not selected.\n") +
            entry(row.no_reboot ? "--no-reboot is selected.\n" : "--no_reboot is not selected.\n");
        EXPECT_NE(host().log().find(expected), std::string::npos) << row.text;
    }
}

TEST_F(Request, WithoutUpdateArgsKeepsTheFlagsOfAnEarlierOne) {
    expect_synchronous({uri(), options({32768}), update_args("--backup --no-reboot")});
    host().clear_log();
    for (const Value &none : {Value(), Value::null(CMPI_string), Value::uint32(1)}) {
        NamedValues in = {uri()};
        if (none.type() != CMPI_null) {
            in.set("UpdateArgs", none);
        }
        expect_synchronous(in);
        EXPECT_EQ(host().value("g_is_backup_update"), 1);
        EXPECT_EQ(host().value("g_is_noreboot_update"), 1);
    }
    EXPECT_EQ(velktest::occurrences(host().log(), "UpdateArgs = "), 0);
}

TEST_F(Request, LongUpdateArgsAreSearchedToTheirEnd) {
    expect_synchronous(
        {uri(), options({32768}), update_args(std::string(100'000, ' ') + "--no-reboot")});
    EXPECT_EQ(host().value("g_is_noreboot_update"), 1);
}

// -- The client --

TEST_F(Request, FirstLocationTellsWhichClientCalls) {
    struct {
        const char *list;
        int client;
    } const cases[] = {
        {"sftp://s/a.xml", 0},
        {"file:///a.xml", 1},
        {"tftp://s/a.xml", 0},
        {"ftp://s/a.xml", 1},
        {"tftp://s/a.xml|file:///b.xml", 0},
        {"a.xml", 1},
        {"file:///tftp://s/a.xml", 0},
        {"file:///a.xml|tftp://s/b.xml", 1},
    };
    for (const auto &row : cases) {
        host().clear_log();
        expect_asynchronous({uri(row.list)});
        EXPECT_EQ(host().value("invoke_client"), row.client) << row.list;
        const char *line =
            row.client == 0 ? "VELK is called by UM.\n" : "VELK is called by PAKRO client.\n";
        EXPECT_EQ(velktest::occurrences(host().log(), line), 1) << row.list;
        EXPECT_EQ(velktest::occurrences(host().log(), "VELK is called by"), 1) << row.list;
    }
}
