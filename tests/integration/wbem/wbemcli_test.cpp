// An ordinary WBEM client does everything that it can do.
#include "tests/integration/wbem/wbem_fixture.h"

#include <gmock/gmock.h>

namespace velkhost::testing {
namespace {

using ::testing::AllOf;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::MatchesRegex;
using ::testing::Not;
using ::testing::StartsWith;

constexpr const char *kKeys =
    R"(:PAKRO_VMpkgInstallationService.SystemCreationClassName="CIM_ComputerSystem",)"
    R"(SystemName="esxi-01.example.com",CreationClassName="ZEB_PackageInstallationBroker",)"
    R"(Name="ZEB:ZEB_PackageInstallationBroker")";

class Wbemcli : public WbemTest {
  protected:
    void SetUp() override {
        WbemTest::SetUp();
        serve();
    }
    [[nodiscard]] std::string here(const std::string &name_space = "velk/cimv2") const {
        return "127.0.0.1:" + std::to_string(port()) + '/' + name_space;
    }
};

// -- Instances --

TEST_F(Wbemcli, NamesOfInstances) {
    EXPECT_EQ(ask({"ein", place() + kService}), here() + kKeys + "\n");
    EXPECT_EQ(ask({"ein", place() + ":CIM_Service"}), here() + kKeys + "\n");
    EXPECT_EQ(ask({"ein", place() + ":ZEB_ConcreteJob"}), "");
}

TEST_F(Wbemcli, Instances) {
    const std::string whole = ask({"ei", place() + kService});
    EXPECT_THAT(whole, HasSubstr(" SystemCreationClassName=\"CIM_ComputerSystem\","));
    EXPECT_THAT(whole, HasSubstr(",Name=\"ZEB:PackageInstallationBroker\",ElementName=\n"));
    EXPECT_THAT(ask({"ei", place() + kService, "Name"}),
                EndsWith(" Name=\"ZEB:PackageInstallationBroker\"\n"));
    EXPECT_EQ(ask({"-cte", "ei", place() + kService}), whole) << "would take chunks";
    EXPECT_THAT(ask({"-nl", "-t", "ei", place() + kService}),
                HasSubstr("-Name#=\"ZEB:PackageInstallationBroker\"\n"));
}

TEST_F(Wbemcli, OneInstance) {
    EXPECT_THAT(ask({"gi", service()}), HasSubstr(",SystemName=\"esxi-01.example.com\","));
    EXPECT_THAT(ask({"gi", service(), "SystemName"}),
                EndsWith("Broker\" SystemName=\"esxi-01.example.com\"\n"));
    EXPECT_THAT(complaint({"gi", place() + ":ZEB_ConcreteJob.InstanceID=\"nope\""}),
                StartsWith("(6) CIM_ERR_NOT_FOUND: "));
}

TEST_F(Wbemcli, ErrorsHaveCodesAndTexts) {
    EXPECT_EQ(complaint({"ein", place() + ":No_Such"}),
              "(5) CIM_ERR_INVALID_CLASS: Class not found");
    EXPECT_EQ(complaint({"ein", place("no/such") + ":No_Such"}),
              "(3) CIM_ERR_INVALID_NAMESPACE: Invalid namespace");
    EXPECT_THAT(complaint({"di", service()}), StartsWith("(7) CIM_ERR_NOT_SUPPORTED: "));
    EXPECT_THAT(complaint({"ci", service(), "Name=\"x\""}),
                StartsWith("(7) CIM_ERR_NOT_SUPPORTED: "));
    EXPECT_THAT(complaint({"gp", service(), "Name"}), StartsWith("(7) CIM_ERR_NOT_SUPPORTED: "));
}

// -- Classes --

TEST_F(Wbemcli, NamesOfClasses) {
    const std::string names = ask({"ecn", place()});
    for (const char *name : {"PAKRO_VMpkgInstallationService", "ZEB_ConcreteJob", "CIM_Service"}) {
        EXPECT_THAT(names, HasSubstr(here() + ":" + name + "\n"));
    }
    EXPECT_EQ(ask({"ecn", place() + ":CIM_ConcreteJob"}), here() + ":ZEB_ConcreteJob\n");
}

TEST_F(Wbemcli, Classes) {
    EXPECT_THAT(ask({"ec", place() + ":CIM_ConcreteJob"}),
                AllOf(StartsWith(here() + ":ZEB_ConcreteJob InstanceID="),
                      HasSubstr(",PercentComplete=,StartTime=,ElapsedTime=,")));
}

TEST_F(Wbemcli, OneClass) {
    EXPECT_THAT(ask({"gc", place() + kService}),
                StartsWith(here() + kService + " SystemCreationClassName="));
    EXPECT_THAT(ask({"gcd", place() + kService}),
                HasSubstr(R"(<PARAMETER.ARRAY NAME="InstallOptions" TYPE="uint16">)"));
    EXPECT_THAT(complaint({"gc", place() + ":No_Such"}), StartsWith("(6) CIM_ERR_NOT_FOUND: "));
}

// -- Associations --

TEST_F(Wbemcli, Associations) {
    const std::string names = ask({"ein", place("root/emulex") + ":ELXUCNA_EthernetPort"});
    const std::string port_path = "http://" + names.substr(0, names.find('\n'));
    const std::string connector =
        here("root/emulex") +
        R"(:ELXUCNA_PhysicalConnector.Tag="emulex_cna:1/port0",CreationClassName="ELXUCNA_Physical)"
        R"(Connector")";
    EXPECT_EQ(ask({"ain", port_path}), connector + "\n");
    EXPECT_EQ(ask({"ain", "-ac", "ELXUCNA_Realizes", port_path}), connector + "\n");
    EXPECT_THAT(ask({"ai", port_path}), StartsWith(connector + " Tag=\"emulex_cna:1/port0\","));
    EXPECT_THAT(ask({"rin", port_path}),
                StartsWith(here("root/emulex") + ":ELXUCNA_Realizes.Antecedent="));
    EXPECT_THAT(ask({"ri", port_path}), HasSubstr(" Antecedent=root/emulex:ELXUCNA_Physical"));
    EXPECT_EQ(complaint({"ain", service()}),
              "(6) CIM_ERR_NOT_FOUND: Provider not found or not loadable");
}

