// The project's own MOF: it compiles, and its classes have the keys and the method signatures that
// the providers and their clients rely on.
#include "host/cim/value.h"
#include "mof_testing.h"

#include <gmock/gmock.h>

namespace velkhost::mof::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::UnorderedElementsAre;
using Texts = std::vector<std::string>;

std::filesystem::path in_folder(const std::string &file) {
    return std::filesystem::path{VELK_MOF_DIR} / file;
}

// The one namespace of a file of the project.
NamespaceUnit compiled(const std::string &file) {
    CompileResult result = compile_file(in_folder(file));
    EXPECT_TRUE(result.ok()) << result.error_text();
    EXPECT_EQ(result.units.size(), 1U);
    return result.units.empty() ? NamespaceUnit{} : std::move(result.units.front());
}

Texts class_names(const NamespaceUnit &unit) {
    Texts names;
    for (const cim::ClassDecl &each : unit.classes) {
        names.push_back(each.name);
    }
    return names;
}

// Keys, those of the superclasses first.
Texts keys_of(const NamespaceUnit &unit, const std::string &name) {
    const cim::ClassDecl &declared = find_class(unit, name);
    Texts keys = declared.superclass.empty() ? Texts{} : keys_of(unit, declared.superclass);
    for (const cim::PropertyDecl &property : declared.properties) {
        if (property.is_key()) {
            keys.push_back(property.name);
        }
    }
    return keys;
}

std::string spelling(const cim::TypeDecl &type) {
    return type.type == CMPI_ref ? type.reference_class + " REF" : cim::type_name(type.type);
}

// "uint32 Run(in string Uri, out CIM_Job REF Job)"
Texts methods_of(const NamespaceUnit &unit, const std::string &name) {
    Texts signatures;
    for (const cim::MethodDecl &method : find_class(unit, name).methods) {
        std::string text = spelling(method.return_type) + " " + method.name + "(";
        for (const cim::ParameterDecl &parameter : method.parameters) {
            text += text.back() == '(' ? "" : ", ";
            text += parameter.is_in() ? "in" : "";
            text += parameter.is_out() ? "out" : "";
            text += " " + spelling(parameter.type) + " " + parameter.name;
        }
        signatures.push_back(text + ")");
    }
    return signatures;
}

Texts properties_of(const NamespaceUnit &unit, const std::string &name) {
    Texts properties;
    for (const cim::PropertyDecl &property : find_class(unit, name).properties) {
        properties.push_back(spelling(property.type) + " " + property.name);
    }
    return properties;
}

Texts value_map(const std::vector<cim::Qualifier> &qualifiers) {
    const cim::Qualifier *map = cim::find_qualifier(qualifiers, "ValueMap");
    const cim::Qualifier *values = cim::find_qualifier(qualifiers, "Values");
    EXPECT_TRUE(map != nullptr && values != nullptr);
    if (map == nullptr || values == nullptr) {
        return {};
    }
    EXPECT_EQ(map->values.size(), values->values.size());
    return map->values;
}

class MofProject : public ::testing::Test {
  protected:
    NamespaceUnit velk_ = compiled("velk_cimv2.mof");
    NamespaceUnit zeb_ = compiled("zeb_cimv2.mof");
    NamespaceUnit emulex_ = compiled("root_emulex.mof");
    NamespaceUnit qlogic_ = compiled("qlogic_cimv2.mof");
    NamespaceUnit brocade_ = compiled("root_brocade.mof");
    NamespaceUnit broadcom_ = compiled("brcmfwup_cimv2.mof");
    NamespaceUnit lsi_ = compiled("tavu_cimv2.mof");
    const Texts service_keys_{"SystemCreationClassName", "SystemName", "CreationClassName", "Name"};
};

TEST_F(MofProject, NamespacesHaveTheirClasses) {
    EXPECT_EQ(velk_.name_space, "velk/cimv2");
    EXPECT_THAT(class_names(velk_),
                ElementsAre("CIM_Service", "CIM_SoftwareInstallationService", "CIM_ConcreteJob",
                            "ZEB_ConcreteJob", "PAKRO_VMpkgInstallationService"));
    EXPECT_EQ(zeb_.name_space, "zeb/cimv2");
    EXPECT_THAT(class_names(zeb_),
                ElementsAre("CIM_Service", "CIM_SoftwareInstallationService", "CIM_ConcreteJob",
                            "ZEB_SoftwareInstallationJob", "ZEB_SoftwareInstallationService",
                            "ZEB_FileTransferJob", "ZEB_FileTransferService"));
}

