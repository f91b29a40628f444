// Arrays and enumerations.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

class BrokerArray : public BrokerTest {
  protected:
    CMPIArray *array_of(CMPICount size, CMPIType type) {
        CMPIArray *array = make().newArray(cmpi, size, type, &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        return array;
    }
    CMPIData at(const CMPIArray *array, CMPICount index) {
        return array->ft->getElementAt(array, index, &status);
    }
    static CMPIrc set(CMPIArray *array, CMPICount index, const CMPIValue *value, CMPIType type) {
        return array->ft->setElementAt(array, index, value, type).rc;
    }
    static CMPIrc set16(CMPIArray *array, CMPICount index, CMPIUint16 number) {
        CMPIValue value{};
        value.uint16 = number;
        return set(array, index, &value, CMPI_uint16);
    }

    CMPIStatus status{};
};

TEST_F(BrokerArray, NewElementsAreNullAndTheTypeHasNoArrayBit) {
    const CMPIArray *array = array_of(2, CMPI_uint16A);
    EXPECT_EQ(array->ft->getSize(array, nullptr), 2U);
    EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_uint16);
    EXPECT_EQ(at(array, 1).state, CMPI_nullValue);
    EXPECT_EQ(at(array, 1).type, CMPI_uint16);
}

TEST_F(BrokerArray, ElementBeyondTheSizeIsReadAsBadWithGoodStatus) {
    const CMPIArray *array = array_of(2, CMPI_uint16);
    const CMPIData data = at(array, 2);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.type, CMPI_uint16);
    EXPECT_EQ(data.state, CMPI_badValue);
}

