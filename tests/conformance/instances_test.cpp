// The one instance of the installation service, as clients of the broker read it.

#include "host/shim/velkshim.h"
#include "tests/conformance/conformance_test.h"

namespace {

using velktest::entry;
namespace cim = velktest::cim;

constexpr const char *kName = "ZEB:PackageInstallationBroker";
constexpr const char *kNameInPath = "ZEB:ZEB_PackageInstallationBroker";
constexpr const char *kNode = "esx-17.example";

const std::string kEnumerated =
    entry("Complete ZEB_VMWarePackageInstallationProviderEnumInstances.\n");

class ServiceInstance : public velktest::ConformanceTest {
  protected:
    ServiceInstance() {
        velkshim_set_node_name(kNode);
        host().clear_log();
    }
    ~ServiceInstance() override { velkshim_set_node_name(nullptr); }

    static cim::NamedValues texts(const std::string &name, const std::string &node = kNode) {
        return {{"SystemCreationClassName", cim::Value::string("CIM_ComputerSystem")},
                {"SystemName", cim::Value::string(node)},
                {"CreationClassName", cim::Value::string("ZEB_PackageInstallationBroker")},
                {"Name", cim::Value::string(name)}};
    }

    static std::vector<std::string> names_of(const cim::NamedValues &values) {
        std::vector<std::string> names;
        for (const cim::NamedValue &value : values) {
            names.push_back(value.name);
        }
        return names;
    }
};

const std::vector<std::string> kOrder = {"SystemCreationClassName", "SystemName",
                                         "CreationClassName", "Name"};

}  // namespace

TEST_F(ServiceInstance, EnumerationYieldsOneInstanceUnderItsShortName) {
    const auto reply = broker().enumerate_instances(host().service_path());
    ASSERT_TRUE(reply.status.ok()) << reply.status.message;
    ASSERT_EQ(reply.instances.size(), 1U);
    EXPECT_EQ(reply.instances[0].properties, texts(kName));
    EXPECT_EQ(names_of(reply.instances[0].properties), kOrder);
    EXPECT_EQ(reply.instances[0].path.class_name, "PAKRO_VMpkgInstallationService");
    EXPECT_EQ(reply.instances[0].path.name_space, "velk/cimv2");
}

TEST_F(ServiceInstance, NamesYieldOnePathUnderItsLongName) {
    const auto reply = broker().enumerate_instance_names(host().service_path());
    ASSERT_TRUE(reply.status.ok()) << reply.status.message;
    ASSERT_EQ(reply.paths.size(), 1U);
    EXPECT_EQ(reply.paths[0].keys, texts(kNameInPath));
    EXPECT_EQ(names_of(reply.paths[0].keys), kOrder);
    EXPECT_EQ(reply.paths[0].class_name, "PAKRO_VMpkgInstallationService");
    EXPECT_EQ(reply.paths[0].name_space, "velk/cimv2");
}

TEST_F(ServiceInstance, AnyKeysYieldTheOneInstance) {
    for (const cim::NamedValues &keys :
         {cim::NamedValues{}, texts(kName), texts(kNameInPath), texts("else", "other-host"),
          cim::NamedValues{{"Unknown", cim::Value::uint32(7)}}}) {
        cim::ObjectPath path = host().service_path();
        path.keys = keys;
        const auto reply = broker().get_instance(path);
        ASSERT_TRUE(reply.status.ok() && reply.instance) << cim::to_text(keys);
        EXPECT_EQ(reply.instance->properties, texts(kName)) << cim::to_text(keys);
    }
}

TEST_F(ServiceInstance, EveryReadIsLoggedWithItsOwnLines) {
    struct {
        std::function<void()> read;
        std::string log;
    } const cases[] = {
        {[&] { broker().get_instance(host().service_path()); },
         entry("Enter ZEB_VMWarePackageInstallationProviderGetInstance.\n")},
        {[&] { broker().enumerate_instances(host().service_path()); },
         entry("Enter ZEB_VMWarePackageInstallationProviderEnumInstances.\n") + kEnumerated},
        {[&] { broker().enumerate_instance_names(host().service_path()); },
         entry("Enter ZEB_VMWarePackageInstallationProviderEnumInstanceNames.\n") + kEnumerated},
    };
    for (const auto &row : cases) {
        host().clear_log();
        row.read();
        EXPECT_EQ(host().log(), row.log);
    }
}

TEST_F(ServiceInstance, NodeNameIsGivenUpToSixtyFourBytes) {
    for (const std::size_t length : {1U, 63U, 64U}) {
        const std::string node(length, 'n');
        velkshim_set_node_name(node.c_str());
        const auto instances = broker().enumerate_instances(host().service_path());
        ASSERT_EQ(instances.instances.size(), 1U);
        EXPECT_EQ(instances.instances[0].properties, texts(kName, node)) << length;
        const auto names = broker().enumerate_instance_names(host().service_path());
        ASSERT_EQ(names.paths.size(), 1U);
        EXPECT_EQ(names.paths[0].keys, texts(kNameInPath, node)) << length;
    }
}

TEST_F(ServiceInstance, NodeNameIsReadAnewForEveryRequest) {
    for (const char *node : {"first", "second"}) {
        velkshim_set_node_name(node);
        const auto reply = broker().get_instance(host().service_path());
        ASSERT_TRUE(reply.instance);
        EXPECT_EQ(reply.instance->properties, texts(kName, node));
    }
}

TEST_F(ServiceInstance, NodeNameThatFillsTheBufferGetsNoTerminator) {
    using GetSysName = char *(char *buffer, int length);
    auto *get_sys_name = host().function<GetSysName>("get_sys_name");
    struct {
        std::size_t node;
        std::string terminator;
    } const cases[] = {{63, std::string(1, '\0')}, {64, "x"}};
    for (const auto &row : cases) {
        velkshim_set_node_name(std::string(row.node, 'n').c_str());
        std::string buffer(80, 'x');
        EXPECT_EQ(get_sys_name(buffer.data(), 64), buffer.data());
        const std::string copied = std::string(row.node, 'n') + row.terminator;
        EXPECT_EQ(buffer, copied + std::string(80 - copied.size(), 'x')) << row.node;
    }
}

TEST_F(ServiceInstance, ClientsOfFreshThreadsGetTheSame) {
    velkhost::broker::RequestOptions fresh;
    fresh.thread = velkhost::broker::RequestThread::kFresh;
    const auto reply = broker().enumerate_instances(host().service_path(), {}, fresh);
    ASSERT_EQ(reply.instances.size(), 1U);
    EXPECT_EQ(reply.instances[0].properties, texts(kName));
}
