// Requests that a provider makes of its broker.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

CMPIStatus ok() {
    return {CMPI_RC_OK, nullptr};
}

class BrokerUpCalls : public BrokerTest {
  protected:
    // Runs a method call from within a request. The provider's side is `provider.invoke`.
    void invoke(const char *name_space, const char *class_name, CMPIArgs *out = nullptr) {
        in_request([&](const CMPIContext *context) {
            const CMPIObjectPath *path =
                make().newObjectPath(cmpi, name_space, class_name, nullptr);
            data = cmpi->bft->invokeMethod(cmpi, context, path, "Run", nullptr, out, &status);
        });
    }
    void serve_methods() {
        broker.register_provider(kNamespace, "Test_Service", provider.methods());
    }

    CMPIData data{};
    CMPIStatus status{};
};

// -- Methods --

TEST_F(BrokerUpCalls, MethodReturnsItsIntegerAndItsOutputArguments) {
    provider.invoke = [](const auto *, const CMPIResult *result, const CMPIObjectPath *path,
                         const char *, const auto *, CMPIArgs *out) {
        CMPIValue value{};
        value.ref = const_cast<CMPIObjectPath *>(path);
        out->ft->addArg(out, "Job", &value, CMPI_ref);
        value.uint32 = 4096;
        return result->ft->returnData(result, &value, CMPI_uint32);
    };
    serve_methods();
    in_request([this](const CMPIContext *context) {
        CMPIArgs *in = make().newArgs(cmpi, nullptr);
        CMPIArgs *out = make().newArgs(cmpi, nullptr);
        data = cmpi->bft->invokeMethod(cmpi, context, new_path("Test_Service"), "Run", in, out,
                                       &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        EXPECT_EQ(data.type, CMPI_uint32);
        EXPECT_EQ(data.value.uint32, 4096U);
        const CMPIObjectPath *job = out->ft->getArg(out, "Job", nullptr).value.ref;
        EXPECT_EQ(text(job->ft->getClassName(job, nullptr)), "Test_Service");
    });
}

TEST_F(BrokerUpCalls, MethodThatReturnsNothingHasNullTypeAndGoodState) {
    provider.invoke = [](const auto *, const auto *, const auto *, const char *, const auto *,
                         auto *) { return ok(); };
    serve_methods();
    invoke(kNamespace, "Test_Service");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.type, CMPI_null);
    EXPECT_EQ(data.state, CMPI_goodValue);
}

TEST_F(BrokerUpCalls, FailedStatusHidesTheReturnValue) {
    provider.invoke = [this](const auto *, const CMPIResult *result, const auto *, const char *,
                             const auto *, CMPIArgs *out) {
        CMPIValue value{};
        value.uint32 = 1;
        out->ft->addArg(out, "Left", &value, CMPI_uint32);
        result->ft->returnData(result, &value, CMPI_uint32);
        return CMPIStatus{CMPI_RC_ERR_FAILED,
                          make().newString(cmpi, "An installation process is running", nullptr)};
    };
    serve_methods();
    in_request([this](const CMPIContext *context) {
        CMPIArgs *out = make().newArgs(cmpi, nullptr);
        data = cmpi->bft->invokeMethod(cmpi, context, new_path("Test_Service"), "Run", nullptr, out,
                                       &status);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(text(status.msg), "An installation process is running");
        EXPECT_EQ(data.type, CMPI_null);
        EXPECT_EQ(data.state, CMPI_nullValue);
        EXPECT_EQ(out->ft->getArgCount(out, nullptr), 0U);
    });
}

TEST_F(BrokerUpCalls, UnknownClassOrNamespaceIsInvalidClass) {
    invoke(kNamespace, "No_Such");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    invoke("no/such", "Test_Service");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
    EXPECT_EQ(data.state, CMPI_nullValue);
}

TEST_F(BrokerUpCalls, ClassWithoutAProviderFails) {
    invoke(kNamespace, "Test_Service");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
}

