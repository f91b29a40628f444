// HTTP/1.1 as the server reads and writes it.
#include "host/cimxml/http_reader.h"

#include <gmock/gmock.h>

#include <string>

namespace velkhost::cimxml {
namespace {

using State = HttpReader::State;

constexpr const char *kHead = "POST /cimom HTTP/1.1\r\nHost: a\r\n";

std::string request(const std::string &fields, const std::string &body = "") {
    return kHead + fields + "\r\n" + body;
}

// The status that a connection with these bytes is answered with; 0: a request can be taken.
int status_of(const std::string &bytes, HttpLimits limits = {}) {
    HttpReader reader(limits);
    reader.feed(bytes);
    EXPECT_NE(reader.state(), State::kIncomplete) << bytes;
    return reader.status();
}

TEST(CimxmlHttp, RequestIsReadInAnyPieces) {
    const std::string bytes =
        request("Content-Length: 5\r\nCIMMethod:  GetClass \r\n", "hello") + "GET / HTTP/1.0\r\n";
    for (std::size_t piece = 1; piece < bytes.size(); ++piece) {
        HttpReader reader;
        for (std::size_t at = 0; at < bytes.size(); at += piece) {
            reader.feed(bytes.substr(at, piece));
        }
        ASSERT_EQ(reader.state(), State::kReady) << piece;
        const HttpRequest taken = reader.take();
        EXPECT_EQ(taken.method, "POST");
        EXPECT_EQ(taken.target, "/cimom");
        EXPECT_EQ(taken.body, "hello");
        ASSERT_NE(taken.field("cimmethod"), nullptr);
        EXPECT_EQ(*taken.field("cimmethod"), "GetClass");
        EXPECT_EQ(reader.state(), State::kIncomplete);
        EXPECT_FALSE(reader.is_idle());
        reader.feed("\r\n");
        EXPECT_EQ(reader.state(), State::kReady);
        EXPECT_EQ(reader.take().method, "GET");
        EXPECT_TRUE(reader.is_idle());
    }
}

TEST(CimxmlHttp, ChunksArePutTogether) {
    HttpReader reader;
    reader.feed(request("Transfer-Encoding: Chunked\r\n",
                        "5;x=y\r\nhello\r\n1\r\n \r\n0005\r\nworld\r\n0\r\nTrailer: 1\r\n\r\n"));
    ASSERT_EQ(reader.state(), State::kReady) << reader.error();
    const HttpRequest taken = reader.take();
    EXPECT_EQ(taken.body, "hello world");
    EXPECT_EQ(taken.field("Trailer"), nullptr);
}

TEST(CimxmlHttp, BareLineFeedsEndLines) {
    HttpReader reader;
    reader.feed("POST / HTTP/1.1\nHost: a\nContent-Length: 0\n\n");
    EXPECT_EQ(reader.state(), State::kReady);
}

TEST(CimxmlHttp, WhatIsNoRequestIsRefused) {
    EXPECT_EQ(status_of("nonsense\r\n"), 400);
    EXPECT_EQ(status_of("POST  / HTTP/1.1\r\n"), 400);
    EXPECT_EQ(status_of("PO(ST / HTTP/1.1\r\n"), 400);
    EXPECT_EQ(status_of("POST / HTTP/2.0\r\n"), 505);
    EXPECT_EQ(status_of("POST / XTTP/1.1\r\n"), 400);
    EXPECT_EQ(status_of("POST / HTTP/1.1\r\n\r\n"), 400) << "without Host";
    EXPECT_EQ(status_of(request("a b: c\r\n")), 400);
    EXPECT_EQ(status_of(request("a: \x01\r\n")), 400);
    EXPECT_EQ(status_of(request(" folded\r\n")), 400);
    EXPECT_EQ(status_of(request("")), 411);
    EXPECT_EQ(status_of(request("Content-Length: -1\r\n")), 400);
    EXPECT_EQ(status_of(request("Content-Length: 1\r\nContent-Length: 2\r\n")), 400);
    EXPECT_EQ(status_of(request("Content-Length: 1\r\nTransfer-Encoding: chunked\r\n")), 400);
    EXPECT_EQ(status_of(request("Transfer-Encoding: gzip\r\n")), 501);
    EXPECT_EQ(status_of(request("Expect: more\r\nContent-Length: 1\r\n")), 417);
    EXPECT_EQ(status_of(request("Transfer-Encoding: chunked\r\n", "x\r\n")), 400);
    EXPECT_EQ(status_of(request("Transfer-Encoding: chunked\r\n", "1\r\nab\r\n")), 400);
}

TEST(CimxmlHttp, SizesAreBounded) {
    const HttpLimits limits = {.line = 50, .fields = 100, .body = 10};
    EXPECT_EQ(status_of("POST /" + std::string(60, 'a'), limits), 414);
    EXPECT_EQ(status_of(request("x: " + std::string(60, 'a')), limits), 431);
    const std::string field = "x: " + std::string(40, 'a') + "\r\n";
    EXPECT_EQ(status_of(request(field + field + field), limits), 431);
    EXPECT_EQ(status_of(request("Content-Length: 11\r\n"), limits), 413);
    EXPECT_EQ(status_of(request("Content-Length: 99999999999999999999999\r\n"), limits), 413);
    EXPECT_EQ(status_of(request("Content-Length: 10\r\n", "0123456789"), limits), 0);
    const std::string chunks = "5\r\nhello\r\n6\r\n";
    EXPECT_EQ(status_of(request("Transfer-Encoding: chunked\r\n", chunks), limits), 413);
    for (const char *size : {"B\r\n", "FFFFFFFFFFFFFFFF\r\n", "10000000000000000\r\n"}) {
        EXPECT_EQ(status_of(request("Transfer-Encoding: chunked\r\n", size), limits), 413) << size;
    }
}

TEST(CimxmlHttp, BrokenConnectionStaysBroken) {
    HttpReader reader;
    reader.feed("nonsense\r\n");
    EXPECT_EQ(reader.feed(request("Content-Length: 0\r\n")), State::kBroken);
}

TEST(CimxmlHttp, LeaveIsWantedOnceAndOnlyForABodyToCome) {
    HttpReader reader;
    reader.feed(request("Expect: 100-continue\r\nContent-Length: 2\r\n"));
    EXPECT_TRUE(reader.wants_leave());
    EXPECT_FALSE(reader.wants_leave());
    reader.feed("ab");
    reader.take();
    reader.feed(request("Expect: 100-continue\r\nContent-Length: 2\r\n", "ab"));
    EXPECT_FALSE(reader.wants_leave());
}

TEST(CimxmlHttp, ConnectionEndsAsTheVersionsHaveIt) {
    HttpRequest request;
    EXPECT_TRUE(request.keeps_connection());
    request.fields = {{"Connection", "TE, Close"}};
    EXPECT_FALSE(request.keeps_connection());
    request.minor_version = 0;
    request.fields = {};
    EXPECT_FALSE(request.keeps_connection());
    request.fields = {{"Connection", "Keep-Alive, TE"}};
    EXPECT_TRUE(request.keeps_connection());
}

TEST(CimxmlHttp, ResponseHasLengthAndEnd) {
    HttpResponse response = bare_response(404);
    response.body = "abc";
    response.close = true;
    EXPECT_EQ(response.bytes(),
              "HTTP/1.1 404 Not Found\r\nContent-Length: 3\r\nConnection: close\r\n\r\nabc");
}

}  // namespace
}  // namespace velkhost::cimxml