TEST_F(MofProject, ServicesHaveTheFourKeysOfAService) {
    EXPECT_EQ(keys_of(velk_, "PAKRO_VMpkgInstallationService"), service_keys_);
    EXPECT_EQ(keys_of(zeb_, "ZEB_SoftwareInstallationService"), service_keys_);
    EXPECT_EQ(keys_of(zeb_, "ZEB_FileTransferService"), service_keys_);
    for (const auto &[unit, name] : {std::pair{&emulex_, "ELXHBA_SoftwareInstallationService"},
                                     std::pair{&emulex_, "ELXUCNA_SoftwareInstallationService"},
                                     std::pair{&qlogic_, "QLogic_NIC_SoftwareInstallationService"},
                                     std::pair{&brocade_, "BROCADE_HBASoftwareInstallationService"},
                                     std::pair{&broadcom_, "BRCMFWUP_SoftwareInstallationService"},
                                     std::pair{&lsi_, "TAVU_SoftwareInstallationService"}}) {
        EXPECT_EQ(keys_of(*unit, name), service_keys_) << name;
    }
    EXPECT_EQ(find_class(velk_, "PAKRO_VMpkgInstallationService").superclass,
              "CIM_SoftwareInstallationService");
}

TEST_F(MofProject, JobsAreKeyedByInstanceId) {
    EXPECT_THAT(keys_of(velk_, "ZEB_ConcreteJob"), ElementsAre("InstanceID"));
    EXPECT_THAT(keys_of(zeb_, "ZEB_SoftwareInstallationJob"), ElementsAre("InstanceID"));
    EXPECT_THAT(keys_of(zeb_, "ZEB_FileTransferJob"), ElementsAre("InstanceID"));
}

TEST_F(MofProject, JobHasThePropertiesThatClientsFollow) {
    EXPECT_THAT(properties_of(velk_, "CIM_ConcreteJob"),
                UnorderedElementsAre("string InstanceID", "string Name", "uint16 JobState",
                                     "string JobStatus", "uint16 PercentComplete",
                                     "datetime StartTime", "datetime ElapsedTime",
                                     "datetime TimeOfLastStateChange", "boolean DeleteOnCompletion",
                                     "datetime TimeBeforeRemoval", "uint16[] OperationalStatus"));
}

TEST_F(MofProject, ControllerJobTellsWhatWasAskedFor) {
    EXPECT_THAT(
        properties_of(zeb_, "ZEB_SoftwareInstallationJob"),
        UnorderedElementsAre("string URI", "uint8 Update_Operation", "uint8 reboot_option"));
}

TEST_F(MofProject, JobStatesAreNamed) {
    const cim::ClassDecl &job = find_class(velk_, "CIM_ConcreteJob");
    const cim::PropertyDecl &state = job.properties[2];
    ASSERT_EQ(state.name, "JobState");
    EXPECT_THAT(value_map(state.qualifiers),
                ElementsAre("2", "3", "4", "5", "6", "7", "8", "9", "10", "11", "12"));
    const auto &names = cim::find_qualifier(state.qualifiers, "Values")->values;
    EXPECT_EQ(names[2], "Running");
    EXPECT_EQ(names[5], "Completed");
    EXPECT_EQ(names[8], "Exception");
}

TEST_F(MofProject, InstallationServiceHasItsMethods) {
    EXPECT_THAT(methods_of(velk_, "PAKRO_VMpkgInstallationService"),
                ElementsAre("uint32 InstallFromURI(in string URI, in uint16[] InstallOptions, "
                            "in string UpdateArgs, out ZEB_ConcreteJob REF Job)",
                            "uint32 ResetCimmon()", "uint32 DeleteVELKDebugLogFile()"));
}

TEST_F(MofProject, InstallationResultsAndOptionsAreNamed) {
    const cim::MethodDecl &install =
        find_class(velk_, "PAKRO_VMpkgInstallationService").methods.front();
    EXPECT_THAT(value_map(install.qualifiers), ElementsAre("1", "3", "4096"));
    EXPECT_THAT(value_map(install.parameters[1].qualifiers), ElementsAre("32768", "32769"));
}

TEST_F(MofProject, ControllerServiceHasItsMethod) {
    EXPECT_THAT(methods_of(zeb_, "ZEB_SoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in string URI, in uint8 Update_Operation, "
                            "in uint8 reboot_option, out ZEB_SoftwareInstallationJob REF Job)"));
}

TEST_F(MofProject, TransferServiceHasItsMethods) {
    EXPECT_THAT(methods_of(zeb_, "ZEB_FileTransferService"),
                ElementsAre("uint32 TransferViaTFTP(in string SourceURI, "
                            "in uint16[] TransferOptions, in uint16 BlockSize, "
                            "out string DestinationURI)",
                            "uint32 TransferViaURL(in string SourceURI, "
                            "in uint16[] TransferOptions, in uint16 BlockSize, "
                            "out string DestinationURI, out ZEB_FileTransferJob REF Job)",
                            "uint32 DeleteTransferredFile(in string FileURI)"));
}

TEST_F(MofProject, AdapterVendorsHaveTheirNamespaces) {
    EXPECT_EQ(emulex_.name_space, "root/emulex");
    EXPECT_EQ(qlogic_.name_space, "qlogic/cimv2");
    EXPECT_EQ(brocade_.name_space, "root/brocade");
    EXPECT_EQ(broadcom_.name_space, "brcmfwup/cimv2");
    EXPECT_EQ(lsi_.name_space, "tavu/cimv2");
}

