// Operations on instances and along associations.
#include "cimxml_fixture.h"

namespace velkhost::cimxml::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::HasSubstr;

constexpr CMPIStatus kOk{CMPI_RC_OK, nullptr};

class CimxmlInstances : public EndpointTest {
  protected:
    // An instance of the class with all that the class gives it, and a name.
    CMPIInstance *thing(const char *class_name, const char *name) {
        CMPIInstance *instance = make().newInstance(cmpi, new_path(class_name), nullptr);
        instance->ft->setProperty(instance, "Name", chars(name), CMPI_chars);
        return instance;
    }
    broker::testing::ScriptedProvider::Operation give(const char *class_name, const char *name) {
        return [this, class_name, name](const auto *, const CMPIResult *result, const auto *) {
            return result->ft->returnInstance(result, thing(class_name, name));
        };
    }

    static std::string instance_name(const std::string &key_value,
                                     const std::string &parameter = "InstanceName") {
        return "<IPARAMVALUE NAME=\"" + parameter +
               R"("><INSTANCENAME CLASSNAME="Test_Thing"><KEYBINDING NAME="Name"><KEYVALUE>)" +
               key_value + "</KEYVALUE></KEYBINDING></INSTANCENAME></IPARAMVALUE>";
    }
    static std::vector<std::string> names_of(const XmlElement &instance) {
        std::vector<std::string> names;
        for (const XmlElement &property : instance.children) {
            names.push_back(*property.attribute("NAME"));
        }
        return names;
    }
};

TEST_F(CimxmlInstances, GetInstanceAsksWithTheKeysAndShowsEveryProperty) {
    provider.get = [this](const auto *, const CMPIResult *result, const CMPIObjectPath *path) {
        const CMPIData name = path->ft->getKey(path, "name", nullptr);
        EXPECT_EQ(text(name), "a<b> & \"c\"");
        return result->ft->returnInstance(result, thing("Test_Thing", "x<y"));
    };
    const XmlElement response =
        intrinsic("GetInstance", instance_name("a&lt;b&gt; &amp; &quot;c&quot;"));
    const XmlElement &instance = response.children.at(0).children.at(0);
    EXPECT_EQ(instance.name, "INSTANCE");
    EXPECT_THAT(names_of(instance), ElementsAre("Name", "Caption", "Mode", "Numbers", "Friend"));
    EXPECT_EQ(child(instance, "Name").children.at(0).text, "x<y");
    EXPECT_EQ(child(instance, "Mode").children.at(0).text, "7");
    EXPECT_EQ(child(instance, "Numbers").name, "PROPERTY.ARRAY");
    EXPECT_EQ(*child(instance, "Numbers").attribute("TYPE"), "sint64");
    EXPECT_TRUE(child(instance, "Numbers").children.empty());
    EXPECT_EQ(child(instance, "Friend").name, "PROPERTY.REFERENCE");
    EXPECT_EQ(child(instance, "Mode").attribute("CLASSORIGIN"), nullptr);
}

TEST_F(CimxmlInstances, PropertyListAndClassOriginAreObeyed) {
    provider.get = give("Test_Thing", "x");
    const XmlElement response =
        intrinsic("GetInstance", instance_name("x") + flag("IncludeClassOrigin", true) +
                                     "<IPARAMVALUE NAME=\"PropertyList\"><VALUE.ARRAY>"
                                     "<VALUE>caption</VALUE><VALUE>Mode</VALUE></VALUE.ARRAY>"
                                     "</IPARAMVALUE>");
    const XmlElement &instance = response.children.at(0).children.at(0);
    EXPECT_THAT(names_of(instance), ElementsAre("Caption", "Mode"));
    EXPECT_EQ(*child(instance, "Caption").attribute("CLASSORIGIN"), "Test_Root");
    EXPECT_EQ(*child(instance, "Mode").attribute("CLASSORIGIN"), "Test_Thing");
}

TEST_F(CimxmlInstances, MissingInstanceIsAnErrorOfItsProviderOrOfTheBroker) {
    provider.get = [this](const auto *, const auto *, const auto *) {
        return CMPIStatus{CMPI_RC_ERR_NOT_FOUND, make().newString(cmpi, "none such", nullptr)};
    };
    EXPECT_EQ(error_in(intrinsic("GetInstance", instance_name("x"))), "6 none such");
    provider.get = [](const auto *, const auto *, const auto *) { return kOk; };
    EXPECT_EQ(error_in(intrinsic("GetInstance", instance_name("x"))),
              "6 The requested object could not be found");
}

TEST_F(CimxmlInstances, EnumerationNamesEveryInstanceByItsKeys) {
    provider.enumerate = [this](const auto *, const CMPIResult *result, const auto *) {
        result->ft->returnInstance(result, thing("Test_Thing", "1"));
        return result->ft->returnInstance(result, thing("Test_Part", "2"));
    };
    const XmlElement response =
        intrinsic("EnumerateInstances", class_parameter("ClassName", "Test_Thing"));
    const auto &entries = response.children.at(0).children;
    ASSERT_EQ(entries.size(), 2U);
    EXPECT_EQ(entries[0].name, "VALUE.NAMEDINSTANCE");
    const XmlElement &name = entries[1].children.at(0);
    EXPECT_EQ(*name.attribute("CLASSNAME"), "Test_Part");
    EXPECT_EQ(*name.children.at(0).attribute("NAME"), "Name");
    EXPECT_EQ(name.children.at(0).children.at(0).text, "2");
    EXPECT_EQ(names_of(entries[1].children.at(1)).back(), "Serial");
}

