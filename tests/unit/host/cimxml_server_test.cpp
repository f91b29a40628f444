// The server on sockets: many clients, slow ones, bad ones, and its end.
#include "cimxml_client.h"
#include "cimxml_fixture.h"
#include "host/cimxml/server.h"

#include <atomic>
#include <semaphore>
#include <thread>

namespace velkhost::cimxml::testing {
namespace {

using ::testing::AllOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

class CimxmlServer : public EndpointTest {
  protected:
    Server &server(ServerOptions options = {}) {
        return running_.emplace(endpoint, std::move(options));
    }
    Client client() { return Client(running_->address().port); }

    static std::string in_http(const HttpRequest &request, const std::string &more = "") {
        std::string text = "POST " + request.target + " HTTP/1.1\r\n";
        for (const HttpField &field : request.fields) {
            text += field.name + ": " + field.value + "\r\n";
        }
        return text + more + "Content-Length: " + std::to_string(request.body.size()) + "\r\n\r\n" +
               request.body;
    }
    static std::string names(const std::string &more = "") {
        return in_http(post("EnumerateClassNames", kNamespace,
                            message(std::string("<IMETHODCALL NAME=\"EnumerateClassNames\">") +
                                    kPlace + "</IMETHODCALL>")),
                       more);
    }
    static std::string echo() {
        const std::string path = std::string("<LOCALCLASSPATH>") + kPlace +
                                 "<CLASSNAME NAME=\"Test_Thing\"/></LOCALCLASSPATH>";
        return in_http(post("Echo", std::string(kNamespace) + ":Test_Thing",
                            message("<METHODCALL NAME=\"Echo\">" + path + "</METHODCALL>")));
    }
    static auto answered() {
        return AllOf(StartsWith("HTTP/1.1 200 OK\r\n"), HasSubstr("Test_Root"));
    }

    void TearDown() override {
        running_.reset();
        EndpointTest::TearDown();
    }

