// The services that write one file to one port: what all of them have in common.
#include "providers_adapter_fixture.h"

namespace velkhost::providers::testing {
namespace {

using cim::NamedValues;
using cim::Value;

struct Service {
    const char *name;  // of the test
    const char *family;
    const char *name_space;
    const char *service_class;
    const char *service_name;
    const char *system_class;
    const char *port_class;
    const char *ports;                   // the adapter's key
    std::vector<std::uint16_t> options;  // empty: no such argument
    std::uint32_t usual;
};

void PrintTo(const Service &service, std::ostream *out) {
    *out << service.name;
}

class PortServices : public AdapterProvider, public ::testing::WithParamInterface<Service> {
  protected:
    PortServices() { play_with(""); }

    void play_with(const std::string &text) {
        play("[host]\nnode = 'node-7'\n[[adapter]]\nfamily = '" + std::string(GetParam().family) +
             "'\nserial = 'S1'\n" + GetParam().ports + " = ['p1', 'p2']\n" + text);
    }

    static std::string table() { return "[[" + std::string(GetParam().family) + ".answer]]\n"; }
    static std::string step(const char *name) {
        return "[[fault]]\nstep = '" + std::string(GetParam().family) + "." + name + "'\n";
    }

    static cim::ObjectPath of_class(const char *name) {
        return class_path(GetParam().name_space, name);
    }
    static cim::ObjectPath service() {
        cim::ObjectPath path = of_class(GetParam().service_class);
        path.keys = {{"SystemCreationClassName", Value::string(GetParam().system_class)},
                     {"SystemName", Value::string("node-7")},
                     {"CreationClassName", Value::string(GetParam().service_class)},
                     {"Name", Value::string(GetParam().service_name)}};
        return path;
    }
    static cim::ObjectPath port(const std::string &id) {
        cim::ObjectPath path = of_class(GetParam().port_class);
        path.keys = {{"SystemCreationClassName", Value::string(GetParam().system_class)},
                     {"SystemName", Value::string("node-7")},
                     {"CreationClassName", Value::string(GetParam().port_class)},
                     {"DeviceID", Value::string(id)}};
        return path;
    }

    static Value options(const std::vector<std::uint16_t> &numbers) {
        Value::Array elements;
        for (const std::uint16_t number : numbers) {
            elements.push_back(Value::uint16(number));
        }
        return Value::array(CMPI_uint16, std::move(elements));
    }
    static NamedValues arguments(const std::string &uri, const std::string &id = "p1") {
        NamedValues in{{"Target", Value::reference(port(id))}, {"URI", Value::string(uri)}};
        if (!GetParam().options.empty()) {
            in.set("InstallOptions", options({GetParam().options.front()}));
        }
        return in;
    }

