// The management controller's installation service and its jobs, through a broker.
#include "providers_controller_fixture.h"

namespace velkhost::providers::testing {
namespace {

using cim::NamedValues;
using cim::Value;

TEST_F(ControllerProvider, ServiceHasExactlyTheDocumentedKeys) {
    const broker::PathsReply reply =
        broker_.enumerate_instance_names(path_of("ZEB_SoftwareInstallationService"));
    ASSERT_EQ(reply.paths.size(), 1U);
    EXPECT_EQ(reply.paths[0], service());
    EXPECT_TRUE(broker_.get_instance(service()).status.ok());
}

TEST_F(ControllerProvider, WrongServiceKeysAreNotFound) {
    cim::ObjectPath wrong = service();
    wrong.keys.set("Name", Value::string("RXCSoftwareInstallationService"));
    EXPECT_EQ(broker_.get_instance(wrong).status.code, CMPI_RC_ERR_NOT_FOUND);
    const auto reply =
        broker_.invoke_method(wrong, "InstallFromURI", arguments(make_file("a.upd")));
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(reply.status.message,
              "No instance of ZEB_SoftwareInstallationService has these keys");
}

TEST_F(ControllerProvider, MissingAndSurplusServiceKeysAreNotFound) {
    const NamedValues in = arguments(make_file("a.upd"));
    cim::ObjectPath bare = path_of("ZEB_SoftwareInstallationService");
    EXPECT_EQ(broker_.invoke_method(bare, "InstallFromURI", in).status.code, CMPI_RC_ERR_NOT_FOUND);
    cim::ObjectPath more = service();
    more.keys.set("Extra", Value::string("x"));
    EXPECT_EQ(broker_.invoke_method(more, "InstallFromURI", in).status.code, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(ControllerProvider, InstallStartsAJobThatRecordsTheRequest) {
    const std::string uri = make_file("a.upd");
    const auto reply = install(arguments(uri, 1, 0));
    ASSERT_NE(reply.out.find("Job"), nullptr);
    EXPECT_TRUE(reply.return_done);
    const auto job = broker_.get_instance(*reply.out.find("Job")->as_path());
    ASSERT_TRUE(job.instance.has_value());
    EXPECT_EQ(job.instance->path.class_name, "ZEB_SoftwareInstallationJob");
    EXPECT_EQ(text(job.instance->properties, "URI"), uri);
    EXPECT_EQ(number(job.instance->properties, "Update_Operation"), 1U);
    EXPECT_EQ(number(job.instance->properties, "reboot_option"), 0U);
    EXPECT_EQ(number(job.instance->properties, "JobState"), 4U);
}

TEST_F(ControllerProvider, MethodNameIgnoresCase) {
    const NamedValues in = arguments(make_file("a.upd"));
    EXPECT_TRUE(broker_.invoke_method(service(), "installfromuri", in).status.ok());
}

TEST_F(ControllerProvider, UnknownMethodIsNotFound) {
    const auto reply = broker_.invoke_method(service(), "Install");
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_METHOD_NOT_FOUND);
    EXPECT_EQ(reply.status.message, "ZEB_SoftwareInstallationService has no method Install");
}

struct BadArgument {
    const char *name;
    NamedValues in;
    const char *message;
};

class ControllerArguments : public ControllerProvider,
                            public ::testing::WithParamInterface<BadArgument> {};

TEST_P(ControllerArguments, BadOneIsAnInvalidParameter) {
    const auto reply = install(GetParam().in);
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(reply.status.message, GetParam().message);
    EXPECT_FALSE(reply.return_value.has_value());
}

NamedValues three(Value uri, Value operation, Value reboot) {
    return {{"URI", std::move(uri)},
            {"Update_Operation", std::move(operation)},
            {"reboot_option", std::move(reboot)}};
}

INSTANTIATE_TEST_SUITE_P(
    Every, ControllerArguments,
    ::testing::Values(
        BadArgument{"None", {}, "Parameter URI is missing or null"},
        BadArgument{"NullUri", three(Value::null(CMPI_string), Value::uint8(0), Value::uint8(0)),
                    "Parameter URI is missing or null"},
        BadArgument{"UriWithoutText",
                    three({CMPI_string, cim::NullText{}}, Value::uint8(0), Value::uint8(0)),
                    "Parameter URI is missing or null"},
        BadArgument{"NumberAsUri", three(Value::uint32(1), Value::uint8(0), Value::uint8(0)),
                    "Parameter URI must be a string"},
        BadArgument{"ArrayAsUri",
                    three(Value::array(CMPI_string, {Value::string("file:///a")}), Value::uint8(0),
                          Value::uint8(0)),
                    "Parameter URI must be a string"},
        BadArgument{"NoOperation",
                    {{"URI", Value::string("file:///a")}, {"reboot_option", Value::uint8(0)}},
                    "Parameter Update_Operation is missing or null"},
        BadArgument{"WideOperation",
                    three(Value::string("file:///a"), Value::uint16(0), Value::uint8(0)),
                    "Parameter Update_Operation must be a uint8"},
        BadArgument{"UnknownOperation",
                    three(Value::string("file:///a"), Value::uint8(2), Value::uint8(0)),
                    "Parameter Update_Operation must be 0 or 1, not 2"},
        BadArgument{"NoReboot",
                    {{"URI", Value::string("file:///a")}, {"Update_Operation", Value::uint8(0)}},
                    "Parameter reboot_option is missing or null"},
        BadArgument{"UnknownReboot",
                    three(Value::string("file:///a"), Value::uint8(0), Value::uint8(255)),
                    "Parameter reboot_option must be 0 or 1, not 255"}),
    [](const auto &about) { return about.param.name; });

TEST_F(ControllerProvider, UriThatCannotBeReachedStartsNoJob) {
    const std::string good = make_file("a.upd");
    for (const std::string &uri :
         {good + ".gone", "file://" + folder_.string(), std::string("tftp://host/a.upd"),
          (folder_ / "a.upd").string(), std::string("file://"), std::string("file://host/a"),
          std::string("file:///dev/null"), std::string()}) {
        const auto reply = install(arguments(uri));
        EXPECT_TRUE(reply.status.ok()) << uri;
        EXPECT_EQ(reply.return_value, Value::uint32(4107)) << uri;
        EXPECT_TRUE(reply.out.empty()) << uri;
    }
    EXPECT_TRUE(
        broker_.enumerate_instances(path_of("ZEB_SoftwareInstallationJob")).instances.empty());
}

TEST_F(ControllerProvider, UnreachableUriUsesNoAnswerUp) {
    play("[[management_controller.answer]]\nreturn_value = 1\n[[management_controller.answer]]");
    install(arguments("file:///nonexistent"));
    EXPECT_EQ(install(arguments(make_file("a.upd"))).return_value, Value::uint32(1));
}

TEST_F(ControllerProvider, RefusalBearsStatusAndMessage) {
    play("[[management_controller.answer]]\nstatus = 1\nmessage = 'in recovery mode'");
    const auto reply = install(arguments(make_file("a.upd")));
    EXPECT_EQ(reply.status, (broker::Status{CMPI_RC_ERR_FAILED, "in recovery mode"}));
    EXPECT_FALSE(reply.return_value.has_value());
}

TEST_F(ControllerProvider, AnswerCanForgetToNameItsJob) {
    play("[[management_controller.answer]]\njob = []");
    const auto reply = install(arguments(make_file("a.upd")));
    EXPECT_EQ(reply.return_value, Value::uint32(4096));
    EXPECT_TRUE(reply.out.empty());
}

TEST_F(ControllerProvider, InstallFaultStrikesTheImageThatItNames) {
    play("[[fault]]\nstep = 'zeb.install'\nmatch = 'bad'\ncode = 2\nmessage = 'denied'");
    EXPECT_TRUE(install(arguments(make_file("good.upd"))).status.ok());
    const auto reply = install(arguments(make_file("bad.upd")));
    EXPECT_EQ(reply.status, (broker::Status{CMPI_RC_ERR_ACCESS_DENIED, "denied"}));
    EXPECT_TRUE(scenario_->faults.unfired().empty());
}

TEST_F(ControllerProvider, BrokerWithoutMemoryGivesAStatusAndNoCrash) {
    const auto job = start(make_file("a.upd"));
    for (const char *step : {"broker.newObjectPath", "broker.newInstance"}) {
        broker_.set_fault_hook([step](std::string_view at, std::string_view) {
            return at == step ? std::optional(broker::Fault{CMPI_RC_ERR_FAILED, "no memory"})
                              : std::nullopt;
        });
        EXPECT_EQ(broker_.get_instance(job).status.code, CMPI_RC_ERR_FAILED) << step;
    }
    broker_.set_fault_hook({});
    EXPECT_TRUE(broker_.get_instance(job).status.ok());
}

}  // namespace
}  // namespace velkhost::providers::testing
