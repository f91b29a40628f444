// Contexts: entries, and the ways to take them into another thread.
#include "broker_testing.h"

#include <dlfcn.h>

#include <thread>

extern "C" CMPIContext *native_clone_CMPIContext(const CMPIContext *context);

namespace velkhost::broker::testing {
namespace {

using BrokerContext = BrokerTest;

std::string principal_of(const CMPIContext *context) {
    const CMPIData data = context->ft->getEntry(context, "CMPIPrincipal", nullptr);
    return static_cast<const char *>(data.value.string->hdl);
}

TEST_F(BrokerContext, RequestsCarryPrincipalFlagsAndSession) {
    in_request([](const CMPIContext *context) {
        EXPECT_EQ(principal_of(context), "root");
        const CMPIData flags = context->ft->getEntry(context, "CMPIInvocationFlags", nullptr);
        EXPECT_EQ(flags.type, CMPI_uint32);
        EXPECT_EQ(flags.value.uint32, 0U);
        const CMPIData session = context->ft->getEntry(context, "CMPISessionId", nullptr);
        EXPECT_EQ(session.type, CMPI_uint32);
        EXPECT_GT(session.value.uint32, 0U);
        EXPECT_EQ(context->ft->getEntryCount(context, nullptr), 3U);
    });
}

TEST_F(BrokerContext, AbsentEntryIsNoSuchPropertyWithAnUndefinedValue) {
    in_request([](const CMPIContext *context) {
        CMPIStatus status{};
        const CMPIData data = context->ft->getEntry(context, "Nope", &status);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
        EXPECT_EQ(data.type, CMPI_null);
        EXPECT_EQ(data.state, CMPI_nullValue);
        EXPECT_NE(data.value.string, nullptr);
        context->ft->getEntryAt(context, 99, nullptr, &status);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    });
}

TEST_F(BrokerContext, EntryNamesKeepTheirCaseApart) {
    in_request([this](const CMPIContext *context) {
        context->ft->addEntry(context, "Key", chars("upper"), CMPI_chars);
        context->ft->addEntry(context, "key", chars("lower"), CMPI_chars);
        EXPECT_EQ(text(context->ft->getEntry(context, "Key", nullptr)), "upper");
        EXPECT_EQ(text(context->ft->getEntry(context, "key", nullptr)), "lower");
        CMPIStatus status{};
        context->ft->getEntry(context, "KEY", &status);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    });
}

TEST_F(BrokerContext, EntryIsReplacedByNameAndReadByIndex) {
    in_request([this](const CMPIContext *context) {
        const CMPICount before = context->ft->getEntryCount(context, nullptr);
        context->ft->addEntry(context, "Key", chars("one"), CMPI_chars);
        context->ft->addEntry(context, "Key", chars("two"), CMPI_chars);
        EXPECT_EQ(context->ft->getEntryCount(context, nullptr), before + 1);
        CMPIString *name = nullptr;
        EXPECT_EQ(text(context->ft->getEntryAt(context, before, &name, nullptr)), "two");
        EXPECT_EQ(text(name), "Key");
    });
}

TEST_F(BrokerContext, EntryWithoutAValueIsAFinding) {
    in_request([this](const CMPIContext *context) {
        context->ft->addEntry(context, "Key", nullptr, CMPI_uint32);
        EXPECT_EQ(take_findings(), std::vector{FindingKind::kUnsafeCall});
        context->ft->addEntry(context, "Key", nullptr, CMPI_chars);
        EXPECT_EQ(take_findings(), std::vector<FindingKind>{});
    });
}

// -- Into another thread --

TEST_F(BrokerContext, CloneSlotIsNotSupported) {
    in_request([](const CMPIContext *context) {
        CMPIStatus status{};
        EXPECT_EQ(context->ft->clone(context, &status), nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
    });
}

TEST_F(BrokerContext, NativeCloneIsExported) {
    EXPECT_NE(::dlsym(RTLD_DEFAULT, "native_clone_CMPIContext"), nullptr);
}

TEST_F(BrokerContext, NativeCloneOutlivesTheRequest) {
    CMPIContext *copy = nullptr;
    in_request([&copy](const CMPIContext *context) { copy = native_clone_CMPIContext(context); });
    std::thread([copy] { EXPECT_EQ(principal_of(copy), "root"); }).join();
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
}

TEST_F(BrokerContext, NativeCloneCanBeMadeInTheNewThread) {
    in_request([](const CMPIContext *context) {
        std::thread([context] {
            CMPIContext *copy = native_clone_CMPIContext(context);
            EXPECT_EQ(principal_of(copy), "root");
            copy->ft->release(copy);
        }).join();
    });
}

TEST_F(BrokerContext, NativeCloneOfNothingIsNull) {
    EXPECT_EQ(native_clone_CMPIContext(nullptr), nullptr);
}

TEST_F(BrokerContext, ClonedNullEntriesStayAndAddedOnesAreItsOwn) {
    in_request([this](const CMPIContext *context) {
        CMPIContext *copy = native_clone_CMPIContext(context);
        copy->ft->addEntry(copy, "rerouteToProvider", chars("other"), CMPI_chars);
        EXPECT_EQ(copy->ft->getEntryCount(copy, nullptr), 4U);
        EXPECT_EQ(context->ft->getEntryCount(context, nullptr), 3U);
        copy->ft->release(copy);
    });
}

TEST_F(BrokerContext, DetachThreadReleasesThePreparedContext) {
    in_request([this](const CMPIContext *context) {
        CMPIContext *prepared = cmpi->bft->prepareAttachThread(cmpi, context);
        ASSERT_NE(prepared, nullptr);
        std::thread([this, prepared] {
            EXPECT_EQ(cmpi->bft->attachThread(cmpi, prepared).rc, CMPI_RC_OK);
            EXPECT_EQ(principal_of(prepared), "root");
            EXPECT_EQ(cmpi->bft->detachThread(cmpi, prepared).rc, CMPI_RC_OK);
        }).join();
    });
    EXPECT_EQ(broker.ledger().live_clones(), 0U);
}

TEST_F(BrokerContext, ReleaseAfterDetachIsASecondRelease) {
    in_request([this](const CMPIContext *context) {
        CMPIContext *prepared = cmpi->bft->prepareAttachThread(cmpi, context);
        cmpi->bft->detachThread(cmpi, prepared);
        prepared->ft->release(prepared);
        EXPECT_EQ(take_findings(), std::vector{FindingKind::kSecondRelease});
    });
}

// -- What up-calls ask of it --

TEST_F(BrokerContext, UpCallWithoutAContextFailsAndIsAFinding) {
    CMPIStatus status{};
    EXPECT_EQ(
        cmpi->bft->enumerateInstances(cmpi, nullptr, new_path("Test_Service"), nullptr, &status),
        nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(take_findings(), std::vector{FindingKind::kUnsafeCall});
}

TEST_F(BrokerContext, UpCallsCarryThePrincipalOn) {
    std::string seen;
    provider.invoke = [&seen](const CMPIContext *context, const auto *, const auto *, const char *,
                              const auto *, auto *) {
        seen = principal_of(context);
        return CMPIStatus{CMPI_RC_OK, nullptr};
    };
    broker.register_provider(kNamespace, "Test_Service", provider.methods());
    in_request([this](const CMPIContext *context) {
        CMPIStatus status{};
        cmpi->bft->invokeMethod(cmpi, context, new_path("Test_Service"), "Run", nullptr, nullptr,
                                &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
    });
    EXPECT_EQ(seen, "root");
}

}  // namespace
}  // namespace velkhost::broker::testing
