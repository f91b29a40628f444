// Requests one after the other, and at the same time: what one leaves to the next.

#include "tests/conformance/request_test.h"

namespace {

using velktest::entry;
using Texts = std::vector<std::string>;
namespace cim = velktest::cim;

class RequestSequence : public velktest::RequestTest {
  protected:
    void expect_refused() {
        const auto reply = install({uri()});
        EXPECT_EQ(reply.status.code, 1);
        EXPECT_EQ(reply.status.message, "An installation process is running");
    }
};

#ifdef __SANITIZE_THREAD__
constexpr bool kSeesRaces = true;
#else
constexpr bool kSeesRaces = false;
#endif

}  // namespace

TEST_F(RequestSequence, SecondRequestIsRefusedUntilTheFirstHasEnded) {
    const std::string uefi = add({.file = "uefi"});
    show({"0x00|Initialization", velktest::kJobDone});
    ASSERT_NO_FATAL_FAILURE(start({uefi}));
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(host().value("Velkchild_thread_num"), 1);
        expect_refused();
        host().pause(4.5);
    }
    EXPECT_DOUBLE_EQ(host().now(), 19);
    expect_refused();
    EXPECT_TRUE(host().wait_until_idle());
    EXPECT_EQ(results(), Texts{installed("uefi")}) << "the refused ones changed nothing";
    EXPECT_EQ(host().value("Velkchild_thread_num"), 0);
    show_done(1);
    run({uefi});
    EXPECT_THAT(history().back(), testing::HasSubstr("velkstatVELK-2.txt 1|" + installed("uefi")));
}

// The guard reads a counter that the install thread raises once it runs: requests that arrive
// before that pass it together.
TEST_F(RequestSequence, RequestsWithinTheFirstSecondBothPassTheGuard) {
    if (kSeesRaces) {
        GTEST_SKIP() << "both requests write the package table, which has no lock";
    }
    const std::string uefi = add({.file = "uefi"});
    show_done(2);
    std::thread second;
    std::optional<velkhost::broker::MethodReply> second_reply;
    std::atomic<int> jobs{0};
    host().create_job() = [&](char *id, int size, const char *) {
        const int number = ++jobs;
        if (number == 1) {
            second = std::thread([&] { second_reply = install({uri(uefi)}); });
            host().pause(0.5);
        }
        std::snprintf(id, static_cast<std::size_t>(size), "VELK-%d", number);
        return 0;
    };
    const auto first_reply = install({uri(uefi)});
    second.join();
    EXPECT_EQ(first_reply.return_value, cim::Value::uint32(4096));
    ASSERT_TRUE(second_reply);
    EXPECT_EQ(second_reply->return_value, cim::Value::uint32(4096));
    EXPECT_EQ(host().value("Velkchild_thread_num"), 2);
    expect_refused();
    EXPECT_TRUE(host().wait_until_idle());
    EXPECT_EQ(orders().size(), 2U);
}

TEST_F(RequestSequence, ReportsBeforeTheJobGoToTheFormerJobsFile) {
    run({"file:///no/a.xml"});
    run({"file:///no/b.xml"});
    EXPECT_EQ(history(), (Texts{
                             "0 velkstat.txt 0|",
                             "0 velkstatVELK-1.txt 1|" + unreadable("a") + "|",
                             "2 velkstatVELK-1.txt 0|" + initialized("b") + "|",
                             "2 velkstatVELK-2.txt 1|" + unreadable("b") + "|",
                         }));
}

// -- What stays in the table --

TEST_F(RequestSequence, LaterRecordsKeepTheTailOfALongerLocation) {
    const Texts first = {"file:///no/a-long-name.xml", "file:///no/another-long-name.xml"};
    const Texts second = {"file:///no/c.xml", "file:///no/d.xml"};
    run(first);
    run(second);
    EXPECT_EQ(std::string(record(0).TFTPXMLPkgURIs), second[0]) << "cleared for each request";
    EXPECT_EQ(std::string(record(1).TFTPXMLPkgURIs), second[1] + first[1].substr(second[1].size()));
    EXPECT_EQ(results(), (Texts{unreadable("c"), unreadable("d.xmler-long-name")}));
}

TEST_F(RequestSequence, EmptyElementKeepsTheWholeFormerLocation) {
    run({"file:///no/a.xml", "file:///no/b.xml"});
    run({"file:///no/c.xml", ""});
    EXPECT_EQ(std::string(record(1).TFTPXMLPkgURIs), "file:///no/b.xml");
}

TEST_F(RequestSequence, RecordsBeyondThePackagesOfARequestStay) {
    run({"file:///no/a.xml", "file:///no/b.xml", "file:///no/c.xml"});
    run({"file:///no/d.xml"});
    EXPECT_EQ(host().value("pkgnum"), 1);
    EXPECT_EQ(std::string(record(2).TFTPXMLPkgURIs), "file:///no/c.xml");
    EXPECT_EQ(std::string(record(2).installResult), unreadable("c"));
}

TEST_F(RequestSequence, UnreadablePackageWithoutAFormerOneHasNoInstaller) {
    run({"file:///no/a.xml"});
    EXPECT_EQ(record(0).OrderFlag, 1002);
    EXPECT_EQ(results(), Texts{unreadable("a")});
    EXPECT_EQ(velktest::occurrences(host().log(), "Begin to Deploy.\n"), 1);
    EXPECT_EQ(host().up_calls(), (Texts{deletion("file:///no/a.xml"), deletion("file:///no/")}));
}

TEST_F(RequestSequence, UnreadablePackageGoesToTheInstallerOfTheFormerOne) {
    const std::string uefi = add({.file = "uefi"});
    const std::string diagnostics = add({.file = "diag", .category = "Diagnostics"});
    show_done(2);
    run({uefi, diagnostics});
    std::filesystem::remove(host().folder() / "diag.xml");
    show_done(2);
    run({uefi, diagnostics});
    EXPECT_EQ(record(1).OrderFlag, 1002);
    EXPECT_EQ(orders().back(), "file://" + host().folder().string() + "/")
        << "the payload's directory, as no descriptor named the payload";
    EXPECT_EQ(results(), (Texts{installed("uefi"), installed("diag")}));
}

TEST_F(RequestSequence, UpdateArgsOfAnEarlierRequestHoldForOneWithout) {
    const std::string uefi = add({.file = "uefi"});
    show_done(2);
    install({uri(uefi), update_args("--backup --no-reboot")});
    ASSERT_TRUE(host().wait_until_idle());
    run({uefi});
    for (const auto &order : host().controller().orders) {
        EXPECT_EQ(order.update_operation, 1);
        EXPECT_EQ(order.reboot_option, 0);
    }
    EXPECT_EQ(orders().size(), 2U);
}

TEST_F(RequestSequence, SynchronousRequestEndsAllLaterInstalls) {
    const std::string uefi = add({.file = "uefi"});
    show_done(1);
    run({uefi});
    install({uri(uefi), options({32768})});
    const auto reply = install({uri(uefi)});
    EXPECT_TRUE(reply.status.ok());
    EXPECT_FALSE(reply.return_value);
    EXPECT_EQ(orders().size(), 1U);
    EXPECT_THAT(history().back(), testing::HasSubstr("velkstatVELK-1.txt")) << "the former job's";
}