TEST_F(BrokerUpCalls, NullPathFails) {
    in_request([this](const CMPIContext *context) {
        cmpi->bft->invokeMethod(cmpi, context, nullptr, "Run", nullptr, nullptr, &status);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    });
}

TEST_F(BrokerUpCalls, InOutAndStatusMayBeNull) {
    bool called = false;
    provider.invoke = [&called](const auto *, const auto *, const auto *, const char *,
                                const CMPIArgs *in, CMPIArgs *out) {
        called = in != nullptr && out != nullptr;
        return ok();
    };
    serve_methods();
    in_request([this](const CMPIContext *context) {
        cmpi->bft->invokeMethod(cmpi, context, new_path("Test_Service"), "Run", nullptr, nullptr,
                                nullptr);
    });
    EXPECT_TRUE(called);
}

TEST_F(BrokerUpCalls, StringResultArrivesAsCharsWhoseTextIsGone) {
    for (const CMPIType type : {CMPI_chars, CMPI_string}) {
        provider.invoke = [this, type](const auto *, const CMPIResult *result, const auto *,
                                       const char *, const auto *, auto *) {
            CMPIValue value{};
            value.string = make().newString(cmpi, "answer", nullptr);
            return result->ft->returnData(result, type == CMPI_chars ? chars("answer") : &value,
                                          type);
        };
        serve_methods();
        invoke(kNamespace, "Test_Service");
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        EXPECT_EQ(data.type, CMPI_chars);
        EXPECT_STRNE(data.value.chars, "answer");
    }
}

TEST_F(BrokerUpCalls, OnlyTheFirstReturnedValueCounts) {
    provider.invoke = [](const auto *, const CMPIResult *result, const auto *, const char *,
                         const auto *, auto *) {
        CMPIValue value{};
        value.uint32 = 1;
        result->ft->returnData(result, &value, CMPI_uint32);
        value.uint32 = 2;
        return result->ft->returnData(result, &value, CMPI_uint32);
    };
    serve_methods();
    invoke(kNamespace, "Test_Service");
    EXPECT_EQ(data.value.uint32, 1U);
}

TEST_F(BrokerUpCalls, ReturnedReferenceEndsARealBrokerAndIsAFinding) {
    provider.invoke = [](const auto *, const CMPIResult *result, const CMPIObjectPath *path,
                         const char *, const auto *, auto *) {
        CMPIValue value{};
        value.ref = const_cast<CMPIObjectPath *>(path);
        EXPECT_EQ(result->ft->returnData(result, &value, CMPI_ref).rc, CMPI_RC_ERR_FAILED);
        EXPECT_EQ(result->ft->returnObjectPath(result, path).rc, CMPI_RC_ERR_FAILED);
        return ok();
    };
    serve_methods();
    invoke(kNamespace, "Test_Service");
    EXPECT_EQ(data.type, CMPI_null);
    EXPECT_EQ(take_findings(), (std::vector{FindingKind::kUnsafeCall, FindingKind::kUnsafeCall}));
}

TEST_F(BrokerUpCalls, ReturnedArrayOrInstanceIsGarbageAndAFinding) {
    provider.invoke = [this](const auto *, const CMPIResult *result, const CMPIObjectPath *path,
                             const char *, const auto *, auto *) {
        CMPIValue value{};
        value.array = make().newArray(cmpi, 1, CMPI_uint16, nullptr);
        EXPECT_EQ(result->ft->returnData(result, &value, CMPI_uint16A).rc, CMPI_RC_ERR_FAILED);
        const CMPIInstance *instance = make().newInstance(cmpi, path, nullptr);
        EXPECT_EQ(result->ft->returnInstance(result, instance).rc, CMPI_RC_ERR_FAILED);
        return ok();
    };
    serve_methods();
    invoke(kNamespace, "Test_Service");
    EXPECT_EQ(take_findings(), (std::vector{FindingKind::kUnsafeCall, FindingKind::kUnsafeCall}));
}

