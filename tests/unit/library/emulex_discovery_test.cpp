// Which Emulex adapters are found.
#include "installers/Emulex_update.h"
#include "tests/unit/library/adapter_families.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;
using Texts = std::vector<std::string>;

// ---- Fibre Channel: the ports' vital product data ----

class EmulexFcDiscovery : public AdapterTest {
  protected:
    void discover() {
        in_request([](const CMPIContext *context) { get_elxfc_dfn_devid(0, context); });
    }

    std::vector<VendorInstance> &records() { return vendor("ELXHBA_VitalProductData").instances; }

    static VendorInstance record(const std::string &dfn, const std::string &device) {
        return {{}, {{"FieldV2", text(dfn)}, {"InstanceID", text(device)}}};
    }
};

TEST_F(EmulexFcDiscovery, EachRecordIsAnAdapter) {
    records() = {record("DFN-A", "d1"), record("DFN-B", "d2"), record("DFN-A", "d1")};
    package().dfnnumber = 7;
    discover();
    EXPECT_THAT(devices(), ElementsAre("DFN-A on d1", "DFN-B on d2", "DFN-A on d1"))
        << "equal ones are kept";
    EXPECT_EQ(log(), entries({"--> get_elxfc_dfn_devid.\n", "DFN = DFN-A, DeviceID = d1\n",
                              "DFN = DFN-B, DeviceID = d2\n", "DFN = DFN-A, DeviceID = d1\n",
                              "<-- get_elxfc_dfn_devid.\n"}));
    EXPECT_THAT(up_calls(),
                ElementsAre("enumerateInstances root/emulex:ELXHBA_VitalProductData()"));
}

TEST_F(EmulexFcDiscovery, BothTextsMustBeThere) {
    records() = {{{}, {{"FieldV2", text("DFN-A")}}},
                 {{}, {{"InstanceID", text("d1")}}},
                 {{}, {{"FieldV2", Value::null(CMPI_string)}, {"InstanceID", text("d1")}}},
                 {{}, {{"FieldV2", Value::uint32(5)}, {"InstanceID", text("d1")}}},
                 {{}, {}}};
    discover();
    EXPECT_THAT(devices(), IsEmpty());
    EXPECT_EQ(logged("DFN = "), 0);
}

TEST_F(EmulexFcDiscovery, DfnIsTakenAsItIs) {
    records() = {record(" DFN-A ", "d1")};
    discover();
    EXPECT_THAT(devices(), ElementsAre(" DFN-A  on d1")) << "blanks are not trimmed here";
}

TEST_F(EmulexFcDiscovery, FiftyFirstIsLeftOut) {
    for (int i = 0; i < velk::kMaxDevices + 1; ++i) {
        records().push_back(record("DFN-A", "d" + std::to_string(i)));
    }
    const std::string payloads(400, '\0');
    discover();
    EXPECT_EQ(package().dfnnumber, velk::kMaxDevices);
    EXPECT_EQ(devices().back(), "DFN-A on d49");
    EXPECT_STREQ(package().PayloadDeviceIDArray[0].PayloadPath, "");
}

TEST_F(EmulexFcDiscovery, LongTextsAreCut) {
    for (const std::size_t length : {199U, 200U, 1023U}) {
        records() = {record(std::string(length, 'f'), std::string(length, 'd')), record("x", "y")};
        discover();
        EXPECT_THAT(devices(),
                    ElementsAre(std::string(199, 'f') + " on " + std::string(199, 'd'), "x on y"));
    }
}

TEST_F(EmulexFcDiscovery, FailedEnumerationFindsNone) {
    package().dfnnumber = 7;
    fail_service("broker.enumerateInstances", "ELXHBA_VitalProductData", CMPI_RC_ERR_FAILED);
    discover();
    EXPECT_EQ(package().dfnnumber, 0);
    EXPECT_EQ(log(),
              entry("--> get_elxfc_dfn_devid.\n") + entry("enumerateInstances() returns NULL.\n"));
}

TEST_F(EmulexFcDiscovery, WithoutAPathNoneIsFound) {
    fail_service("broker.newObjectPath", "ELXHBA_VitalProductData", CMPI_RC_ERR_FAILED);
    discover();
    EXPECT_EQ(logged("enumerateInstances() returns NULL.\n"), 1);
}

