// Extrinsic methods: what a provider is given, and what the client gets back.
#include "cimxml_fixture.h"

namespace velkhost::cimxml::testing {
namespace {

using ::testing::HasSubstr;

class CimxmlMethods : public EndpointTest {
  protected:
    CimxmlMethods() {
        // Gives back what it gets.
        provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *,
                             const CMPIArgs *in, CMPIArgs *out) {
            for (CMPICount i = 0; i < in->ft->getArgCount(in, nullptr); ++i) {
                CMPIString *name = nullptr;
                CMPIStatus status{};
                const CMPIData data = in->ft->getArgAt(in, i, &name, &status);
                out->ft->addArg(out, name->ft->getCharPtr(name, nullptr),
                                (data.state & CMPI_nullValue) != 0 ? nullptr : &data.value,
                                data.type);
            }
            CMPIValue value{};
            value.uint32 = 17;
            result->ft->returnData(result, &value, CMPI_uint32);
            return result->ft->returnDone(result);
        };
    }

    // The element of one parameter after it has been through the provider.
    XmlElement echoed(const std::string &name, const std::string &value,
                      const std::string &attributes = "") {
        const XmlElement response =
            extrinsic("Echo", "<PARAMVALUE NAME=\"" + name + "\" " + attributes + ">" + value +
                                  "</PARAMVALUE>");
        if (response.children.empty() || response.children[0].name == "ERROR") {
            return response;
        }
        EXPECT_EQ(response.children.at(0).name, "RETURNVALUE");
        EXPECT_EQ(response.children.at(0).children.at(0).text, "17");
        return response.children.at(1);
    }
    // The text of a scalar, with its type: "uint16 4464".
    std::string echo(const std::string &name, const std::string &value,
                     const std::string &attributes = "") {
        const XmlElement element = echoed(name, value, attributes);
        if (element.name == "METHODRESPONSE") {
            return error_in(element);
        }
        const std::string type = *element.attribute("PARAMTYPE");
        return element.children.empty() ? type + " null" : type + ' ' + element.children[0].text;
    }
    std::string echo_text(const std::string &name, const std::string &text) {
        return echo(name, "<VALUE>" + text + "</VALUE>");
    }
};

TEST_F(CimxmlMethods, ParametersHaveTheTypesOfTheClass) {
    EXPECT_EQ(echo_text("s", " a &lt;b&gt; &amp; \xE2\x82\xAC "), "string  a <b> & \xE2\x82\xAC ");
    EXPECT_EQ(echo_text("U", " 5 "), "uint16 5");
    EXPECT_EQ(echo_text("U", "70000"), "uint16 4464");
    EXPECT_EQ(echo_text("U", "0x1F"), "uint16 31");
    EXPECT_EQ(echo_text("N", "-3"), "sint8 -3");
    EXPECT_EQ(echo_text("B", "true"), "boolean TRUE");
    EXPECT_EQ(echo_text("C", "\xE2\x82\xAC"), "char16 \xE2\x82\xAC");
    EXPECT_EQ(echo_text("C", "\xC3\xA4"), "char16 \xC3\xA4");
    EXPECT_EQ(echo_text("R", "1.5e3"), "real64 1500");
    EXPECT_EQ(echo_text("D", "20260302080000.000000+060"), "datetime 20260302080000.000000+060");
    EXPECT_EQ(echo_text("D", "00000001000000.000000:000"), "datetime 00000001000000.000000:000");
}

TEST_F(CimxmlMethods, ValuesThatAreNoneOfTheTypeAreInvalid) {
    EXPECT_EQ(echo_text("U", "five"), "4 U: \"five\" is no uint16");
    EXPECT_EQ(echo_text("U", ""), "4 U: \"\" is no uint16");
    EXPECT_EQ(echo_text("B", "yes"), "4 B: \"yes\" is no boolean");
    EXPECT_EQ(echo_text("C", "ab"), "4 C: \"ab\" is no char16");
    EXPECT_EQ(echo_text("C", "\xF0\x9F\x98\x80"), "4 C: \"\xF0\x9F\x98\x80\" is no char16");
    EXPECT_EQ(echo_text("R", "1,5"), "4 R: \"1,5\" is no real64");
    EXPECT_EQ(echo_text("D", "2026-03-02"), "4 D: \"2026-03-02\" is no datetime");
}

TEST_F(CimxmlMethods, TheMessagesOwnTypeComesFirst) {
    EXPECT_EQ(echo("U", "<VALUE>7</VALUE>", "PARAMTYPE=\"string\""), "string 7");
    EXPECT_EQ(echo("Unknown", "<VALUE>7</VALUE>", "PARAMTYPE=\"sint64\""), "sint64 7");
    EXPECT_EQ(echo("Unknown", "<VALUE>7</VALUE>"), "string 7");
}

TEST_F(CimxmlMethods, ParameterWithoutAValueIsNullOfItsType) {
    EXPECT_EQ(echo("U", ""), "uint16 null");
    EXPECT_EQ(echo("Unknown", ""), "string null");
    const XmlElement array = echoed("UA", "");
    EXPECT_EQ(*array.attribute("PARAMTYPE"), "uint16");
    EXPECT_TRUE(array.children.empty());
}

TEST_F(CimxmlMethods, ArraysKeepOrderAndNulls) {
    const XmlElement array =
        echoed("UA", "<VALUE.ARRAY><VALUE>3</VALUE><VALUE.NULL/><VALUE>1</VALUE></VALUE.ARRAY>");
    ASSERT_EQ(array.children.size(), 1U);
    EXPECT_EQ(array.children[0].name, "VALUE.ARRAY");
    const auto &elements = array.children[0].children;
    ASSERT_EQ(elements.size(), 3U);
    EXPECT_EQ(elements[0].text, "3");
    EXPECT_EQ(elements[1].name, "VALUE.NULL");
    EXPECT_EQ(elements[2].text, "1");
    const XmlElement empty = echoed("UA", "<VALUE.ARRAY/>");
    EXPECT_TRUE(empty.children.at(0).children.empty());
    EXPECT_EQ(*empty.attribute("PARAMTYPE"), "uint16");
}

TEST_F(CimxmlMethods, ScalarForAnArrayStaysAScalar) {
    EXPECT_EQ(echo_text("UA", "9"), "uint16 9");
}

TEST_F(CimxmlMethods, ReferencesGoThroughWithTheirKeys) {
    const std::string path =
        std::string("<LOCALINSTANCEPATH>") + kPlace +
        R"(<INSTANCENAME CLASSNAME="Test_Counter">)"
        R"(<KEYBINDING NAME="Number"><KEYVALUE VALUETYPE="string">5</KEYVALUE>)"
        R"(</KEYBINDING><KEYBINDING NAME="Up"><KEYVALUE>true</KEYVALUE>)"
        R"(</KEYBINDING></INSTANCENAME></LOCALINSTANCEPATH>)";
    const XmlElement element = echoed("F", "<VALUE.REFERENCE>" + path + "</VALUE.REFERENCE>");
    EXPECT_EQ(*element.attribute("PARAMTYPE"), "reference");
    const XmlElement &local = element.children.at(0).children.at(0);
    EXPECT_EQ(local.name, "LOCALINSTANCEPATH");
    const XmlElement &name = local.children.at(1);
    EXPECT_EQ(*name.attribute("CLASSNAME"), "Test_Counter");
    EXPECT_EQ(*name.children.at(0).children.at(0).attribute("VALUETYPE"), "numeric");
    EXPECT_EQ(*name.children.at(1).children.at(0).attribute("VALUETYPE"), "boolean");
    EXPECT_EQ(name.children.at(1).children.at(0).text, "TRUE");
}

TEST_F(CimxmlMethods, ArraysOfReferencesAreRefarrays) {
    const std::string one =
        "<VALUE.REFERENCE><INSTANCENAME CLASSNAME=\"Test_Root\"><KEYVALUE>x</KEYVALUE>"
        "</INSTANCENAME></VALUE.REFERENCE>";
    const XmlElement element = echoed("FA", "<VALUE.REFARRAY>" + one + one + "</VALUE.REFARRAY>");
    EXPECT_EQ(element.children.at(0).name, "VALUE.REFARRAY");
    const XmlElement &local = element.children.at(0).children.at(1).children.at(0);
    EXPECT_EQ(local.name, "LOCALINSTANCEPATH") << "a path without a namespace is of the call's";
    EXPECT_EQ(*local.children.at(1).children.at(0).attribute("NAME"), "Name")
        << "a single key needs no name";
}

TEST_F(CimxmlMethods, EmbeddedInstancesAreDocumentsInTexts) {
    const std::string instance =
        R"(&lt;INSTANCE CLASSNAME="Test_Thing"&gt;&lt;PROPERTY NAME="Mode" TYPE="uint16"&gt;)"
        R"(&lt;VALUE&gt;3&lt;/VALUE&gt;&lt;/PROPERTY&gt;&lt;/INSTANCE&gt;)";
    const XmlElement element =
        echoed("E", "<VALUE>" + instance + "</VALUE>", "EmbeddedObject=\"instance\"");
    EXPECT_EQ(*element.attribute("EmbeddedObject"), "instance");
    const XmlElement inner = read_xml(element.children.at(0).text);
    EXPECT_EQ(inner.name, "INSTANCE");
    EXPECT_EQ(child(inner, "Mode").children.at(0).text, "3");
    EXPECT_THAT(echo("E", "<VALUE>&lt;A</VALUE>", "EmbeddedObject=\"instance\""),
                HasSubstr("4 E: "));
    EXPECT_THAT(echo("E", "<VALUE>&lt;A/&gt;</VALUE>", "EmbeddedObject=\"instance\""),
                HasSubstr("no instance"));
}

TEST_F(CimxmlMethods, ParameterGivenTwiceIsInvalid) {
    const std::string one = "<PARAMVALUE NAME=\"U\"><VALUE>1</VALUE></PARAMVALUE>";
    EXPECT_EQ(error_in(extrinsic("Echo", one + one)), "4 parameter U is given twice");
}

TEST_F(CimxmlMethods, FailedMethodHasAnErrorAlone) {
    provider.invoke = [this](const auto *, const CMPIResult *result, const auto *, const char *,
                             const auto *, auto *) {
        CMPIValue value{};
        value.uint32 = 1;
        result->ft->returnData(result, &value, CMPI_uint32);
        return CMPIStatus{CMPI_RC_ERR_METHOD_NOT_FOUND,
                          make().newString(cmpi, "InValid <Method> Name", nullptr)};
    };
    EXPECT_EQ(error_in(extrinsic("Nope", "")), "17 InValid <Method> Name");
    EXPECT_THAT(last_body, ::testing::Not(HasSubstr("RETURNVALUE")));
}

TEST_F(CimxmlMethods, ErrorWithoutTextOrWithACodeOfCmpisOwnIsStillOne) {
    CMPIrc code = CMPI_RC_ERR_ACCESS_DENIED;
    provider.invoke = [&code](const auto *, const auto *, const auto *, const char *, const auto *,
                              auto *) {
        return CMPIStatus{code, nullptr};
    };
    EXPECT_EQ(error_in(extrinsic("Echo", "")), "2 Access is denied");
    code = static_cast<CMPIrc>(60);
    EXPECT_EQ(error_in(extrinsic("Echo", "")), "1 The operation failed (60)");
}

TEST_F(CimxmlMethods, MethodWithoutAValueHasAnEmptyResponse) {
    provider.invoke = [](const auto *, const auto *, const auto *, const char *, const auto *,
                         auto *) {
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    const XmlElement response = extrinsic("Echo", "");
    EXPECT_EQ(response.name, "METHODRESPONSE");
    EXPECT_EQ(*response.attribute("NAME"), "Echo");
    EXPECT_TRUE(response.children.empty());
}

TEST_F(CimxmlMethods, TextsThatNoDocumentMayHoldAreMadeFit) {
    provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *,
                         const auto *, auto *) {
        return result->ft->returnData(result, chars("a\x01\xFF<"), CMPI_chars);
    };
    const XmlElement response = extrinsic("Echo", "");
    EXPECT_EQ(*response.children.at(0).attribute("PARAMTYPE"), "string");
    EXPECT_EQ(response.children.at(0).children.at(0).text, "a\xEF\xBF\xBD\xEF\xBF\xBD<");
}

}  // namespace
}  // namespace velkhost::cimxml::testing