TEST_F(CimxmlInstances, ShallowEnumerationShowsSubclassesAsTheClass) {
    provider.enumerate = give("Test_Part", "2");
    const XmlElement response =
        intrinsic("EnumerateInstances",
                  class_parameter("ClassName", "Test_Thing") + flag("DeepInheritance", false));
    const XmlElement &instance = response.children.at(0).children.at(0).children.at(1);
    EXPECT_EQ(*instance.attribute("CLASSNAME"), "Test_Part");
    EXPECT_EQ(names_of(instance).back(), "Friend");
}

TEST_F(CimxmlInstances, EnumerationOfNothingIsAnEmptyValue) {
    provider.enumerate_names = [](const auto *, const auto *, const auto *) { return kOk; };
    const XmlElement response =
        intrinsic("EnumerateInstanceNames", class_parameter("ClassName", "Test_Thing"));
    EXPECT_EQ(response.children.at(0).name, "IRETURNVALUE");
    EXPECT_TRUE(response.children.at(0).children.empty());
}

TEST_F(CimxmlInstances, EnumerationOfAnUnknownClassIsAnError) {
    EXPECT_EQ(error_in(intrinsic("EnumerateInstances", class_parameter("ClassName", "No_Such"))),
              "5 Class not found");
}

TEST_F(CimxmlInstances, DeleteInstanceHasNoValue) {
    std::string deleted;
    provider.remove = [&deleted](const auto *, const auto *, const CMPIObjectPath *path) {
        deleted = text(path->ft->getKey(path, "Name", nullptr));
        return kOk;
    };
    const XmlElement response = intrinsic("DeleteInstance", instance_name("x"));
    EXPECT_EQ(deleted, "x");
    EXPECT_TRUE(response.children.empty());
}

TEST_F(CimxmlInstances, AssociationsComeWithWholePaths) {
    provider.associators = [this](const CMPIResult *result, const CMPIObjectPath *source,
                                  const char *association, const char *result_class) {
        EXPECT_EQ(text(source->ft->getKey(source, "Name", nullptr)), "x");
        EXPECT_STREQ(association, "Test_Thing");
        EXPECT_EQ(result_class, nullptr);
        return result->ft->returnInstance(result, thing("Test_Part", "2"));
    };
    const XmlElement response =
        intrinsic("Associators",
                  instance_name("x", "ObjectName") + class_parameter("AssocClass", "Test_Thing"));
    const XmlElement &object = response.children.at(0).children.at(0);
    EXPECT_EQ(object.name, "VALUE.OBJECTWITHPATH");
    const XmlElement &place = object.children.at(0).children.at(0);
    EXPECT_EQ(place.children.at(0).text, "client.example");
    EXPECT_EQ(*place.children.at(1).children.at(1).attribute("NAME"), "cimv2");
    EXPECT_EQ(*object.children.at(1).attribute("CLASSNAME"), "Test_Part");
}

TEST_F(CimxmlInstances, ReferenceNamesAreObjectPaths) {
    provider.references = [this](const CMPIResult *result, const auto *, const char *result_class,
                                 const char *role) {
        EXPECT_EQ(result_class, nullptr);
        EXPECT_STREQ(role, "Antecedent");
        CMPIObjectPath *path = new_path("Test_Part");
        path->ft->addKey(path, "Name", chars("2"), CMPI_chars);
        return result->ft->returnObjectPath(result, path);
    };
    const XmlElement response = intrinsic(
        "ReferenceNames", instance_name("x", "ObjectName") +
                              "<IPARAMVALUE NAME=\"Role\"><VALUE>Antecedent</VALUE></IPARAMVALUE>");
    const XmlElement &object = response.children.at(0).children.at(0);
    EXPECT_EQ(object.name, "OBJECTPATH");
    EXPECT_EQ(object.children.at(0).name, "INSTANCEPATH");
}

TEST_F(CimxmlInstances, AssociationsOfClassesAreNotSupported) {
    for (const char *operation : {"Associators", "AssociatorNames", "References"}) {
        EXPECT_THAT(error_in(intrinsic(operation, class_parameter("ObjectName", "Test_Thing"))),
                    HasSubstr("7 Associations of classes"));
    }
}

TEST_F(CimxmlInstances, KeysThatAreNoneOfTheirTypeAreInvalid) {
    const XmlElement response = intrinsic(
        "GetInstance",
        R"(<IPARAMVALUE NAME="InstanceName"><INSTANCENAME CLASSNAME="Test_Counter"><KEYBINDING )"
        R"(NAME="Number"><KEYVALUE VALUETYPE="numeric">x</KEYVALUE></KEYBINDING></INSTANCENAME>)"
        R"(</IPARAMVALUE>)");
    EXPECT_EQ(error_in(response), "4 Number: \"x\" is no uint32");
}

TEST_F(CimxmlInstances, ParametersAreCheckedByName) {
    EXPECT_EQ(error_in(intrinsic("GetInstance", "")), "4 parameter InstanceName is missing");
    EXPECT_EQ(error_in(intrinsic("GetInstance", flag("Nope", true))), "4 unknown parameter Nope");
    EXPECT_EQ(error_in(intrinsic("EnumerateInstances", class_parameter("ClassName", "Test_Thing") +
                                                           class_parameter("classname", "x"))),
              "4 parameter classname is given twice");
    EXPECT_THAT(error_in(intrinsic("EnumerateInstances", flag("ClassName", true))),
                HasSubstr("4 "));
}

}  // namespace
}  // namespace velkhost::cimxml::testing