// -- Enumerations --

TEST_F(BrokerUpCalls, EnumerationOfAnUnknownClassOrNamespaceIsNull) {
    in_request([this](const CMPIContext *context) {
        EXPECT_EQ(
            cmpi->bft->enumerateInstances(cmpi, context, new_path("No_Such"), nullptr, &status),
            nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_CLASS);
        const CMPIObjectPath *path = make().newObjectPath(cmpi, "no/such", "Test_Base", nullptr);
        EXPECT_EQ(cmpi->bft->enumerateInstanceNames(cmpi, context, path, &status), nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_NAMESPACE);
    });
}

TEST_F(BrokerUpCalls, EnumerationWithoutAProviderIsEmpty) {
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = cmpi->bft->enumerateInstances(
            cmpi, context, new_path("Test_Service"), nullptr, &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        ASSERT_NE(found, nullptr);
        EXPECT_EQ(found->ft->hasNext(found, nullptr), 0);
        found->ft->release(found);
    });
}

TEST_F(BrokerUpCalls, FailedEnumerationIsNullWithTheProvidersMessage) {
    provider.enumerate = [this](const auto *, const auto *, const auto *) {
        return CMPIStatus{CMPI_RC_ERR_ACCESS_DENIED, make().newString(cmpi, "no", nullptr)};
    };
    broker.register_provider(kNamespace, "Test_Service", provider.instances());
    in_request([this](const CMPIContext *context) {
        EXPECT_EQ(cmpi->bft->enumerateInstances(cmpi, context, new_path("Test_Service"), nullptr,
                                                &status),
                  nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
        EXPECT_EQ(text(status.msg), "no");
    });
}

// -- Single instances --

TEST_F(BrokerUpCalls, GetInstanceGivesACopyThatTheCallerMayRelease) {
    provider.get = [this](const auto *, const CMPIResult *result, const CMPIObjectPath *path) {
        return result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
    };
    broker.register_provider(kNamespace, "Test_Service", provider.instances());
    in_request([this](const CMPIContext *context) {
        CMPIObjectPath *path = new_path("Test_Service");
        path->ft->addKey(path, "Name", chars("x"), CMPI_chars);
        CMPIInstance *found = cmpi->bft->getInstance(cmpi, context, path, nullptr, &status);
        ASSERT_NE(found, nullptr);
        const CMPIData name = found->ft->getProperty(found, "Name", nullptr);
        EXPECT_EQ(found->ft->release(found).rc, CMPI_RC_OK);
        // What a getter gave does not end with the instance.
        EXPECT_EQ(text(name), "x");
    });
}

TEST_F(BrokerUpCalls, GetInstanceThatReturnsNothingIsNotFound) {
    provider.get = [](const auto *, const auto *, const auto *) { return ok(); };
    broker.register_provider(kNamespace, "Test_Service", provider.instances());
    in_request([this](const CMPIContext *context) {
        EXPECT_EQ(cmpi->bft->getInstance(cmpi, context, new_path("Test_Service"), nullptr, &status),
                  nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    });
}

TEST_F(BrokerUpCalls, CreateModifyAndDeleteReachTheProvider) {
    std::string log;
    provider.create = [&log](const auto *, const CMPIResult *result, const CMPIObjectPath *path,
                             const CMPIInstance *instance) {
        log += "create " + text(instance->ft->getProperty(instance, "Caption", nullptr));
        return result->ft->returnObjectPath(result, path);
    };
    provider.modify = [&log](const auto *, const auto *, const auto *, const auto *) {
        log += ", modify";
        return ok();
    };
    provider.remove = [&log](const auto *, const auto *, const auto *) {
        log += ", delete";
        return CMPIStatus{CMPI_RC_ERR_NOT_FOUND, nullptr};
    };
    broker.register_provider(kNamespace, "Test_Service", provider.instances());
    in_request([this](const CMPIContext *context) {
        const CMPIObjectPath *path = new_path("Test_Service");
        CMPIInstance *instance = make().newInstance(cmpi, path, nullptr);
        instance->ft->setProperty(instance, "Caption", chars("c"), CMPI_chars);
        EXPECT_NE(cmpi->bft->createInstance(cmpi, context, path, instance, &status), nullptr);
        EXPECT_EQ(cmpi->bft->modifyInstance(cmpi, context, path, instance, nullptr).rc, CMPI_RC_OK);
        EXPECT_EQ(cmpi->bft->deleteInstance(cmpi, context, path).rc, CMPI_RC_ERR_NOT_FOUND);
    });
    EXPECT_EQ(log, "create c, modify, delete");
}

TEST_F(BrokerUpCalls, ExecQueryReachesTheProvider) {
    provider.query = [this](const auto *, const CMPIResult *result, const CMPIObjectPath *path) {
        return result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
    };
    broker.register_provider(kNamespace, "Test_Service", provider.instances());
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = cmpi->bft->execQuery(cmpi, context, new_path("Test_Service"),
                                                      "SELECT * FROM Test_Service", "WQL", &status);
        ASSERT_NE(found, nullptr);
        EXPECT_EQ(found->ft->hasNext(found, nullptr), 1);
        found->ft->release(found);
    });
}

