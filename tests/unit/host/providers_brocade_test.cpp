// What the Brocade provider shows of adapters.
#include "providers_adapter_fixture.h"

namespace velkhost::providers::testing {
namespace {

using ::testing::ElementsAre;

class BrocadeProvider : public AdapterProvider {
  protected:
    static cim::ObjectPath of(const std::string &name) { return class_path("root/brocade", name); }
};

TEST_F(BrocadeProvider, PortsBearTheSerialNumberOfTheirAdapter) {
    play(
        "[[adapter]]\nfamily = 'brocade'\ndfn = 'B1'\nserial = 'S1'\nfc_ports = ['a', 'b']\n"
        "[[adapter]]\nfamily = 'brocade'\ndfn = 'B2'\nserial = 'S2'\nfc_ports = ['c']\n");
    EXPECT_THAT(texts(of("BROCADE_PhysicalPackage"), "Model"), ElementsAre("B1", "B2"));
    EXPECT_THAT(texts(of("BROCADE_PhysicalPackage"), "SerialNumber"), ElementsAre("S1", "S2"));
    EXPECT_THAT(texts(of("BROCADE_PortController"), "Name"), ElementsAre("S1", "S1", "S2"));
    EXPECT_THAT(texts(of("BROCADE_PortController"), "DeviceID"), ElementsAre("a", "b", "c"));
}

TEST_F(BrocadeProvider, PortsCanBeNamedOtherwise) {
    play("[[adapter]]\nfamily = 'brocade'\nserial = 'S1'\nport_name = 's1'\nfc_ports = ['a']");
    EXPECT_THAT(texts(of("BROCADE_PortController"), "Name"), ElementsAre("s1"));
}

TEST_F(BrocadeProvider, PackagesAreReadByTheirTag) {
    play("[[adapter]]\nfamily = 'brocade'\nserial = 'S'\n[[adapter]]\nfamily = 'brocade'\n");
    EXPECT_THAT(texts(of("BROCADE_PhysicalPackage"), "Tag"), ElementsAre("brocade:1", "brocade:2"));
    const auto second = broker_.get_instance(path_at(of("BROCADE_PhysicalPackage"), 1));
    ASSERT_TRUE(second.instance.has_value()) << second.status.message;
    EXPECT_EQ(text(second.instance->properties, "SerialNumber"), "(none)");
}

}  // namespace
}  // namespace velkhost::providers::testing
