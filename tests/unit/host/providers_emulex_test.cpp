// What the Emulex provider shows of adapters.
#include "providers_adapter_fixture.h"

namespace velkhost::providers::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

class EmulexProvider : public AdapterProvider {
  protected:
    static cim::ObjectPath of(const std::string &name) { return class_path("root/emulex", name); }

    void play_converged(const std::string &keys) {
        play(
            "[[adapter]]\nfamily = 'emulex_cna'\nname = 'CNA'\ndfn = ' PN1 '\nserial = 'S1'\n"
            "nic_ports = ['p1', 'p2']\n" +
            keys);
    }
    // The connectors that a port leads to.
    broker::InstancesReply connectors(std::size_t port = 0) {
        return associated(path_at(of("ELXUCNA_EthernetPort"), port), "CIM_Realizes",
                          "ELXUCNA_PhysicalConnector");
    }
    // The cards behind the first connector.
    broker::InstancesReply cards() {
        return associated(path_at(of("ELXUCNA_PhysicalConnector")), "CIM_Container",
                          "ELXUCNA_Card");
    }
};

TEST_F(EmulexProvider, VitalProductDataBearsEachPortsDeviceId) {
    play(
        "[[adapter]]\nfamily = 'emulex_fc'\ndfn = 'LP1'\nserial = 'S1'\nfc_ports = ['a', 'b']\n"
        "[[adapter]]\nfamily = 'emulex_fc'\nfc_ports = ['c']\n"
        "[[adapter]]\nfamily = 'brocade'\nfc_ports = ['d']\n");
    const auto data = of("ELXHBA_VitalProductData");
    EXPECT_THAT(texts(data, "InstanceID"), ElementsAre("a", "b", "c"));
    EXPECT_THAT(texts(data, "FieldV2"), ElementsAre("LP1", "LP1", "(none)"));
    EXPECT_THAT(texts(of("ELXHBA_FCPort"), "DeviceID"), ElementsAre("a", "b", "c"));
}

TEST_F(EmulexProvider, PortsOfAnAdapterHaveTheirFirstIdentifierInCommon) {
    play_converged("");
    const auto ports = broker_.enumerate_instances(of("ELXUCNA_EthernetPort"));
    ASSERT_EQ(ports.instances.size(), 2U);
    for (const cim::Instance &port : ports.instances) {
        const cim::Value *info = port.properties.find("OtherIdentifyingInfo");
        ASSERT_TRUE(info != nullptr && info->as_array() != nullptr);
        EXPECT_EQ(info->as_array()->at(0), cim::Value::string("S1"));
    }
    EXPECT_THAT(texts_of(ports, "InstanceID"), ElementsAre("ELXUCNA:p1", "ELXUCNA:p2"));
}

TEST_F(EmulexProvider, AdapterWithoutSerialNumberHasNoIdentifier) {
    play("[[adapter]]\nfamily = 'emulex_cna'\nnic_ports = ['p1']");
    const auto ports = broker_.enumerate_instances(of("ELXUCNA_EthernetPort"));
    const cim::Value *info = ports.instances.at(0).properties.find("OtherIdentifyingInfo");
    EXPECT_TRUE(info == nullptr || info->is_null());
}

TEST_F(EmulexProvider, PortLeadsToItsConnectorAndFromThereToTheCard) {
    play_converged("");
    EXPECT_THAT(texts_of(connectors(0), "Tag"), ElementsAre("emulex_cna:1/port0"));
    EXPECT_THAT(texts_of(connectors(1), "Tag"), ElementsAre("emulex_cna:1/port1"));
    EXPECT_THAT(texts_of(cards(), "PartNumber"), ElementsAre(" PN1 "));
}

TEST_F(EmulexProvider, WalkStopsWhereConnectorsOrCardAreNotShown) {
    play_converged("card = false");
    EXPECT_EQ(connectors().instances.size(), 1U);
    EXPECT_THAT(cards().instances, IsEmpty());
    EXPECT_TRUE(cards().status.ok());
    play_converged("connectors = false");
    EXPECT_THAT(connectors().instances, IsEmpty());
    EXPECT_TRUE(connectors().status.ok());
}