// -- Associations --

TEST_F(BrokerUpCalls, AssociatorsAskTheProvidersOfTheAssociation) {
    std::string asked;
    provider.associators = [&](const CMPIResult *result, const CMPIObjectPath *path,
                               const char *association, const char *result_class) {
        asked = std::string(association) + ' ' + (result_class != nullptr ? result_class : "any");
        return result->ft->returnInstance(result, make().newInstance(cmpi, path, nullptr));
    };
    broker.register_provider(kNamespace, "Test_Link", provider.all());
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found =
            cmpi->bft->associators(cmpi, context, new_path("Test_Service"), "test_link",
                                   "Test_Base", nullptr, nullptr, nullptr, &status);
        ASSERT_NE(found, nullptr);
        EXPECT_EQ(found->ft->hasNext(found, nullptr), 1);
        found->ft->release(found);
    });
    EXPECT_EQ(asked, "test_link Test_Base");
}

TEST_F(BrokerUpCalls, AssociationWithoutAProviderIsNullWithNotFound) {
    in_request([this](const CMPIContext *context) {
        EXPECT_EQ(cmpi->bft->associators(cmpi, context, new_path("Test_Service"), "Test_Link",
                                         nullptr, nullptr, nullptr, nullptr, &status),
                  nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
        EXPECT_EQ(cmpi->bft->referenceNames(cmpi, context, new_path("Test_Service"), nullptr,
                                            nullptr, &status),
                  nullptr);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    });
}

TEST_F(BrokerUpCalls, NamesAndReferencesReachTheProviderToo) {
    int calls = 0;
    const auto answer = [&calls](const CMPIResult *result, const CMPIObjectPath *path, const char *,
                                 const char *) {
        ++calls;
        return result->ft->returnObjectPath(result, path);
    };
    provider.associators = answer;
    provider.references = answer;
    broker.register_provider(kNamespace, "Test_Link", provider.all());
    in_request([this](const CMPIContext *context) {
        const CMPIObjectPath *path = new_path("Test_Service");
        const CMPIBrokerFT &bft = *cmpi->bft;
        for (CMPIEnumeration *found :
             {bft.associatorNames(cmpi, context, path, nullptr, nullptr, nullptr, nullptr, nullptr),
              bft.references(cmpi, context, path, nullptr, nullptr, nullptr, nullptr),
              bft.referenceNames(cmpi, context, path, "Test_Link", "Source", nullptr)}) {
            ASSERT_NE(found, nullptr);
            EXPECT_EQ(found->ft->getNext(found, nullptr).type, CMPI_ref);
            found->ft->release(found);
        }
    });
    EXPECT_EQ(calls, 3);
}

}  // namespace
}  // namespace velkhost::broker::testing