TEST_F(BrokerArray, ElementBeyondTheSizeIsNotSet) {
    CMPIArray *array = array_of(2, CMPI_uint16);
    EXPECT_EQ(set16(array, 2, 7), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(array->ft->getSize(array, nullptr), 2U);
}

TEST_F(BrokerArray, ArrayMadeEmptyGrowsAtItsEndOnly) {
    CMPIArray *array = array_of(0, CMPI_uint16);
    EXPECT_EQ(set16(array, 1, 7), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(set16(array, 0, 7), CMPI_RC_OK);
    EXPECT_EQ(set16(array, 1, 8), CMPI_RC_OK);
    EXPECT_EQ(array->ft->getSize(array, nullptr), 2U);
    EXPECT_EQ(at(array, 1).value.uint16, 8);
}

TEST_F(BrokerArray, WrongElementTypeIsRefused) {
    CMPIArray *array = array_of(1, CMPI_uint16);
    CMPIValue value{};
    EXPECT_EQ(set(array, 0, &value, CMPI_uint32), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(set(array, 0, chars("7"), CMPI_chars), CMPI_RC_ERR_FAILED);
    EXPECT_EQ(at(array, 0).state, CMPI_nullValue);
}

TEST_F(BrokerArray, CharsArrayIsAStringArrayThatTakesChars) {
    CMPIArray *array = array_of(1, CMPI_chars);
    EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_string);
    char buffer[] = "first";
    EXPECT_EQ(set(array, 0, chars(buffer), CMPI_chars), CMPI_RC_OK);
    buffer[0] = 'w';
    EXPECT_EQ(at(array, 0).type, CMPI_string);
    EXPECT_EQ(text(at(array, 0)), "first");
}

TEST_F(BrokerArray, TrackedArrayHoldsTheObjectsItself) {
    CMPIArray *array = array_of(1, CMPI_string);
    CMPIValue value{};
    value.string = make().newString(cmpi, "held", nullptr);
    set(array, 0, &value, CMPI_string);
    EXPECT_EQ(at(array, 0).value.string, value.string);
    value.string->ft->release(value.string);
    EXPECT_EQ(text(at(array, 0)), "(null)");
    EXPECT_EQ(take_findings(), std::vector{FindingKind::kUseAfterRelease});
}

TEST_F(BrokerArray, CloneHasItsOwnElements) {
    CMPIArray *array = array_of(1, CMPI_string);
    CMPIValue value{};
    value.string = make().newString(cmpi, "held", nullptr);
    set(array, 0, &value, CMPI_string);
    CMPIArray *copy = array->ft->clone(array, &status);
    value.string->ft->release(value.string);
    EXPECT_NE(at(copy, 0).value.string, value.string);
    EXPECT_EQ(text(at(copy, 0)), "held");
    EXPECT_EQ(copy->ft->release(copy).rc, CMPI_RC_OK);
}

TEST_F(BrokerArray, ContainerCopiesTheArray) {
    CMPIArray *array = array_of(2, CMPI_uint16);
    set16(array, 0, 32769);
    CMPIArgs *args = make().newArgs(cmpi, nullptr);
    CMPIValue value{};
    value.array = array;
    args->ft->addArg(args, "InstallOptions", &value, CMPI_uint16A);
    array->ft->release(array);
    const CMPIData data = args->ft->getArg(args, "InstallOptions", nullptr);
    EXPECT_EQ(data.type, CMPI_uint16A);
    EXPECT_EQ(at(data.value.array, 0).value.uint16, 32769);
    EXPECT_EQ(at(data.value.array, 1).state, CMPI_nullValue);
}

TEST_F(BrokerArray, ElementTypeMustBeStorable) {
    EXPECT_EQ(make().newArray(cmpi, 1, CMPI_args, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

// -- Enumerations --

class BrokerEnumeration : public BrokerArray {
  protected:
    void SetUp() override {
        provider.enumerate_names = [](const auto *, const CMPIResult *result,
                                      const CMPIObjectPath *path) {
            for (const char *name : {"one", "two"}) {
                CMPIObjectPath *found = path->ft->clone(path, nullptr);
                found->ft->addKey(found, "Name", chars(name), CMPI_chars);
                result->ft->returnObjectPath(result, found);
                found->ft->release(found);
            }
            return result->ft->returnDone(result);
        };
        broker.register_provider(kNamespace, "Test_Service", provider.instances());
    }

    CMPIEnumeration *enumerate(const CMPIContext *context) {
        return cmpi->bft->enumerateInstanceNames(cmpi, context, new_path("Test_Service"), &status);
    }
    std::string next_name(const CMPIEnumeration *enumeration) {
        const CMPIData data = enumeration->ft->getNext(enumeration, &status);
        EXPECT_EQ(data.type, CMPI_ref);
        return text(data.value.ref->ft->getKey(data.value.ref, "Name", nullptr));
    }
};

TEST_F(BrokerEnumeration, IsReadOnceFrontToBack) {
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = enumerate(context);
        EXPECT_EQ(found->ft->hasNext(found, nullptr), 1);
        EXPECT_EQ(next_name(found), "one");
        EXPECT_EQ(next_name(found), "two");
        EXPECT_EQ(found->ft->hasNext(found, nullptr), 0);
        found->ft->release(found);
    });
}

TEST_F(BrokerEnumeration, NextPastTheEndIsBadWithGoodStatus) {
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = enumerate(context);
        next_name(found);
        next_name(found);
        const CMPIData data = found->ft->getNext(found, &status);
        EXPECT_EQ(status.rc, CMPI_RC_OK);
        EXPECT_EQ(data.state, CMPI_badValue);
        found->ft->release(found);
    });
}

TEST_F(BrokerEnumeration, ToArrayIsItsInnerArray) {
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = enumerate(context);
        CMPIArray *inner = found->ft->toArray(found, nullptr);
        EXPECT_EQ(inner->ft->getSize(inner, nullptr), 2U);
        EXPECT_EQ(found->ft->toArray(found, nullptr), inner);
        inner->ft->release(inner);
        EXPECT_EQ(take_findings(), std::vector{FindingKind::kPartReleased});
        EXPECT_EQ(next_name(found), "one");
        found->ft->release(found);
    });
}

TEST_F(BrokerEnumeration, CloneIsDeepAndKeepsItsPlace) {
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = enumerate(context);
        next_name(found);
        CMPIEnumeration *copy = found->ft->clone(found, nullptr);
        found->ft->release(found);
        EXPECT_EQ(next_name(copy), "two");
        copy->ft->release(copy);
    });
}

TEST_F(BrokerEnumeration, ElementsEndWithIt) {
    in_request([this](const CMPIContext *context) {
        CMPIEnumeration *found = enumerate(context);
        const CMPIData data = found->ft->getNext(found, nullptr);
        found->ft->release(found);
        EXPECT_EQ(data.value.ref->ft->getKeyCount(data.value.ref, &status), 0U);
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_HANDLE);
        EXPECT_EQ(take_findings(), std::vector{FindingKind::kUseAfterRelease});
    });
}

}  // namespace
}  // namespace velkhost::broker::testing