TEST_F(MofProject, AdapterPartsHaveTheirKeys) {
    const Texts device_keys{"SystemCreationClassName", "SystemName", "CreationClassName",
                            "DeviceID"};
    EXPECT_EQ(keys_of(emulex_, "ELXHBA_FCPort"), device_keys);
    EXPECT_EQ(keys_of(emulex_, "ELXUCNA_EthernetPort"), device_keys);
    EXPECT_EQ(keys_of(qlogic_, "QLogic_NIC_PortController"), device_keys);
    EXPECT_EQ(keys_of(qlogic_, "QLogic_FCHBA_PortController"), device_keys);
    EXPECT_EQ(keys_of(brocade_, "BROCADE_PortController"), device_keys);
    EXPECT_THAT(keys_of(emulex_, "ELXUCNA_Card"), ElementsAre("Tag", "CreationClassName"));
    EXPECT_THAT(keys_of(emulex_, "ELXHBA_VitalProductData"), ElementsAre("InstanceID"));
    EXPECT_THAT(keys_of(emulex_, "ELXUCNA_Realizes"), ElementsAre("Antecedent", "Dependent"));
    EXPECT_THAT(keys_of(emulex_, "ELXUCNA_Container"),
                ElementsAre("GroupComponent", "PartComponent"));
    EXPECT_THAT(keys_of(qlogic_, "QLogic_NIC_PhysicalPackagePortController"),
                ElementsAre("Antecedent", "Dependent"));
    EXPECT_THAT(keys_of(qlogic_, "QLogic_SoftwareInstallationJob"), ElementsAre("InstanceID"));
}

TEST_F(MofProject, AdapterServicesHaveTheirMethods) {
    EXPECT_THAT(methods_of(emulex_, "ELXHBA_SoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in ELXHBA_FCPort REF Target, in string URI)"));
    EXPECT_THAT(
        methods_of(emulex_, "ELXUCNA_SoftwareInstallationService"),
        ElementsAre("uint32 InstallFromURI(in ELXUCNA_EthernetPort REF Target, in string URI)"));
    EXPECT_THAT(methods_of(brocade_, "BROCADE_HBASoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in uint16[] InstallOptions, "
                            "in BROCADE_PortController REF Target, in string URI)"));
    EXPECT_THAT(methods_of(qlogic_, "QLogic_NIC_SoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in uint16[] InstallOptions, "
                            "in QLogic_NIC_PortController REF Target, in string URI, "
                            "out QLogic_SoftwareInstallationJob REF Job)"));
    EXPECT_THAT(methods_of(qlogic_, "QLogic_FCHBA_SoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in uint16[] InstallOptions, "
                            "in QLogic_FCHBA_PortController REF Target, in string URI, "
                            "out QLogic_SoftwareInstallationJob REF Job)"));
    EXPECT_THAT(methods_of(broadcom_, "BRCMFWUP_SoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in string URI, in string FacadeOption)",
                            "uint32 CheckStatus(in string ID, out uint32 status)"));
    EXPECT_THAT(methods_of(lsi_, "TAVU_SoftwareInstallationService"),
                ElementsAre("uint32 InstallFromURI(in string URI)"));
}

TEST_F(MofProject, EveryQualifierInUseIsDeclared) {
    const auto declared = [](const NamespaceUnit &unit, const cim::Qualifier &used) {
        return std::any_of(unit.qualifiers.begin(), unit.qualifiers.end(),
                           [&used](const QualifierDecl &each) { return each.name == used.name; });
    };
    for (const NamespaceUnit *unit :
         {&velk_, &zeb_, &emulex_, &qlogic_, &brocade_, &broadcom_, &lsi_}) {
        for (const cim::ClassDecl &each : unit->classes) {
            for (const cim::PropertyDecl &property : each.properties) {
                for (const cim::Qualifier &used : property.qualifiers) {
                    EXPECT_TRUE(declared(*unit, used)) << used.name;
                }
            }
            for (const cim::Qualifier &used : each.qualifiers) {
                EXPECT_TRUE(declared(*unit, used)) << used.name;
            }
        }
    }
}

TEST_F(MofProject, RegistrationNamesTheClassItsProviderAndLibrary) {
    std::ifstream file{in_folder("registration/velkprovider.reg")};
    const std::string text{std::istreambuf_iterator<char>{file}, {}};
    EXPECT_EQ(text,
              "[PAKRO_VMpkgInstallationService]\n"
              "   provider: ZEB_VMWarePackageInstallationProvider\n"
              "   location: velkprovider\n"
              "   type: instance method\n"
              "   namespace: velk/cimv2\n"
              "#\n");
}

}  // namespace
}  // namespace velkhost::mof::testing