// ---- Converged: from the port over its connector to the card ----

class EmulexCnaDiscovery : public AdapterTest {
  protected:
    void discover() {
        in_request([](const CMPIContext *context) { get_elxcna_dfn_devid(0, context); });
    }

    std::vector<VendorInstance> &ports() { return vendor("ELXUCNA_EthernetPort").instances; }
    auto &connectors_of(const std::string &port) { return vendor("CIM_Realizes").linked[port]; }
    auto &cards_of(const std::string &connector) {
        return vendor("CIM_Container").linked[connector];
    }

    static VendorInstance connector(const std::string &tag) { return {{{"Tag", text(tag)}}, {}}; }

    // A port with a connector and a card of its own.
    void add_adapter(const std::string &device, const std::string &adapter,
                     const std::string &part_number) {
        ports().push_back(elx_port(device, adapter));
        connectors_of(device) = {connector("connector of " + device)};
        cards_of("connector of " + device) = {elx_card("card of " + device, part_number)};
    }
};

TEST_F(EmulexCnaDiscovery, PortLeadsToItsCard) {
    add_adapter("d1", "adapter-1", "  PN-1\t");
    discover();
    EXPECT_THAT(devices(), ElementsAre("PN-1 on d1"));
    EXPECT_EQ(
        log(),
        entries({"--> get_elxcna_dfn_devid\n", "enumerateInstances() returns NOT NULL.\n",
                 "ELXUCNA_EthernetPort.InstanceID = port of d1\n",
                 "ELXUCNA_EthernetPort.OtherIdentifyingInfo[0] = adapter-1\n",
                 "ELXUCNA_PhysicalConnector instance found.\n", "ELXUCNA_Card instance found.\n",
                 "DFN raw data from elx provider is \"  PN-1\t\", to trim it.\n",
                 "DFN after trim is \"PN-1\"\n", "DFN = PN-1, DeviceID = d1\n"}) +
            "\npkgInstance[pkg_idx].dfnnumber = 1\n" + entry("<-- get_elxcna_dfn_devid\n"));
    EXPECT_THAT(up_calls(),
                ElementsAre("enumerateInstances root/emulex:ELXUCNA_EthernetPort()",
                            "associators root/emulex:ELXUCNA_EthernetPort.CIM_Realizes"
                            "(DeviceID=\"d1\")",
                            "associators root/emulex:ELXUCNA_PhysicalConnector.CIM_Container"
                            "(Tag=\"connector of d1\")"));
}

TEST_F(EmulexCnaDiscovery, PortsOfOneAdapterAreWalkedOnce) {
    add_adapter("d1", "adapter-1", "PN-1");
    add_adapter("d2", "adapter-1", "PN-1");
    add_adapter("d3", "adapter-2", "PN-2");
    add_adapter("d4", "adapter-1", "PN-1");
    discover();
    EXPECT_THAT(devices(), ElementsAre("PN-1 on d1", "PN-2 on d3")) << "with the first port's id";
}

TEST_F(EmulexCnaDiscovery, AdaptersAreToldApartByLetterCase) {
    add_adapter("d1", "adapter-a", "PN-1");
    add_adapter("d2", "ADAPTER-A", "PN-1");
    discover();
    EXPECT_THAT(devices(), ElementsAre("PN-1 on d1", "PN-1 on d2"));
}

TEST_F(EmulexCnaDiscovery, LongIdentifiersAreComparedAsFarAsTheyAreKept) {
    for (const std::size_t length : {255U, 256U, 1023U}) {
        ports().clear();
        const std::string identifier(length, 'i');
        add_adapter("d1", identifier, "PN-1");
        add_adapter("d2", identifier, "PN-1");
        discover();
        EXPECT_THAT(devices(), ElementsAre("PN-1 on d1")) << length;
    }
}