// -- Methods --

TEST_F(Wbemcli, MethodWithoutArguments) {
    EXPECT_THAT(ask({"cm", service(), "ResetCimmon"}), EndsWith(" ResetCimmon: 0\n"));
    EXPECT_THAT(ask({"cm", service(), "deletevelkdebuglogfile"}),
                EndsWith(" deletevelkdebuglogfile: 0\n"));
    EXPECT_EQ(ask({"cm", place() + kService, "ResetCimmon"}),
              here() + kService + " ResetCimmon: 0\n");
}

TEST_F(Wbemcli, MethodsThatAreRefused) {
    EXPECT_EQ(complaint({"cm", service(), "Nope"}),
              "(17) CIM_ERR_METHOD_NOT_FOUND: InValid Method Name");
    EXPECT_EQ(complaint({"cm", service(), "InstallFromURI"}),
              "(1) CIM_ERR_FAILED: Invalid parameter URI.");
    EXPECT_THAT(complaint({"cm", place() + ":No_Such", "Run"}),
                StartsWith("(6) CIM_ERR_NOT_FOUND: "));
}

TEST_F(Wbemcli, TextAndArrayArguments) {
    const std::string answer =
        ask(install_call(package(), ",InstallOptions=32769,1,UpdateArgs=\"--backup --no-reboot\""));
    EXPECT_THAT(answer, HasSubstr(kKeys));
    EXPECT_THAT(answer,
                EndsWith(" InstallFromURI: 4096, Job (reference): velk/cimv2:ZEB_ConcreteJob."
                         "InstanceID=\"VELK-1\"\n"));
}

TEST_F(Wbemcli, SynchronousRequestHasNoAnswer) {
    EXPECT_THAT(ask(install_call(package(), ",InstallOptions=32768")), Not(HasSubstr("4096")));
}

TEST_F(Wbemcli, AnswerInXml) {
    const std::vector<std::string> call = install_call(package());
    EXPECT_THAT(ask({"cmx", call[1], call[2]}),
                HasSubstr("<PARAMVALUE NAME=\"Job\" PARAMTYPE=\"reference\">\n<VALUE.REFERENCE>"));
}

}  // namespace
}  // namespace velkhost::testing
