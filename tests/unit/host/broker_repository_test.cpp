// Classes, namespaces, and what classes inherit.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

class BrokerRepository : public BrokerTest {
  protected:
    Repository &repository = broker.repository();
};

TEST_F(BrokerRepository, ClassHasItsInheritedMembersFirst) {
    const ClassPointer service = repository.find_class("TEST/cimv2", "test_service");
    ASSERT_NE(service, nullptr);
    EXPECT_EQ(service->declaration.name, "Test_Service");
    ASSERT_EQ(service->declaration.properties.size(), 5U);
    EXPECT_EQ(service->declaration.properties.front().name, "Name");
    EXPECT_EQ(service->ancestors, std::vector<std::string>{"Test_Base"});
    EXPECT_EQ(service->key_names(), std::vector<std::string>{"Name"});
    EXPECT_NE(service->find_method("RUN"), nullptr);
    EXPECT_EQ(service->find_method("Nope"), nullptr);
}

TEST_F(BrokerRepository, MemberDeclaredAgainReplacesTheInheritedOneButStaysAKey) {
    cim::ClassDecl special{.name = "Test_Special",
                           .superclass = "test_service",
                           .qualifiers = {},
                           .properties = {},
                           .methods = {}};
    special.properties = {
        {"name", {CMPI_string, ""}, {{"MaxLen", {"9"}}}, std::vector<std::string>{"fixed"}}};
    ASSERT_EQ(repository.add_class(kNamespace, special), "");
    const ClassPointer merged = repository.find_class(kNamespace, "Test_Special");
    EXPECT_EQ(merged->declaration.properties.size(), 5U);
    EXPECT_TRUE(merged->declaration.properties.front().is_key());
    const cim::Instance instance = repository.new_instance(path_of("Test_Special"));
    EXPECT_EQ(*instance.properties.find("Name"), cim::Value::string("fixed"));
    EXPECT_TRUE(merged->is_a("TEST_BASE"));
}

TEST_F(BrokerRepository, ClassIsAddedOnceAndAfterItsSuperclass) {
    cim::ClassDecl orphan{.name = "Test_Orphan",
                          .superclass = "No_Such",
                          .qualifiers = {},
                          .properties = {},
                          .methods = {}};
    EXPECT_EQ(repository.add_class(kNamespace, orphan),
              "class Test_Orphan: its superclass No_Such is not in test/cimv2");
    orphan.superclass.clear();
    EXPECT_EQ(repository.add_class(kNamespace, orphan), "");
    EXPECT_EQ(repository.add_class(kNamespace, orphan),
              "class Test_Orphan is already in test/cimv2");
    EXPECT_EQ(repository.add_class("other", orphan), "");
}

TEST_F(BrokerRepository, ListsClassesAndSubclasses) {
    EXPECT_EQ(repository.classes(kNamespace).size(), 4U);
    EXPECT_EQ(repository.classes(kNamespace, "Test_Base").size(), 2U);
    EXPECT_TRUE(repository.classes("no/such").empty());
}

TEST_F(BrokerRepository, NamespacesMayBeEmpty) {
    EXPECT_FALSE(repository.has_namespace("root/cimv2"));
    repository.add_namespace("root/cimv2");
    EXPECT_TRUE(repository.has_namespace("ROOT/cimv2"));
    EXPECT_EQ(repository.namespaces(), (std::vector<std::string>{"root/cimv2", kNamespace}));
    EXPECT_EQ(repository.find_class("no/such", "Test_Base"), nullptr);
}

TEST_F(BrokerRepository, DefaultsTakeTheirDeclaredType) {
    cim::ClassDecl defaults{.name = "Test_Defaults",
                            .superclass = "",
                            .qualifiers = {},
                            .properties = {},
                            .methods = {}};
    defaults.properties = {{"List", {CMPI_uint16A, ""}, {}, std::vector<std::string>{"1", "70000"}},
                           {"Flag", {CMPI_boolean, ""}, {}, std::vector<std::string>{"true"}},
                           {"Odd", {CMPI_uint8, ""}, {}, std::vector<std::string>{"many"}},
                           {"None", {CMPI_uint8, ""}, {}, std::vector<std::string>{}}};
    ASSERT_EQ(repository.add_class(kNamespace, defaults), "");
    const cim::Instance instance = repository.new_instance(path_of("Test_Defaults"));
    EXPECT_EQ(*instance.properties.find("List"),
              cim::Value::array(CMPI_uint16, {cim::Value::uint16(1), cim::Value::uint16(4464)}));
    EXPECT_EQ(*instance.properties.find("Flag"), cim::Value::boolean(true));
    EXPECT_TRUE(instance.properties.find("Odd")->is_null());
    EXPECT_TRUE(instance.properties.find("None")->is_null());
}

}  // namespace
}  // namespace velkhost::broker::testing