    std::optional<Server> running_;
};

TEST_F(CimxmlServer, ConnectionServesOneRequestAfterTheOther) {
    server();
    Client client = this->client();
    for (int i = 0; i < 3; ++i) {
        client.send(names());
        EXPECT_THAT(client.receive(), answered());
    }
    EXPECT_EQ(running_->answered(), 3U);
}

TEST_F(CimxmlServer, RequestsSentAtOnceAreAnsweredInOrder) {
    server();
    Client client = this->client();
    client.send(names() + "GET / HTTP/1.1\r\nHost: a\r\n\r\n" + names());
    EXPECT_THAT(client.receive(), answered());
    EXPECT_THAT(client.receive(), StartsWith("HTTP/1.1 405 "));
    EXPECT_THAT(client.receive(), answered());
}

TEST_F(CimxmlServer, RequestMayComeByteByByte) {
    server();
    Client client = this->client();
    for (const char byte : names()) {
        client.send({&byte, 1});
    }
    EXPECT_THAT(client.receive(), answered());
}

TEST_F(CimxmlServer, ConnectionIsClosedWhenTheClientWantsIt) {
    server();
    Client client = this->client();
    client.send(names("Connection: close\r\n"));
    EXPECT_THAT(client.receive(), AllOf(answered(), HasSubstr("Connection: close")));
    EXPECT_TRUE(client.at_end());
}

TEST_F(CimxmlServer, ClientThatOnlyHalfClosesIsAnswered) {
    server();
    Client client = this->client();
    client.send(names());
    client.end_sending();
    EXPECT_THAT(client.receive(), answered());
    EXPECT_TRUE(client.at_end());
}

TEST_F(CimxmlServer, LeaveToSendTheBodyIsGiven) {
    server();
    Client client = this->client();
    const std::string request = names("Expect: 100-continue\r\n");
    const std::size_t head = request.find("\r\n\r\n") + 4;
    client.send(request.substr(0, head));
    EXPECT_EQ(client.receive(), "HTTP/1.1 100 Continue\r\n\r\n");
    client.send(request.substr(head));
    EXPECT_THAT(client.receive(), answered());
}

TEST_F(CimxmlServer, NonsenseEndsItsConnectionAndNothingElse) {
    server();
    Client good = client();
    for (const char *nonsense : {"\r\n\r\nnonsense\r\n\r\n", "\x16\x03\x01\x02\n", "GET\n"}) {
        Client bad = client();
        bad.send(nonsense);
        EXPECT_THAT(bad.receive(), StartsWith("HTTP/1.1 400 "));
        EXPECT_TRUE(bad.at_end());
    }
    good.send(names());
    EXPECT_THAT(good.receive(), answered());
}

TEST_F(CimxmlServer, BodyThatIsTooLongIsRefusedBeforeItIsSent) {
    server({.limits = {.line = 1000, .fields = 4000, .body = 2000}});
    Client client = this->client();
    client.send("POST /cimom HTTP/1.1\r\nHost: a\r\nContent-Length: 2001\r\n\r\n");
    client.send(std::string(2001, 'x'));
    EXPECT_THAT(client.receive(), StartsWith("HTTP/1.1 413 "));
    EXPECT_TRUE(client.at_end());
}

TEST_F(CimxmlServer, ClientsThatLeaveEarlyAreForgotten) {
    server({.connections = 4});
    for (int i = 0; i < 50; ++i) {
        Client leaving = client();
        leaving.send(names().substr(0, static_cast<std::size_t>(i) * 7));
        leaving.end_sending();
        EXPECT_TRUE(leaving.at_end()) << i;
    }
    Client staying = client();
    staying.send(names());
    EXPECT_THAT(staying.receive(), answered());
}

TEST_F(CimxmlServer, ConnectionsBeyondTheBoundAreToldSo) {
    server({.connections = 2});
    Client first = client();
    Client second = client();
    first.send(names());
    EXPECT_THAT(first.receive(), answered());
    second.send(names());
    EXPECT_THAT(second.receive(), answered());
    Client third = client();
    EXPECT_THAT(third.receive(), StartsWith("HTTP/1.1 503 "));
}

TEST_F(CimxmlServer, SilentConnectionsAreClosed) {
    server({.idle_ms = 0, .request_ms = 0});
    Client silent = client();
    EXPECT_TRUE(silent.at_end());
    Client half = client();
    half.send("POST /cimom HTTP/1.1\r\n");
    EXPECT_TRUE(half.at_end());
}

TEST_F(CimxmlServer, SlowRequestsHoldUpNoOthers) {
    std::counting_semaphore<8> entered(0);
    std::counting_semaphore<8> leave(0);
    provider.invoke = [&](const auto *, const auto *, const auto *, const char *, const auto *,
                          auto *) {
        entered.release();
        leave.acquire();
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    server({.workers = 3});
    Client slow = client();
    Client slower = client();
    slow.send(echo());
    slower.send(echo());
    entered.acquire();
    entered.acquire();
    EXPECT_EQ(running_->active(), 2U);
    Client quick = client();
    quick.send(names());
    EXPECT_THAT(quick.receive(), answered());
    leave.release(2);
    EXPECT_THAT(slow.receive(), StartsWith("HTTP/1.1 200 "));
    EXPECT_THAT(slower.receive(), StartsWith("HTTP/1.1 200 "));
}

TEST_F(CimxmlServer, WhatIsUnderWayIsAnsweredAtTheEnd) {
    std::binary_semaphore entered(0);
    std::binary_semaphore leave(0);
    provider.invoke = [&](const auto *, const auto *, const auto *, const char *, const auto *,
                          auto *) {
        entered.release();
        leave.acquire();
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    server();
    Client busy = client();
    Client idle = client();
    busy.send(echo());
    entered.acquire();
    running_->close();
    EXPECT_TRUE(idle.at_end());
    leave.release();
    EXPECT_THAT(busy.receive(), AllOf(StartsWith("HTTP/1.1 200 "), HasSubstr("Connection: close")));
    EXPECT_TRUE(busy.at_end());
    const std::uint16_t port = running_->address().port;
    running_.reset();
    EXPECT_FALSE(Client(port).connected());
}

TEST_F(CimxmlServer, ManyClientsAtOnceAreAllAnswered) {
    server({.workers = 4});
    std::atomic<int> good = 0;
    std::vector<std::thread> threads;
    for (int i = 0; i < 16; ++i) {
        threads.emplace_back([&] {
            Client client = this->client();
            for (int j = 0; j < 10; ++j) {
                client.send(names());
                good += client.receive().starts_with("HTTP/1.1 200 ") ? 1 : 0;
            }
        });
    }
    for (std::thread &thread : threads) {
        thread.join();
    }
    EXPECT_EQ(good, 160);
    EXPECT_EQ(running_->answered(), 160U);
}

TEST(CimxmlListener, AddressesAreNumbersWithAPort) {
    EXPECT_EQ(ListenAddress::parse("127.0.0.1:5988").text(), "127.0.0.1:5988");
    EXPECT_EQ(ListenAddress::parse("localhost:0").text(), "127.0.0.1:0");
    EXPECT_EQ(ListenAddress::parse("[::1]:80").text(), "[::1]:80");
    for (const char *bad : {"", "127.0.0.1", "127.0.0.1:", "127.0.0.1:65536", "127.0.0.1:x",
                            "::1:80", "[127.0.0.1]:80", "host.example:80", "[::1:80", ":80"}) {
        EXPECT_THROW(ListenAddress::parse(bad), ListenError) << bad;
    }
}

TEST(CimxmlListener, OnlyTheLoopbackIsLoopback) {
    for (const char *loopback : {"127.0.0.1:1", "127.9.9.9:1", "[::1]:1"}) {
        EXPECT_TRUE(ListenAddress::parse(loopback).is_loopback()) << loopback;
    }
    for (const char *other : {"0.0.0.0:1", "128.0.0.1:1", "[::]:1", "192.168.0.1:1"}) {
        EXPECT_FALSE(ListenAddress::parse(other).is_loopback()) << other;
    }
}

TEST_F(CimxmlServer, AddressThatIsTakenIsAnError) {
    const ListenAddress taken = server().address();
    EXPECT_THROW(Server(endpoint, {.address = taken}), ListenError);
}

}  // namespace
}  // namespace velkhost::cimxml::testing
