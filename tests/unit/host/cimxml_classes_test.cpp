// Operations on classes.
#include "cimxml_fixture.h"

namespace velkhost::cimxml::testing {
namespace {

using ::testing::ElementsAre;
using ::testing::IsSupersetOf;

class CimxmlClasses : public EndpointTest {
  protected:
    XmlElement get(const std::string &name, const std::string &flags = "") {
        const XmlElement response =
            intrinsic("GetClass", class_parameter("ClassName", name) + flags);
        return response.children.at(0).name == "ERROR" ? response
                                                       : response.children.at(0).children.at(0);
    }
    static std::vector<std::string> members(const XmlElement &declared) {
        std::vector<std::string> names;
        for (const XmlElement &member : declared.children) {
            names.push_back(*member.attribute("NAME"));
        }
        return names;
    }
};

TEST_F(CimxmlClasses, ClassHasPropertiesMethodsAndParameters) {
    const XmlElement declared =
        get("test_thing", flag("LocalOnly", false) + flag("IncludeQualifiers", false));
    EXPECT_EQ(*declared.attribute("NAME"), "Test_Thing");
    EXPECT_EQ(*declared.attribute("SUPERCLASS"), "Test_Root");
    EXPECT_THAT(members(declared),
                ElementsAre("Name", "Caption", "Mode", "Numbers", "Friend", "Reset", "Echo"));
    EXPECT_EQ(child(declared, "Mode").children.at(0).text, "7");
    EXPECT_EQ(child(declared, "Numbers").name, "PROPERTY.ARRAY");
    EXPECT_EQ(*child(declared, "Numbers").attribute("TYPE"), "sint64");
    EXPECT_EQ(child(declared, "Friend").name, "PROPERTY.REFERENCE");
    EXPECT_EQ(*child(declared, "Friend").attribute("REFERENCECLASS"), "Test_Root");
    const XmlElement &echo = child(declared, "Echo");
    EXPECT_EQ(*echo.attribute("TYPE"), "uint32");
    EXPECT_EQ(child(echo, "UA").name, "PARAMETER.ARRAY");
    EXPECT_EQ(child(echo, "F").name, "PARAMETER.REFERENCE");
    EXPECT_EQ(child(echo, "FA").name, "PARAMETER.REFARRAY");
    EXPECT_EQ(child(echo, "F").attribute("TYPE"), nullptr);
}

TEST_F(CimxmlClasses, QualifiersHaveTheirDeclaredTypes) {
    const XmlElement root = get("Test_Root");
    const XmlElement &description = child(root, "Description");
    EXPECT_EQ(*description.attribute("TYPE"), "string");
    EXPECT_EQ(description.children.at(0).text, "a <thing>");
    const XmlElement &key = child(child(root, "Name"), "Key");
    EXPECT_EQ(*key.attribute("TYPE"), "boolean");
    EXPECT_EQ(key.children.at(0).text, "TRUE");
    EXPECT_EQ(*child(child(root, "Caption"), "MaxLen").attribute("TYPE"), "uint32");
    const XmlElement thing = get("Test_Thing");
    const XmlElement &values = child(child(thing, "Numbers"), "Values");
    EXPECT_EQ(values.children.at(0).name, "VALUE.ARRAY");
    EXPECT_EQ(values.children.at(0).children.at(1).text, "two");
}

TEST_F(CimxmlClasses, LocalOnlyShowsWhatTheClassDeclares) {
    const std::string quiet = flag("IncludeQualifiers", false);
    EXPECT_THAT(members(get("Test_Thing", quiet)),
                ElementsAre("Caption", "Mode", "Numbers", "Friend", "Echo"));
    EXPECT_THAT(members(get("Test_Part", quiet)), ElementsAre("Serial"));
}

TEST_F(CimxmlClasses, ClassOriginNamesTheFirstDeclaration) {
    const XmlElement part =
        get("Test_Part", flag("LocalOnly", false) + flag("IncludeClassOrigin", true));
    EXPECT_EQ(*child(part, "Caption").attribute("CLASSORIGIN"), "Test_Root");
    EXPECT_EQ(*child(part, "Mode").attribute("CLASSORIGIN"), "Test_Thing");
    EXPECT_EQ(*child(part, "Mode").attribute("PROPAGATED"), "true");
    EXPECT_EQ(*child(part, "Serial").attribute("CLASSORIGIN"), "Test_Part");
    EXPECT_EQ(child(part, "Serial").attribute("PROPAGATED"), nullptr);
    EXPECT_EQ(*child(part, "Echo").attribute("CLASSORIGIN"), "Test_Thing");
}

TEST_F(CimxmlClasses, PropertyListNarrowsProperties) {
    const XmlElement declared =
        get("Test_Thing", flag("LocalOnly", false) + flag("IncludeQualifiers", false) +
                              "<IPARAMVALUE NAME=\"PropertyList\"><VALUE.ARRAY><VALUE>mode</VALUE>"
                              "<VALUE>Nope</VALUE></VALUE.ARRAY></IPARAMVALUE>");
    EXPECT_THAT(members(declared), ElementsAre("Mode", "Reset", "Echo"));
}

TEST_F(CimxmlClasses, UnknownClassesAndNamespacesAreErrors) {
    EXPECT_EQ(error_in(get("No_Such")), "6 The requested object could not be found");
    EXPECT_EQ(error_in(intrinsic("EnumerateClassNames", class_parameter("ClassName", "No_Such"))),
              "5 Class not found");
    HttpRequest request =
        post("EnumerateClassNames", "nope",
             message(R"(<IMETHODCALL NAME="EnumerateClassNames"><LOCALNAMESPACEPATH>)"
                     R"(<NAMESPACE NAME="nope"/></LOCALNAMESPACEPATH></IMETHODCALL>)"));
    EXPECT_EQ(error_in(response(request)), "3 Invalid namespace");
}

TEST_F(CimxmlClasses, EnumerationsGoDownFromAClass) {
    const auto names = [this](const std::string &parameters) {
        return names_in(intrinsic("EnumerateClassNames", parameters), "NAME");
    };
    EXPECT_THAT(names(class_parameter("ClassName", "Test_Root")), ElementsAre("Test_Thing"));
    EXPECT_THAT(names(class_parameter("ClassName", "Test_Root") + flag("DeepInheritance", true)),
                ElementsAre("Test_Part", "Test_Thing"));
    EXPECT_THAT(names(""), IsSupersetOf({"Test_Root", "Test_Base", "Test_Link"}));
    EXPECT_THAT(names(""), ::testing::Not(::testing::Contains("Test_Thing")));
    EXPECT_THAT(names(flag("DeepInheritance", true)), IsSupersetOf({"Test_Root", "Test_Part"}));
    EXPECT_THAT(
        names_in(intrinsic("EnumerateClasses", class_parameter("ClassName", "Test_Thing")), "NAME"),
        ElementsAre("Test_Part"));
}

}  // namespace
}  // namespace velkhost::cimxml::testing
