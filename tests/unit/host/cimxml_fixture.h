// An endpoint on a broker with the test's classes, and messages for it.
#pragma once

#include "broker_testing.h"
#include "host/cimxml/endpoint.h"
#include "host/cimxml/xml.h"
#include "host/mof/compiler.h"

#include <gmock/gmock.h>

#include <string>

namespace velkhost::cimxml::testing {

using broker::testing::kNamespace;

class EndpointTest : public broker::testing::BrokerTest {
  protected:
    EndpointTest() {
        const auto result = mof::compile_text(kClasses, "test.mof",
                                              {.name_space = kNamespace, .known_classes = {}});
        EXPECT_EQ(result.error_text(), "");
        for (const auto &unit : result.units) {
            for (const auto &declaration : unit.classes) {
                EXPECT_EQ(broker.repository().add_class(unit.name_space, declaration), "");
            }
        }
        broker.register_provider(kNamespace, "Test_Thing", provider.all());
    }

    static HttpRequest post(const std::string &method, const std::string &object,
                            std::string body) {
        HttpRequest request;
        request.method = "POST";
        request.target = "/cimom";
        request.fields = {{"Host", "client.example"},
                          {"CIMOperation", "MethodCall"},
                          {"CIMMethod", method},
                          {"CIMObject", object}};
        request.body = std::move(body);
        return request;
    }

    static std::string message(const std::string &call) {
        return R"(<?xml version="1.0" encoding="utf-8" ?><CIM CIMVERSION="2.0" DTDVERSION="2.0">)"
               R"(<MESSAGE ID="4&amp;2" PROTOCOLVERSION="1.0"><SIMPLEREQ>)" +
               call + "</SIMPLEREQ></MESSAGE></CIM>";
    }

    static constexpr const char *kPlace =
        R"(<LOCALNAMESPACEPATH><NAMESPACE NAME="test"/><NAMESPACE NAME="cimv2"/></LOCALNAMESPACEPATH>)";

    // The response element of an intrinsic method.
    XmlElement intrinsic(const std::string &method, const std::string &parameters) {
        return response(post(method, kNamespace,
                             message("<IMETHODCALL NAME=\"" + method + "\">" + kPlace + parameters +
                                     "</IMETHODCALL>")));
    }

    // That of an extrinsic one, on the class Test_Thing.
    XmlElement extrinsic(const std::string &method, const std::string &parameters) {
        const std::string path = std::string("<LOCALCLASSPATH>") + kPlace +
                                 "<CLASSNAME NAME=\"Test_Thing\"/></LOCALCLASSPATH>";
        return response(post(
            method, std::string(kNamespace) + ":Test_Thing",
            message("<METHODCALL NAME=\"" + method + "\">" + path + parameters + "</METHODCALL>")));
    }

    XmlElement response(const HttpRequest &request) {
        const HttpResponse answer = endpoint.answer(request);
        EXPECT_EQ(answer.status, 200) << answer.body;
        if (answer.status != 200) {
            return {};
        }
        last_body = answer.body;
        const XmlElement root = read_xml(answer.body);
        const XmlElement &message_element = root.children.at(0);
        EXPECT_EQ(*message_element.attribute("ID"), "4&2");
        return message_element.children.at(0).children.at(0);
    }

    // "6 text" of an ERROR.
    static std::string error_in(const XmlElement &response) {
        if (response.children.size() != 1 || response.children[0].name != "ERROR") {
            return "no error";
        }
        const XmlElement &error = response.children[0];
        return *error.attribute("CODE") + ' ' + *error.attribute("DESCRIPTION");
    }

    // Names of the elements in an IRETURNVALUE: of an attribute of theirs.
    static std::vector<std::string> names_in(const XmlElement &response,
                                             const std::string &attribute) {
        std::vector<std::string> names;
        for (const XmlElement &element : response.children.at(0).children) {
            names.push_back(*element.attribute(attribute));
        }
        return names;
    }

    // The child of that name, or with that NAME.
    static const XmlElement &child(const XmlElement &element, const std::string &name) {
        for (const XmlElement &each : element.children) {
            const std::string *const attribute = each.attribute("NAME");
            if (each.name == name || (attribute != nullptr && *attribute == name)) {
                return each;
            }
        }
        ADD_FAILURE() << element.name << " has no " << name;
        return element;
    }

    static std::string flag(const std::string &name, bool value) {
        return "<IPARAMVALUE NAME=\"" + name + "\"><VALUE>" + (value ? "TRUE" : "FALSE") +
               "</VALUE></IPARAMVALUE>";
    }
    static std::string class_parameter(const std::string &name, const std::string &value) {
        return "<IPARAMVALUE NAME=\"" + name + "\"><CLASSNAME NAME=\"" + value +
               "\"/></IPARAMVALUE>";
    }

    static constexpr const char *kClasses = R"(
        Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride);
        Qualifier Description : string = null, Scope(any);
        Qualifier Values : string[] = null, Scope(property);
        Qualifier MaxLen : uint32 = null, Scope(property);
        Qualifier In : boolean = true, Scope(parameter);
        Qualifier Out : boolean = false, Scope(parameter);
        [Description ("a <thing>")]
        class Test_Root { [Key] string Name; [MaxLen (8)] string Caption; uint32 Reset(); };
        class Test_Thing : Test_Root {
            uint16 Mode = 7;
            [Values {"one", "two"}] sint64 Numbers[];
            string Caption = "thing";
            Test_Root REF Friend;
            uint32 Echo([In] string S, [In] uint16 U, [In] uint16 UA[], [In] boolean B, [In] char16 C,
                        [In] real64 R, [In] datetime D, [In] Test_Root REF F, [In] Test_Root REF FA[],
                        [In] sint8 N, [In(false), Out] string X);
        };
        class Test_Part : Test_Thing { string Serial; };
        class Test_Counter { [Key] uint32 Number; [Key] boolean Up; };
    )";

    Endpoint endpoint{broker, std::nullopt};
    std::string last_body;
};

}  // namespace velkhost::cimxml::testing
