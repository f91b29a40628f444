// Every misuse of the broker's objects has a name.
#include "broker_testing.h"

#include <algorithm>
#include <semaphore>
#include <thread>

extern "C" CMPIContext *native_clone_CMPIContext(const CMPIContext *context);

namespace velkhost::broker::testing {
namespace {

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

class BrokerLedger : public BrokerTest {
  protected:
    // The one finding there is, which is then taken away.
    std::string only_finding() {
        const std::vector<Finding> findings = broker.ledger().findings();
        broker.ledger().clear_findings();
        EXPECT_EQ(findings.size(), 1U);
        return findings.empty() ? "" : to_text(findings.front());
    }
    void expect_finding(const std::string &start) {
        const std::string finding = only_finding();
        EXPECT_EQ(finding.find(start), 0U) << finding;
    }
    void serve_methods(ScriptedProvider::Invoke invoke) {
        provider.invoke = std::move(invoke);
        broker.register_provider(kNamespace, "Test_Service", provider.methods());
    }
    void run() { EXPECT_EQ(broker.invoke_method(path_of("Test_Service"), "Run").status, Status{}); }
};

// -- Clones --

TEST_F(BrokerLedger, CloneThatIsNeverReleasedIsALeakReportedOnce) {
    CMPIObjectPath *path = new_path("Test_Service");
    CMPIObjectPath *copy = path->ft->clone(path, nullptr);
    EXPECT_EQ(broker.ledger().live_clones(), 1U);
    broker.ledger().report_leaks();
    broker.ledger().report_leaks();
    expect_finding("clone-never-released: CMPIObjectPath made by clone (Test_Service) on thread ");
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
    EXPECT_EQ(broker.ledger().live_clones(), 0U);
}

TEST_F(BrokerLedger, ContextCloneThatIsNeverReleasedIsALeak) {
    CMPIContext *copy = nullptr;
    in_request([&copy](const CMPIContext *context) { copy = native_clone_CMPIContext(context); });
    broker.ledger().report_leaks();
    expect_finding("clone-never-released: CMPIContext made by native_clone_CMPIContext on thread");
    copy->ft->release(copy);
}

TEST_F(BrokerLedger, CloneMayBeReleasedByAnotherThread) {
    CMPIString *string = make().newString(cmpi, "x", nullptr);
    CMPIString *copy = string->ft->clone(string, nullptr);
    std::thread([copy] { EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK); }).join();
    EXPECT_EQ(broker.ledger().report(), "");
}

// -- Release --

TEST_F(BrokerLedger, SecondReleaseOfACloneIsNamed) {
    CMPIString *string = make().newString(cmpi, "x", nullptr);
    CMPIString *copy = string->ft->clone(string, nullptr);
    copy->ft->release(copy);
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_ERR_INVALID_HANDLE);
    expect_finding("second-release: CMPIString made by clone (x) on thread ");
}

TEST_F(BrokerLedger, TrackedObjectMayBeReleasedEarlyButOnce) {
    CMPIObjectPath *path = new_path("Test_Service");
    EXPECT_EQ(path->ft->release(path).rc, CMPI_RC_OK);
    EXPECT_EQ(broker.ledger().report(), "");
    path->ft->release(path);
    expect_finding("second-release: CMPIObjectPath made by newObjectPath (Test_Service)");
}

TEST_F(BrokerLedger, TrackedObjectBelongsToTheThreadThatMadeIt) {
    CMPIObjectPath *path = new_path("Test_Service");
    std::thread([path] { path->ft->release(path); }).join();
    expect_finding("release-on-foreign-thread: CMPIObjectPath made by newObjectPath");
    EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 0U);
    EXPECT_EQ(broker.ledger().report(), "");
}

TEST_F(BrokerLedger, ReleasedArgumentsOfACallAreNamedAndStay) {
    serve_methods([this](const CMPIContext *context, const CMPIResult *result,
                         const CMPIObjectPath *path, const char *, const CMPIArgs *in,
                         CMPIArgs *out) {
        EXPECT_EQ(path->ft->release(const_cast<CMPIObjectPath *>(path)).rc, CMPI_RC_ERR_FAILED);
        expect_finding("argument-released: CMPIObjectPath made by a provider call (Test_Service)");
        EXPECT_EQ(in->ft->release(const_cast<CMPIArgs *>(in)).rc, CMPI_RC_OK);
        EXPECT_EQ(out->ft->release(out).rc, CMPI_RC_OK);
        EXPECT_EQ(context->ft->release(const_cast<CMPIContext *>(context)).rc, CMPI_RC_OK);
        EXPECT_EQ(result->ft->release(const_cast<CMPIResult *>(result)).rc, CMPI_RC_OK);
        EXPECT_EQ(take_findings(), std::vector(4, FindingKind::kArgumentReleased));
        EXPECT_EQ(context->ft->getEntryCount(context, nullptr), 3U);
        return result->ft->returnDone(result);
    });
    run();
}