TEST_F(EmulexCnaDiscovery, PortWithoutAnIdentifierIsPassed) {
    add_adapter("d1", "adapter-1", "PN-1");
    for (const Value &info :
         {texts({}), Value::null(CMPI_stringA), text("adapter-9"),
          Value::array(CMPI_string, {Value::null(CMPI_string), text("second")})}) {
        ports().push_back({{{"DeviceID", text("d1")}}, {{"OtherIdentifyingInfo", info}}});
    }
    ports().push_back({{{"DeviceID", text("d1")}}, {}});
    discover();
    EXPECT_THAT(devices(), ElementsAre("PN-1 on d1"));
    EXPECT_EQ(logged("ELXUCNA_EthernetPort.OtherIdentifyingInfo[0] = \n"), 5);
    EXPECT_EQ(up_calls().size(), 3U);
}

TEST_F(EmulexCnaDiscovery, AdapterThatLeadsNowhereAddsNothing) {
    struct {
        const char *name;
        const char *line;
    } const cases[] = {
        {"no connectors", "Association to ELXUCNA_PhysicalConnector returned NULL.\n"},
        {"no connector", nullptr},
        {"no cards", "Association to ELXUCNA_Card returned NULL.\n"},
        {"no card", "Association to ELXUCNA_Card returned empty result.\n"},
    };
    for (const auto &row : cases) {
        add_adapter(row.name, row.name, "PN");
    }
    connectors_of("no connectors") = std::nullopt;
    connectors_of("no connector")->clear();
    cards_of("connector of no cards") = std::nullopt;
    cards_of("connector of no card")->clear();
    add_adapter("d1", "adapter-1", "PN-1");
    discover();
    EXPECT_THAT(devices(), ElementsAre("PN-1 on d1")) << "the walk goes on";
    for (const auto &row : cases) {
        if (row.line != nullptr) {
            EXPECT_EQ(logged(row.line), 1) << row.name;
        }
    }
}

TEST_F(EmulexCnaDiscovery, EveryConnectorAndEveryCardIsWalked) {
    ports() = {elx_port("d1", "adapter-1")};
    connectors_of("d1") = {connector("c1"), connector("c2")};
    cards_of("c1") = {elx_card("a", "PN-1"), elx_card("b", "PN-2")};
    cards_of("c2") = {elx_card("c", "PN-3")};
    discover();
    EXPECT_THAT(devices(), ElementsAre("PN-1 on d1", "PN-2 on d1", "PN-3 on d1"));
}

TEST_F(EmulexCnaDiscovery, MissingTextsReadAsEmpty) {
    add_adapter("d1", "adapter-1", "PN-1");
    cards_of("connector of d1") = {VendorInstance{{{"Tag", text("card")}}, {}}};
    ports() = {{{{"Name", text("d1")}}, {{"OtherIdentifyingInfo", texts({"adapter-1"})}}}};
    discover();
    EXPECT_THAT(devices(), ElementsAre(" on "));
}

TEST_F(EmulexCnaDiscovery, FiftyFirstIsLeftOut) {
    for (int i = 0; i < velk::kMaxDevices + 1; ++i) {
        const std::string number = std::to_string(i);
        add_adapter("d" + number, "adapter-" + number, "PN");
    }
    discover();
    EXPECT_EQ(package().dfnnumber, velk::kMaxDevices);
    EXPECT_EQ(devices().back(), "PN on d49");
    EXPECT_STREQ(package().PayloadDeviceIDArray[0].PayloadPath, "");
}

TEST_F(EmulexCnaDiscovery, FailedEnumerationFindsNone) {
    package().dfnnumber = 7;
    fail_service("broker.enumerateInstances", "ELXUCNA_EthernetPort", CMPI_RC_ERR_FAILED);
    discover();
    EXPECT_EQ(log(),
              entries({"--> get_elxcna_dfn_devid\n", "enumerateInstances() returns NULL.\n"}) +
                  "\npkgInstance[pkg_idx].dfnnumber = 0\n" + entry("<-- get_elxcna_dfn_devid\n"));
}

TEST_F(EmulexCnaDiscovery, IndexOutsideOfTheTableFindsNone) {
    add_adapter("d1", "adapter-1", "PN-1");
    const std::string before = session_image();
    in_request([](const CMPIContext *context) {
        for (const int index : {-1, velk::kMaxPackages}) {
            get_elxfc_dfn_devid(index, context);
            get_elxcna_dfn_devid(index, context);
        }
    });
    EXPECT_EQ(session_image(), before);
    EXPECT_THAT(up_calls(), IsEmpty());
}

}  // namespace
}  // namespace velktest