TEST_F(EmulexProvider, TraversalHeedsClassesAndRoles) {
    play_converged("");
    const auto port = path_at(of("ELXUCNA_EthernetPort"));
    const auto count = [&](const char *association, const char *result_class, const char *role,
                           const char *result_role) {
        const auto reply =
            broker_.associators(port, {association, result_class, role, result_role, {}});
        EXPECT_TRUE(reply.status.ok()) << reply.status.message;
        return reply.instances.size();
    };
    EXPECT_EQ(count("", "", "", ""), 1U);
    EXPECT_EQ(count("elxucna_realizes", "", "", ""), 1U);
    EXPECT_EQ(count("CIM_Container", "", "", ""), 0U);
    EXPECT_EQ(count("", "CIM_PhysicalElement", "", ""), 1U);
    EXPECT_EQ(count("", "ELXUCNA_Card", "", ""), 0U);
    EXPECT_EQ(count("", "", "dependent", "Antecedent"), 1U);
    EXPECT_EQ(count("", "", "Antecedent", ""), 0U);
    EXPECT_EQ(count("", "", "", "Dependent"), 0U);
}

TEST_F(EmulexProvider, LinksAreInstancesThatCanBeRead) {
    play_converged("");
    const auto links = broker_.enumerate_instances(of("ELXUCNA_Realizes"));
    ASSERT_EQ(links.instances.size(), 2U);
    const auto one = broker_.get_instance(links.instances[1].path);
    ASSERT_TRUE(one.status.ok()) << one.status.message;
    EXPECT_EQ(one.instance->path, links.instances[1].path);
    const auto port = path_at(of("ELXUCNA_EthernetPort"), 1);
    const auto references = broker_.references(port, {"", "CIM_Realizes", "", "", {}});
    ASSERT_EQ(references.instances.size(), 1U);
    EXPECT_EQ(references.instances[0].path, links.instances[1].path);
    EXPECT_EQ(broker_.reference_names(port, {"", "", "Dependent", "", {}}).paths.size(), 1U);
    EXPECT_EQ(broker_.reference_names(port, {"", "", "Antecedent", "", {}}).paths.size(), 0U);
    EXPECT_EQ(broker_.associator_names(port).paths.size(), 1U);
}

TEST_F(EmulexProvider, LinkOfAnotherPortIsNotFound) {
    play_converged("");
    const auto links = broker_.enumerate_instance_names(of("ELXUCNA_Realizes"));
    ASSERT_EQ(links.paths.size(), 2U);
    cim::ObjectPath mixed = links.paths[0];
    mixed.keys.set("Dependent", *links.paths[1].keys.find("Dependent"));
    EXPECT_EQ(broker_.get_instance(mixed).status.code, CMPI_RC_ERR_NOT_FOUND);
    mixed.keys.set("Dependent", cim::Value::string("p1"));
    EXPECT_EQ(broker_.get_instance(mixed).status.code, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(EmulexProvider, UnknownPortLeadsNowhere) {
    play_converged("");
    auto port = path_at(of("ELXUCNA_EthernetPort"));
    port.keys.set("DeviceID", cim::Value::string("p9"));
    EXPECT_THAT(broker_.associators(port).instances, IsEmpty());
}

TEST_F(EmulexProvider, FaultStrikesATraversal) {
    play_converged(
        "[[fault]]\nstep = 'emulex_cna.adapters'\nmatch = 'Realizes'\ncode = 1\nmessage = 'x'");
    EXPECT_EQ(connectors().status, (broker::Status{CMPI_RC_ERR_FAILED, "x"}));
    EXPECT_EQ(connectors().instances.size(), 1U);
}

}  // namespace
}  // namespace velkhost::providers::testing