    broker::MethodReply install(const NamedValues &in) {
        return broker_.invoke_method(service(), "InstallFromURI", in);
    }
    std::optional<Value> result(const NamedValues &in) {
        const broker::MethodReply reply = install(in);
        EXPECT_TRUE(reply.status.ok()) << reply.status.message;
        return reply.return_value;
    }
    std::string refusal(const NamedValues &in) {
        const broker::MethodReply reply = install(in);
        EXPECT_EQ(reply.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
        return reply.status.message;
    }
};

TEST_P(PortServices, ServiceHasItsDocumentedKeys) {
    const auto names = broker_.enumerate_instance_names(of_class(GetParam().service_class));
    ASSERT_EQ(names.paths.size(), 1U);
    EXPECT_EQ(names.paths[0], service());
    EXPECT_TRUE(broker_.get_instance(service()).status.ok());
}

TEST_P(PortServices, PortsHaveTheirDocumentedKeys) {
    const auto names = broker_.enumerate_instance_names(of_class(GetParam().port_class));
    EXPECT_THAT(names.paths, ::testing::ElementsAre(port("p1"), port("p2")));
    EXPECT_TRUE(broker_.get_instance(port("p2")).status.ok());
    EXPECT_EQ(broker_.get_instance(port("p3")).status.code, CMPI_RC_ERR_NOT_FOUND);
}

TEST_P(PortServices, InstallsOnEitherPort) {
    EXPECT_EQ(result(arguments(make_file("fw.bin"))), Value::uint32(GetParam().usual));
    EXPECT_EQ(result(arguments(make_file("fw.bin"), "p2")), Value::uint32(GetParam().usual));
}

TEST_P(PortServices, WrongServiceKeysAreNotFound) {
    cim::ObjectPath wrong = service();
    wrong.keys.set("SystemName", Value::string("node-8"));
    const auto reply = broker_.invoke_method(wrong, "InstallFromURI", arguments("file:///x"));
    EXPECT_EQ(reply.status.code, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(broker_.invoke_method(service(), "Install").status.code,
              CMPI_RC_ERR_METHOD_NOT_FOUND);
}

TEST_P(PortServices, MissingAndMistypedArgumentsAreNamed) {
    const std::string uri = make_file("fw.bin");
    EXPECT_EQ(refusal({}), "Parameter URI is missing or null");
    EXPECT_EQ(refusal({{"URI", Value::uint32(1)}}), "Parameter URI must be a string");
    EXPECT_EQ(refusal({{"URI", Value::string(uri)}}), "Parameter Target is missing or null");
    EXPECT_EQ(refusal({{"URI", Value::string(uri)}, {"Target", Value::string("p1")}}),
              "Parameter Target must be a reference");
}

TEST_P(PortServices, TargetOfAnotherClassIsUnsupported) {
    NamedValues in = arguments(make_file("fw.bin"));
    in.set("Target", Value::reference(service()));
    EXPECT_EQ(result(in), Value::uint32(4097));
}

TEST_P(PortServices, PortThatIsNotThereIsAnInvalidParameter) {
    EXPECT_EQ(result(arguments(make_file("fw.bin"), "p3")), Value::uint32(5));
    NamedValues in = arguments(make_file("fw.bin"));
    in.set("Target", Value::reference(of_class(GetParam().port_class)));
    EXPECT_EQ(result(in), Value::uint32(5));
}

TEST_P(PortServices, ImageThatCannotBeReadIsNotAccessible) {
    EXPECT_EQ(result(arguments("file://" + (folder_ / "none.bin").string())), Value::uint32(4107));
    EXPECT_EQ(result(arguments("file://" + folder_.string())), Value::uint32(4107));
    EXPECT_EQ(result(arguments("http://host/fw.bin")), Value::uint32(4107));
}

TEST_P(PortServices, OptionsAreChecked) {
    NamedValues in = arguments(make_file("fw.bin"));
    if (GetParam().options.empty()) {
        in.set("InstallOptions", options({1}));
        EXPECT_EQ(result(in), Value::uint32(GetParam().usual)) << "it has no such argument";
        return;
    }
    for (const std::uint16_t option : GetParam().options) {
        in.set("InstallOptions", options({option}));
        EXPECT_EQ(result(in), Value::uint32(GetParam().usual)) << option;
    }
    in.set("InstallOptions", options({GetParam().options.front(), 9}));
    EXPECT_EQ(result(in), Value::uint32(5));
    in.set("InstallOptions", Value::uint16(4));
    EXPECT_EQ(refusal(in), "Parameter InstallOptions must be a uint16[]");
}

TEST_P(PortServices, ScenarioAnswersByTheFilesName) {
    play_with(table() + "match = 'bad'\nreturn_value = 4102\n" + table() +
              "match = 'worse'\nstatus = 1\nmessage = 'flash is locked'\n");
    EXPECT_EQ(result(arguments(make_file("good.bin"))), Value::uint32(GetParam().usual));
    EXPECT_EQ(result(arguments(make_file("bad.bin"))), Value::uint32(4102));
    EXPECT_EQ(install(arguments(make_file("worse.bin"))).status,
              (broker::Status{CMPI_RC_ERR_FAILED, "flash is locked"}));
}

TEST_P(PortServices, FaultsStrikeTheirSteps) {
    play_with(step("install") + "match = 'b.bin'\ncode = 2\nmessage = 'denied'\n" +
              step("adapters") + "match = '" + GetParam().port_class + "'\ncode = 1\n");
    EXPECT_EQ(result(arguments(make_file("a.bin"))), Value::uint32(GetParam().usual));
    EXPECT_EQ(install(arguments(make_file("b.bin"))).status,
              (broker::Status{CMPI_RC_ERR_ACCESS_DENIED, "denied"}));
    const auto path = of_class(GetParam().port_class);
    EXPECT_EQ(broker_.enumerate_instances(path).status.code, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(broker_.enumerate_instances(path).instances.size(), 2U);
    EXPECT_TRUE(scenario_->faults.unfired().empty());
}

TEST_P(PortServices, HostWithoutAdaptersHasTheServiceAlone) {
    play("[host]\nnode = 'node-7'");
    EXPECT_TRUE(broker_.enumerate_instances(of_class(GetParam().port_class)).instances.empty());
    EXPECT_EQ(result(arguments(make_file("fw.bin"))), Value::uint32(5));
}

// clang-format off
INSTANTIATE_TEST_SUITE_P(
    Every, PortServices,
    ::testing::Values(
        Service{"EmulexFc", "emulex_fc", "root/emulex", "ELXHBA_SoftwareInstallationService",
                "ELXHBA_FCSoftwareInstallationService", "OMC_UnitaryComputerSystem",
                "ELXHBA_FCPort", "fc_ports", {}, 0},
        Service{"EmulexCna", "emulex_cna", "root/emulex", "ELXUCNA_SoftwareInstallationService",
                "ELXUCNA_SoftwareInstallationService", "OMC_UnitaryComputerSystem",
                "ELXUCNA_EthernetPort", "nic_ports", {}, 0},
        Service{"QlogicNic", "qlogic", "qlogic/cimv2", "QLogic_NIC_SoftwareInstallationService",
                "CNA_SW_INSTALLER", "QLogic_Adapter_ComputerSystem",
                "QLogic_NIC_PortController", "nic_ports", {32768}, 4096},
        Service{"QlogicFc", "qlogic", "qlogic/cimv2", "QLogic_FCHBA_SoftwareInstallationService",
                "CNA_SW_INSTALLER", "QLogic_Adapter_ComputerSystem",
                "QLogic_FCHBA_PortController", "fc_ports", {32768}, 4096},
        Service{"Brocade", "brocade", "root/brocade", "BROCADE_HBASoftwareInstallationService",
                "Brocade Adapter Software Update Service", "BROCADE_ComputerSystem",
                "BROCADE_PortController", "fc_ports", {4, 5}, 0}),
    [](const auto &about) { return about.param.name; });
// clang-format on

}  // namespace
}  // namespace velkhost::providers::testing