// -- Use --

TEST_F(BrokerLedger, UseAfterReleaseIsNamedWithTheFunction) {
    CMPIArgs *args = make().newArgs(cmpi, nullptr);
    args->ft->release(args);
    CMPIStatus status{};
    args->ft->getArg(args, "URI", &status);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
    const std::string finding = only_finding();
    EXPECT_NE(finding.find("use-after-release: CMPIArgs made by newArgs"), std::string::npos);
    EXPECT_NE(finding.find("was used by getArg after it was released"), std::string::npos);
}

TEST_F(BrokerLedger, TrackedObjectEndsWithItsRequest) {
    CMPIObjectPath *kept = nullptr;
    serve_methods([this, &kept](const auto *, const auto *, const auto *, const char *,
                                const auto *, auto *) {
        kept = new_path("Test_Service");
        return ok();
    });
    run();
    EXPECT_EQ(kept->ft->getKeyCount(kept, nullptr), 0U);
    const std::string finding = only_finding();
    EXPECT_NE(finding.find("use-after-release"), std::string::npos);
    EXPECT_NE(finding.find("after its owner's end had freed it"), std::string::npos);
}

TEST_F(BrokerLedger, CloneOutlivesItsRequest) {
    CMPIObjectPath *kept = nullptr;
    serve_methods([&kept](const auto *, const auto *, const CMPIObjectPath *path, const char *,
                          const auto *, auto *) {
        kept = path->ft->clone(path, nullptr);
        return ok();
    });
    run();
    EXPECT_EQ(text(kept->ft->getClassName(kept, nullptr)), "Test_Service");
    kept->ft->release(kept);
}

TEST_F(BrokerLedger, ArgumentsUsedAfterTheCallAreNamed) {
    const CMPIContext *context = nullptr;
    const CMPIArgs *arguments = nullptr;
    serve_methods([&](const CMPIContext *given, const auto *, const auto *, const char *,
                      const CMPIArgs *in, auto *) {
        context = given;
        arguments = in;
        return ok();
    });
    run();
    EXPECT_EQ(native_clone_CMPIContext(context), nullptr);
    expect_finding("argument-used-after-call: CMPIContext made by a provider call (context)");
    arguments->ft->getArg(arguments, "URI", nullptr);
    expect_finding("argument-used-after-call: CMPIArgs made by a provider call (arguments)");
}

TEST_F(BrokerLedger, CalleesObjectsEndWithItsCallButNotTheCallers) {
    CMPIObjectPath *callees = nullptr;
    serve_methods([this, &callees](const auto *, const auto *, const auto *, const char *,
                                   const auto *, auto *) {
        callees = new_path("Test_Base");
        return ok();
    });
    in_request([&](const CMPIContext *context) {
        CMPIObjectPath *own = new_path("Test_Service");
        cmpi->bft->invokeMethod(cmpi, context, own, "Run", nullptr, nullptr, nullptr);
        EXPECT_EQ(text(own->ft->getClassName(own, nullptr)), "Test_Service");
        callees->ft->getKeyCount(callees, nullptr);
        EXPECT_EQ(take_findings(), std::vector{FindingKind::kUseAfterRelease});
    });
}

// -- Threads of a provider --

TEST_F(BrokerLedger, EnumerationThatOutlivesItsThreadIsNamed) {
    in_request([this](const CMPIContext *context) {
        std::thread([this, context] {
            cmpi->bft->enumerateInstances(cmpi, context, new_path("Test_Service"), nullptr,
                                          nullptr);
        }).join();
        const std::string finding = only_finding();
        EXPECT_EQ(finding.find("enumeration-alive-at-thread-end: CMPIEnumeration made by "
                               "enumerateInstances (Test_Service) on thread "),
                  0U)
            << finding;
    });
}

TEST_F(BrokerLedger, EnumerationThatIsReleasedOrThatARequestLeavesIsFine) {
    in_request([this](const CMPIContext *context) {
        std::thread([this, context] {
            CMPIEnumeration *found = cmpi->bft->enumerateInstances(
                cmpi, context, new_path("Test_Service"), nullptr, nullptr);
            found->ft->release(found);
            new_path("Test_Base");
        }).join();
        cmpi->bft->enumerateInstances(cmpi, context, new_path("Test_Service"), nullptr, nullptr);
    });
    EXPECT_EQ(broker.ledger().report(), "");
}

