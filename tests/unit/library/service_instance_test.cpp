// The one instance that the provider describes.

#include <array>

#include "host/shim/velkshim.h"
#include "tests/unit/library/request_fixture.h"

namespace {

using velktest::entry;
namespace cim = velkhost::cim;

class ServiceInstance : public velktest::RequestTest {
  protected:
    ServiceInstance() { velkshim_set_node_name("esx-17.example"); }
    void TearDown() override { velkshim_set_node_name(nullptr); }

    static cim::NamedValues texts(const std::string &name,
                                  const std::string &node = "esx-17.example") {
        return {{"SystemCreationClassName", cim::Value::string("CIM_ComputerSystem")},
                {"SystemName", cim::Value::string(node)},
                {"CreationClassName", cim::Value::string("ZEB_PackageInstallationBroker")},
                {"Name", cim::Value::string(name)}};
    }

    static constexpr const char *kName = "ZEB:PackageInstallationBroker";
    static constexpr const char *kNameInPath = "ZEB:ZEB_PackageInstallationBroker";
};

const std::string kEnumerated =
    entry("Complete ZEB_VMWarePackageInstallationProviderEnumInstances.\n");

}  // namespace

TEST_F(ServiceInstance, EnumerationYieldsTheOneInstance) {
    const auto reply = broker().enumerate_instances(path());
    ASSERT_TRUE(reply.status.ok());
    ASSERT_EQ(reply.instances.size(), 1U);
    EXPECT_EQ(reply.instances[0].properties, texts(kName));
    EXPECT_EQ(reply.instances[0].path.class_name, kClass);
    EXPECT_EQ(reply.instances[0].path.name_space, kNamespace);
    EXPECT_EQ(log(),
              entry("Enter ZEB_VMWarePackageInstallationProviderEnumInstances.\n") + kEnumerated);
}

TEST_F(ServiceInstance, NamesYieldTheOnePathWithItsOtherName) {
    const auto reply = broker().enumerate_instance_names(path());
    ASSERT_TRUE(reply.status.ok());
    ASSERT_EQ(reply.paths.size(), 1U);
    EXPECT_EQ(reply.paths[0].keys, texts(kNameInPath));
    EXPECT_EQ(reply.paths[0].class_name, kClass);
    EXPECT_EQ(log(), entry("Enter ZEB_VMWarePackageInstallationProviderEnumInstanceNames.\n") +
                         kEnumerated);
}

TEST_F(ServiceInstance, AnyPathYieldsTheOneInstance) {
    for (const auto &keys : {cim::NamedValues{}, texts(kName), texts("else"),
                             cim::NamedValues{{"Unknown", cim::Value::uint32(7)}}}) {
        clear_log();
        cim::ObjectPath asked = path();
        asked.keys = keys;
        const auto reply = broker().get_instance(asked);
        ASSERT_TRUE(reply.status.ok() && reply.instance);
        EXPECT_EQ(reply.instance->properties, texts(kName));
        EXPECT_EQ(log(), entry("Enter ZEB_VMWarePackageInstallationProviderGetInstance.\n"));
    }
}

TEST_F(ServiceInstance, ClassAskedForDoesNotMatter) {
    const auto reply = broker().enumerate_instance_names(path(kOtherClass));
    ASSERT_EQ(reply.paths.size(), 1U);
    EXPECT_EQ(reply.paths[0].class_name, kClass);
}

TEST_F(ServiceInstance, BrokerThatMakesNothingStillGetsSuccess) {
    fail_service("broker.newObjectPath", kClass, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(broker().enumerate_instances(path()).status.ok());
    EXPECT_TRUE(broker().enumerate_instance_names(path()).status.ok());
    fail_service("broker.newInstance", kClass, CMPI_RC_ERR_FAILED);
    EXPECT_TRUE(broker().enumerate_instances(path()).status.ok());
}

TEST_F(ServiceInstance, LongestNodeNameIsGivenWhole) {
    const std::string node(64, 'n');
    velkshim_set_node_name(node.c_str());
    const auto reply = broker().enumerate_instances(path());
    ASSERT_EQ(reply.instances.size(), 1U);
    EXPECT_EQ(reply.instances[0].properties, texts(kName, node));
}

TEST_F(ServiceInstance, NodeNameIsCutToTheBufferWithoutATerminator) {
    for (const int length : {1, 13, 14, 15, 32}) {
        std::array<char, 40> buffer;
        buffer.fill('x');
        EXPECT_EQ(get_sys_name(buffer.data(), length), buffer.data());
        const std::string whole("esx-17.example\0", 15);
        const std::size_t copied =
            std::min<std::size_t>(whole.size(), static_cast<std::size_t>(length));
        EXPECT_EQ(std::string(buffer.data(), copied), whole.substr(0, copied)) << length;
        EXPECT_EQ(std::string(buffer.data() + copied, buffer.size() - copied),
                  std::string(buffer.size() - copied, 'x'));
    }
}

TEST_F(ServiceInstance, BufferOfNoSizeIsReturnedAsItIs) {
    char byte = 'x';
    EXPECT_EQ(get_sys_name(&byte, 0), &byte);
    EXPECT_EQ(get_sys_name(&byte, -1), &byte);
    EXPECT_EQ(byte, 'x');
    EXPECT_EQ(get_sys_name(nullptr, 64), nullptr);
}
