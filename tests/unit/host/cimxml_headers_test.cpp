// The headers of DSP0200.
#include "host/cimxml/cim_headers.h"

#include "host/cimxml/errors.h"

#include <gmock/gmock.h>

namespace velkhost::cimxml {
namespace {

struct Outcome {
    int status = 200;
    std::string cim_error;
    bool operator==(const Outcome &) const = default;
};

template <class Work>
Outcome outcome_of(Work work) {
    try {
        work();
        return {};
    } catch (const MessageError &error) {
        return {error.status(), error.cim_error()};
    }
}

HttpRequest post(HttpFields fields) {
    HttpRequest request;
    request.method = "POST";
    request.fields = std::move(fields);
    return request;
}

Outcome check_call(const HttpFields &fields) {
    return outcome_of([&] {
        const HttpRequest request = post(fields);
        CimHeaders(request).check_call();
    });
}

Outcome check_match(const std::string &method, const std::string &object) {
    return outcome_of([&] {
        const HttpRequest request = post({{"CIMMethod", method}, {"CIMObject", object}});
        Request message;
        message.method = "Run";
        message.object = "root/cimv2:A_B";
        CimHeaders(request).check_match(message);
    });
}

TEST(CimxmlHeaders, MethodCallOfAKnownVersionIsTaken) {
    EXPECT_EQ(check_call({{"CIMOperation", "methodcall"}}), Outcome{});
    EXPECT_EQ(check_call({{"CIMOperation", "MethodCall"},
                          {"CIMProtocolVersion", "1.4"},
                          {"Content-Type", "text/xml; charset=utf-8"}}),
              Outcome{});
    EXPECT_EQ(check_call({{"CIMOperation", "MethodCall"},
                          {"Content-Type", "application/xml;charset=\"UTF-8\""}}),
              Outcome{});
}

TEST(CimxmlHeaders, OtherCallsAreRefusedAsTheStandardSays) {
    EXPECT_EQ(check_call({}), (Outcome{400, "unsupported-operation"}));
    EXPECT_EQ(check_call({{"CIMOperation", "MethodResponse"}}),
              (Outcome{400, "unsupported-operation"}));
    EXPECT_EQ(check_call({{"CIMOperation", "MethodCall"}, {"CIMProtocolVersion", "2.0"}}),
              (Outcome{501, "unsupported-protocol-version"}));
    EXPECT_EQ(check_call({{"CIMOperation", "MethodCall"}, {"CIMBatch", ""}}),
              (Outcome{501, "multiple-requests-unsupported"}));
    for (const char *type : {"text/plain", "application/xml; charset=\"utf-16\""}) {
        EXPECT_EQ(check_call({{"CIMOperation", "MethodCall"}, {"Content-Type", type}}),
                  (Outcome{415, ""}))
            << type;
    }
    EXPECT_EQ(check_call({{"CIMOperation", "MethodCall"}, {"Content-Encoding", "gzip"}}),
              (Outcome{415, ""}));
}

TEST(CimxmlHeaders, MethodAndObjectHaveToMatchTheMessage) {
    EXPECT_EQ(check_match("Run", "root/cimv2:A_B"), Outcome{});
    EXPECT_EQ(check_match("R%75n", "root%2Fcimv2%3Aa_b.Name=\"x.y:z\""), Outcome{});
    const Outcome mismatch = {400, "header-mismatch"};
    EXPECT_EQ(check_match("Walk", "root/cimv2:A_B"), mismatch);
    EXPECT_EQ(check_match("Run", "root/cimv2:A_C"), mismatch);
    EXPECT_EQ(check_match("Run", "root/cimv2"), mismatch);
    EXPECT_EQ(check_match("Run%", "root/cimv2:A_B"), mismatch);
    EXPECT_EQ(outcome_of([] {
                  const HttpRequest request = post({});
                  CimHeaders(request).check_match({});
              }),
              mismatch);
}

TEST(CimxmlHeaders, ManGivesTheHeadersANumber) {
    HttpRequest request = post({{"Man", "\"http://www.dmtf.org/cim/mapping/http/v1.0\" ; ns=73"},
                                {"73-CIMOperation", "MethodCall"}});
    request.method = "M-POST";
    const CimHeaders headers(request);
    headers.check_call();
    HttpResponse response;
    headers.add_operation(response);
    headers.add_error(response, "header-mismatch");
    ASSERT_EQ(response.fields.size(), 4U);
    EXPECT_EQ(response.fields[0].name, "Ext");
    EXPECT_EQ(response.fields[1].value, "http://www.dmtf.org/cim/mapping/http/v1.0;ns=73");
    EXPECT_EQ(response.fields[2].name, "73-CIMOperation");
    EXPECT_EQ(response.fields[3].name, "73-CIMError");
}

TEST(CimxmlHeaders, OtherExtensionsAreNotFollowed) {
    for (const char *man :
         {"", "http://www.example.com/;ns=73", "http://www.dmtf.org/cim/mapping/http/v1.0",
          "http://www.dmtf.org/cim/mapping/http/v1.0;ns=7",
          "http://www.dmtf.org/cim/mapping/http/v1.0;ns=7x"}) {
        EXPECT_EQ(outcome_of([man] {
                      HttpRequest request = post({{"Man", man}});
                      request.method = "M-POST";
                      CimHeaders{request}.check_call();
                  }),
                  (Outcome{510, ""}))
            << man;
    }
}

}  // namespace
}  // namespace velkhost::cimxml