TEST_F(BrokerLedger, DetachedThreadThatOutlivesItsRequestIsAccountedFor) {
    std::binary_semaphore go(0);
    std::binary_semaphore done(0);
    struct Signal {
        std::binary_semaphore *done = nullptr;
        ~Signal() { done->release(); }
    };
    serve_methods([&](const CMPIContext *context, const auto *, const auto *, const char *,
                      const auto *, auto *) {
        CMPIContext *own = native_clone_CMPIContext(context);
        std::thread([this, own, &go, &done] {
            // Made before the thread's page of the ledger, so it goes after it.
            thread_local Signal signal;
            signal.done = &done;
            go.acquire();
            CMPIStatus status{};
            CMPIEnumeration *found = cmpi->bft->enumerateInstances(
                cmpi, own, new_path("Test_Service"), nullptr, &status);
            EXPECT_EQ(status.rc, CMPI_RC_OK);
            found->ft->release(found);
            CMPIArray *left = make().newArray(cmpi, 3, CMPI_uint16, nullptr);
            left->ft->clone(left, nullptr);
            own->ft->release(own);
        }).detach();
        return ok();
    });
    run();
    go.release();
    done.acquire();
    EXPECT_EQ(broker.ledger().report(), "");
    broker.ledger().report_leaks();
    expect_finding("clone-never-released: CMPIArray made by clone (uint16) on thread ");
}

// -- The books themselves --

TEST_F(BrokerLedger, FindingCarriesTheThreadThatDidIt) {
    CMPIObjectPath *path = new_path("Test_Service");
    std::thread([path] { path->ft->release(path); }).join();
    const std::vector<Finding> findings = broker.ledger().findings();
    ASSERT_EQ(findings.size(), 1U);
    const std::string by = ", by thread " + std::to_string(findings[0].thread);
    EXPECT_NE(findings[0].text.find(by), std::string::npos) << findings[0].text;
    broker.ledger().clear_findings();
}

TEST_F(BrokerLedger, EveryKindHasANameOfItsOwn) {
    std::vector<std::string_view> names;
    for (int kind = 0; kind <= static_cast<int>(FindingKind::kUnsafeCall); ++kind) {
        const std::string_view name = finding_name(static_cast<FindingKind>(kind));
        EXPECT_NE(name, "unknown");
        EXPECT_EQ(std::count(names.begin(), names.end(), name), 0) << name;
        names.push_back(name);
    }
}

TEST_F(BrokerLedger, ShutdownReportsLeaks) {
    CMPIString *string = make().newString(cmpi, "x", nullptr);
    string->ft->clone(string, nullptr);
    broker.shutdown();
    expect_finding("clone-never-released: CMPIString made by clone (x)");
}

TEST(BrokerLooseLedger, ReleasesAtOnceAndStillFindsLeaks) {
    Broker broker({.name = "loose", .provider_folders = {}, .strict_ledger = false});
    const CMPIBroker *cmpi = broker.cmpi();
    CMPIArray *array = cmpi->eft->newArray(cmpi, 1, CMPI_string, nullptr);
    CMPIValue value{};
    value.string = cmpi->eft->newString(cmpi, "x", nullptr);
    array->ft->setElementAt(array, 0, &value, CMPI_string);
    CMPIArray *copy = array->ft->clone(array, nullptr);
    array->ft->release(array);
    broker.ledger().report_leaks();
    EXPECT_EQ(broker.ledger().findings().size(), 1U);
    copy->ft->release(copy);
}

TEST(BrokerLooseLedger, ObjectsOfABrokerThatEndsAreFreed) {
    for (const bool strict : {false, true}) {
        Broker broker({.name = "ends", .provider_folders = {}, .strict_ledger = strict});
        const CMPIBroker *cmpi = broker.cmpi();
        CMPIArray *array = cmpi->eft->newArray(cmpi, 1, CMPI_chars, nullptr);
        array->ft->setElementAt(array, 0, reinterpret_cast<const CMPIValue *>("x"), CMPI_chars);
        array->ft->clone(array, nullptr);
    }
}

TEST(BrokerLooseLedger, QuarantineIsBounded) {
    Broker broker;
    const CMPIBroker *cmpi = broker.cmpi();
    for (std::size_t i = 0; i < Ledger::kQuarantine + 100; ++i) {
        CMPIArgs *args = cmpi->eft->newArgs(cmpi, nullptr);
        args->ft->release(args);
    }
    EXPECT_EQ(broker.ledger().report(), "");
}

}  // namespace
}  // namespace velkhost::broker::testing
