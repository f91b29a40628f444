// Requests as a whole: what is no CIM operation, and what it is answered with.
#include "cimxml_fixture.h"

namespace velkhost::cimxml::testing {
namespace {

using ::testing::HasSubstr;

class CimxmlEndpoint : public EndpointTest {
  protected:
    static std::string enumerate() {
        return message(std::string("<IMETHODCALL NAME=\"EnumerateClassNames\">") + kPlace +
                       "</IMETHODCALL>");
    }
    static HttpRequest good() { return post("EnumerateClassNames", kNamespace, enumerate()); }

    // "400 request-not-valid" for a body behind good headers.
    std::string refusal(const std::string &text) const {
        const HttpResponse response =
            endpoint.answer(post("EnumerateClassNames", kNamespace, text));
        const std::string *const error = find_field(response.fields, "CIMError");
        return std::to_string(response.status) + ' ' + (error != nullptr ? *error : "");
    }
    static std::string replaced(const std::string &what, const std::string &with) {
        std::string text = enumerate();
        text.replace(text.find(what), what.size(), with);
        return text;
    }
};

TEST_F(CimxmlEndpoint, AnswerHasTheHeadersOfTheStandard) {
    const HttpResponse response = endpoint.answer(good());
    EXPECT_EQ(response.status, 200);
    EXPECT_EQ(*find_field(response.fields, "CIMOperation"), "MethodResponse");
    EXPECT_EQ(*find_field(response.fields, "Content-Type"), "application/xml; charset=\"utf-8\"");
    EXPECT_FALSE(response.close);
    EXPECT_TRUE(response.body.starts_with("<?xml version=\"1.0\" encoding=\"utf-8\" ?>\n<CIM "));
}

TEST_F(CimxmlEndpoint, PathIsAlwaysTheSame) {
    HttpRequest request = good();
    for (const char *path : {"/cimom", "/cimom?x=1", "http://host:1/cimom"}) {
        request.target = path;
        EXPECT_EQ(endpoint.answer(request).status, 200) << path;
    }
    for (const char *path : {"/", "/etc/passwd", "/cimom/../etc/passwd", "/cimom/", "cimom", "*",
                             "http://host", "/%2e%2e/etc/passwd"}) {
        request.target = path;
        EXPECT_EQ(endpoint.answer(request).status, 404) << path;
    }
}

TEST_F(CimxmlEndpoint, OtherMethodsOfHttpAreRefused) {
    HttpRequest request = good();
    request.method = "GET";
    const HttpResponse response = endpoint.answer(request);
    EXPECT_EQ(response.status, 405);
    EXPECT_EQ(*find_field(response.fields, "Allow"), "POST, M-POST, OPTIONS");
    request.method = "BREW";
    EXPECT_EQ(endpoint.answer(request).status, 501);
}

TEST_F(CimxmlEndpoint, OptionsTellsWhatIsThere) {
    HttpRequest request = good();
    request.method = "OPTIONS";
    const HttpResponse response = endpoint.answer(request);
    EXPECT_EQ(response.status, 200);
    EXPECT_EQ(*find_field(response.fields, "77-CIMProtocolVersion"), "1.0");
}

TEST_F(CimxmlEndpoint, MPostIsAnsweredInItsOwnTerms) {
    HttpRequest request = good();
    request.method = "M-POST";
    EXPECT_EQ(endpoint.answer(request).status, 510);
    request.fields = {{"Host", "a"},
                      {"Man", "http://www.dmtf.org/cim/mapping/http/v1.0;ns=42"},
                      {"42-CIMOperation", "MethodCall"},
                      {"42-CIMMethod", "EnumerateClassNames"},
                      {"42-CIMObject", kNamespace}};
    const HttpResponse response = endpoint.answer(request);
    EXPECT_EQ(response.status, 200);
    EXPECT_EQ(*find_field(response.fields, "42-CIMOperation"), "MethodResponse");
    EXPECT_NE(find_field(response.fields, "Ext"), nullptr);
    request.body = "<";
    EXPECT_EQ(*find_field(endpoint.answer(request).fields, "42-CIMError"),
              "request-not-well-formed");
}

TEST_F(CimxmlEndpoint, BodiesThatAreNoMessageAreRefused) {
    const std::string not_valid = "400 request-not-valid";
    EXPECT_EQ(refusal(""), "400 request-not-well-formed");
    EXPECT_EQ(refusal("<CIM>"), "400 request-not-well-formed");
    EXPECT_EQ(refusal("<A/>"), not_valid);
    EXPECT_EQ(refusal(R"(<CIM CIMVERSION="2.0" DTDVERSION="2.0"/>)"), not_valid);
    EXPECT_EQ(refusal(replaced(" CIMVERSION=\"2.0\"", "")), not_valid);
    EXPECT_EQ(refusal(replaced(" ID=\"4&amp;2\"", "")), not_valid);
    EXPECT_EQ(refusal(replaced("IMETHODCALL NAME=\"EnumerateClassNames\"", "IMETHODCALL")),
              not_valid);
    EXPECT_EQ(refusal(replaced(kPlace, "")), not_valid);
    EXPECT_EQ(refusal(replaced(kPlace, "<LOCALNAMESPACEPATH/>")), not_valid);
    EXPECT_EQ(refusal(replaced(kPlace, std::string(kPlace) + "<VALUE/>")), not_valid);
    EXPECT_EQ(refusal(message("<A/>")), not_valid);
    EXPECT_EQ(refusal(message("")), not_valid);
    const std::string export_request = R"(<CIM CIMVERSION="2.0" DTDVERSION="2.0"><MESSAGE ID="1" )"
                                       R"(PROTOCOLVERSION="1.0"><SIMPLEEXPREQ/></MESSAGE></CIM>)";
    EXPECT_EQ(refusal(export_request), not_valid);
}

TEST_F(CimxmlEndpoint, OtherVersionsAndBatchesAreNotImplemented) {
    EXPECT_EQ(refusal(replaced("CIMVERSION=\"2.0\"", "CIMVERSION=\"3.0\"")),
              "501 unsupported-cim-version");
    EXPECT_EQ(refusal(replaced("DTDVERSION=\"2.0\"", "DTDVERSION=\"1.0\"")),
              "501 unsupported-dtd-version");
    EXPECT_EQ(refusal(replaced("PROTOCOLVERSION=\"1.0\"", "PROTOCOLVERSION=\"2.0\"")),
              "501 unsupported-protocol-version");
    EXPECT_EQ(refusal(R"(<CIM CIMVERSION="2.3" DTDVERSION="2.3"><MESSAGE ID="1" )"
                      R"(PROTOCOLVERSION="1.1"><MULTIREQ/></MESSAGE></CIM>)"),
              "501 multiple-requests-unsupported");
}

TEST_F(CimxmlEndpoint, HeadersHaveToMatchTheMessage) {
    HttpRequest request = good();
    request.fields[2].value = "GetClass";
    const HttpResponse response = endpoint.answer(request);
    EXPECT_EQ(response.status, 400);
    EXPECT_EQ(*find_field(response.fields, "CIMError"), "header-mismatch");
}

TEST_F(CimxmlEndpoint, OperationsThatAreNotOfferedAreNotSupported) {
    for (const char *name : {"CreateInstance", "ModifyInstance", "ExecQuery", "SetQualifier",
                             "OpenEnumerateInstances", "Nonsense"}) {
        EXPECT_EQ(error_in(intrinsic(name, "")), "7 The requested operation is not supported");
    }
}

TEST_F(CimxmlEndpoint, EveryCutOfAMessageIsRefusedCleanly) {
    const std::string whole = enumerate();
    for (std::size_t length = 0; length < whole.size(); ++length) {
        EXPECT_EQ(refusal(whole.substr(0, length)), "400 request-not-well-formed");
    }
}

TEST_F(CimxmlEndpoint, EveryMissingElementIsAnswered) {
    // Whatever is left out, there is an answer of a known kind.
    const std::string whole = enumerate();
    for (std::size_t start = whole.find('<', 1); start != std::string::npos;
         start = whole.find('<', start + 1)) {
        std::string text = whole;
        text.erase(start, text.find('>', start) - start + 1);
        EXPECT_THAT(refusal(text),
                    ::testing::AnyOf(HasSubstr("400 request-not-"), "400 header-mismatch"));
    }
}

TEST_F(CimxmlEndpoint, StrangersAreToldToAuthenticate) {
    const Endpoint closed(broker, Credentials{"root", "secret"});
    HttpRequest request = good();
    const HttpResponse response = closed.answer(request);
    EXPECT_EQ(response.status, 401);
    EXPECT_EQ(*find_field(response.fields, "WWW-Authenticate"), "Basic realm=\"cimom\"");
    request.fields.push_back({"Authorization", "Basic cm9vdDpzZWNyZXQ="});
    EXPECT_EQ(closed.answer(request).status, 200);
    request.method = "OPTIONS";
    request.fields.pop_back();
    EXPECT_EQ(closed.answer(request).status, 401);
}

TEST_F(CimxmlEndpoint, ProviderLearnsWhoAsks) {
    std::string principal;
    provider.invoke = [&](const CMPIContext *context, const auto *, const auto *, const char *,
                          const auto *, auto *) {
        principal = text(context->ft->getEntry(context, "CMPIPrincipal", nullptr));
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    extrinsic("Echo", "");
    EXPECT_EQ(principal, "root");
}

TEST_F(CimxmlEndpoint, LastRequestOfAConnectionClosesIt) {
    HttpRequest request = good();
    request.fields.push_back({"Connection", "close"});
    EXPECT_TRUE(endpoint.answer(request).close);
}

}  // namespace
}  // namespace velkhost::cimxml::testing
