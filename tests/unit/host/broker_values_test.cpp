// Absent, null, mistyped and repeated items: what each kind of container answers.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

void expect_absent(const CMPIData &data, const CMPIStatus &status) {
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(data.type, CMPI_null);
    EXPECT_EQ(data.state, CMPI_notFound);
    EXPECT_EQ(data.value.uint64, 0U);
}

class BrokerValues : public BrokerTest {
  protected:
    CMPIObjectPath *path = new_path("Test_Service");
    CMPIArgs *args = make().newArgs(cmpi, nullptr);
    CMPIInstance *instance = make().newInstance(cmpi, new_path("Test_Service"), nullptr);
    CMPIStatus status{};

    CMPIData key(const char *name) { return path->ft->getKey(path, name, &status); }
    CMPIData arg(const char *name) { return args->ft->getArg(args, name, &status); }
    CMPIData property(const char *name) {
        return instance->ft->getProperty(instance, name, &status);
    }
    CMPIrc set(const char *name, const CMPIValue *value, CMPIType type) {
        return instance->ft->setProperty(instance, name, value, type).rc;
    }
};

// -- Absent --

TEST_F(BrokerValues, AbsentKeyIsNotFound) {
    expect_absent(key("Nope"), status);
}

TEST_F(BrokerValues, AbsentArgumentIsNotFound) {
    expect_absent(arg("Nope"), status);
}

TEST_F(BrokerValues, AbsentPropertyIsNotFound) {
    expect_absent(property("Nope"), status);
}

TEST_F(BrokerValues, IndexAboveTheCountIsNotFound) {
    expect_absent(path->ft->getKeyAt(path, 1, nullptr, &status), status);
    expect_absent(args->ft->getArgAt(args, 1, nullptr, &status), status);
    expect_absent(instance->ft->getPropertyAt(instance, 99, nullptr, &status), status);
    EXPECT_EQ(take_findings(), std::vector<FindingKind>{});
}

TEST_F(BrokerValues, IndexEqualToTheCountIsAFinding) {
    expect_absent(path->ft->getKeyAt(path, 0, nullptr, &status), status);
    EXPECT_EQ(take_findings(), std::vector{FindingKind::kUnsafeCall});
}

TEST_F(BrokerValues, CountsOfEmptyObjectsAreZero) {
    EXPECT_EQ(path->ft->getKeyCount(path, &status), 0U);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(args->ft->getArgCount(args, &status), 0U);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(BrokerValues, StatusPointerMayBeNull) {
    EXPECT_EQ(path->ft->getKey(path, "Nope", nullptr).state, CMPI_notFound);
    EXPECT_EQ(args->ft->getArg(args, "Nope", nullptr).state, CMPI_notFound);
    EXPECT_EQ(instance->ft->getProperty(instance, "Nope", nullptr).state, CMPI_notFound);
}

// -- Null --

TEST_F(BrokerValues, PropertyOfTheClassThatIsNotSetIsNull) {
    const CMPIData data = property("Count");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.state, CMPI_nullValue);
    EXPECT_EQ(data.type, CMPI_uint32);
}

TEST_F(BrokerValues, NullStringPropertyIsAnObjectWithoutText) {
    EXPECT_EQ(set("Caption", nullptr, CMPI_chars), CMPI_RC_OK);
    const CMPIData data = property("Caption");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.state, CMPI_nullValue);
    ASSERT_NE(data.value.string, nullptr);
    EXPECT_EQ(data.value.string->hdl, nullptr);
}

TEST_F(BrokerValues, KeyWithNullCharsIsGoodButHasNoText) {
    EXPECT_EQ(path->ft->addKey(path, "Name", nullptr, CMPI_chars).rc, CMPI_RC_OK);
    const CMPIData data = key("Name");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.type, CMPI_string);
    EXPECT_EQ(data.state, CMPI_goodValue);
    ASSERT_NE(data.value.string, nullptr);
    EXPECT_EQ(data.value.string->ft->getCharPtr(data.value.string, nullptr), nullptr);
}

TEST_F(BrokerValues, ArgumentWithNullCharsIsGoodButHasNoText) {
    EXPECT_EQ(args->ft->addArg(args, "URI", nullptr, CMPI_chars).rc, CMPI_RC_OK);
    const CMPIData data = arg("URI");
    EXPECT_EQ(data.state, CMPI_goodValue);
    ASSERT_NE(data.value.string, nullptr);
    EXPECT_EQ(data.value.string->hdl, nullptr);
}

TEST_F(BrokerValues, NullPointerInsideTheValueIsANullOfThatType) {
    CMPIValue value{};
    args->ft->addArg(args, "S", &value, CMPI_string);
    args->ft->addArg(args, "R", &value, CMPI_ref);
    args->ft->addArg(args, "A", &value, CMPI_uint16A);
    EXPECT_EQ(arg("S").state, CMPI_nullValue);
    EXPECT_NE(arg("S").value.string, nullptr);
    EXPECT_EQ(arg("R").state, CMPI_nullValue);
    EXPECT_EQ(arg("R").type, CMPI_ref);
    EXPECT_EQ(arg("A").state, CMPI_nullValue);
    EXPECT_EQ(arg("A").type, CMPI_uint16A);
    EXPECT_EQ(arg("A").value.array, nullptr);
}

TEST_F(BrokerValues, NullValuePointerIsANullOfThatType) {
    args->ft->addArg(args, "N", nullptr, CMPI_uint32);
    EXPECT_EQ(arg("N").state, CMPI_nullValue);
    EXPECT_EQ(arg("N").type, CMPI_uint32);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

// -- Types --

TEST_F(BrokerValues, CharsAreReadBackAsString) {
    path->ft->addKey(path, "Name", chars("a"), CMPI_chars);
    args->ft->addArg(args, "URI", chars("b"), CMPI_chars);
    set("Caption", chars("c"), CMPI_chars);
    EXPECT_EQ(key("Name").type, CMPI_string);
    EXPECT_EQ(text(key("Name")), "a");
    EXPECT_EQ(arg("URI").type, CMPI_string);
    EXPECT_EQ(text(arg("URI")), "b");
    EXPECT_EQ(property("Caption").type, CMPI_string);
    EXPECT_EQ(text(property("Caption")), "c");
}

TEST_F(BrokerValues, GivenCharsAreCopied) {
    char buffer[] = "first";
    args->ft->addArg(args, "URI", chars(buffer), CMPI_chars);
    buffer[0] = 'w';
    EXPECT_EQ(text(arg("URI")), "first");
}

TEST_F(BrokerValues, EveryScalarKeepsItsTypeAndValue) {
    const auto check = [this](CMPIType type, auto CMPIValue::*member, auto number) {
        CMPIValue value{};
        value.*member = number;
        EXPECT_EQ(args->ft->addArg(args, "X", &value, type).rc, CMPI_RC_OK);
        const CMPIData data = arg("X");
        EXPECT_EQ(data.type, type);
        EXPECT_EQ(data.state, CMPI_goodValue);
        EXPECT_EQ(data.value.*member, number);
    };
    check(CMPI_boolean, &CMPIValue::boolean, CMPIBoolean{1});
    check(CMPI_char16, &CMPIValue::char16, CMPIChar16{0x20AC});
    check(CMPI_uint8, &CMPIValue::uint8, CMPIUint8{255});
    check(CMPI_uint16, &CMPIValue::uint16, CMPIUint16{65535});
    check(CMPI_uint32, &CMPIValue::uint32, CMPIUint32{4294967295U});
    check(CMPI_uint64, &CMPIValue::uint64, CMPIUint64{18446744073709551615ULL});
    check(CMPI_sint8, &CMPIValue::sint8, CMPISint8{-128});
    check(CMPI_sint16, &CMPIValue::sint16, CMPISint16{-32768});
    check(CMPI_sint32, &CMPIValue::sint32, CMPISint32{-2147483647});
    check(CMPI_sint64, &CMPIValue::sint64, CMPISint64{-9223372036854775807LL});
    check(CMPI_real32, &CMPIValue::real32, CMPIReal32{0.5F});
    check(CMPI_real64, &CMPIValue::real64, CMPIReal64{-2.25});
}

TEST_F(BrokerValues, EncapsulatedValuesAreCopied) {
    CMPIObjectPath *job = new_path("Test_Base");
    job->ft->addKey(job, "Name", chars("job-1"), CMPI_chars);
    CMPIInstance *inner = make().newInstance(cmpi, job, nullptr);
    CMPIValue value{};
    value.ref = job;
    args->ft->addArg(args, "Job", &value, CMPI_ref);
    value.inst = inner;
    args->ft->addArg(args, "Inner", &value, CMPI_instance);
    value.dateTime = make().newDateTimeFromChars(cmpi, "20260102030405.000000+000", nullptr);
    args->ft->addArg(args, "When", &value, CMPI_dateTime);
    job->ft->release(job);
    inner->ft->release(inner);
    CMPIObjectPath *copy = arg("Job").value.ref;
    EXPECT_EQ(text(copy->ft->getKey(copy, "Name", nullptr)), "job-1");
    CMPIInstance *inner_copy = arg("Inner").value.inst;
    EXPECT_EQ(text(inner_copy->ft->getProperty(inner_copy, "Name", nullptr)), "job-1");
    CMPIDateTime *when = arg("When").value.dateTime;
    EXPECT_EQ(text(when->ft->getStringFormat(when, nullptr)), "20260102030405.000000+000");
}

TEST_F(BrokerValues, TypeCodesThatCannotBeStoredAreRefused) {
    CMPIValue value{};
    for (const CMPIType type : {CMPI_args, CMPI_filter, CMPI_enumeration, CMPI_class,
                                CMPIType{0x0005}, CMPIType{0x7FFF}}) {
        EXPECT_EQ(args->ft->addArg(args, "X", &value, type).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
        EXPECT_EQ(set("X", &value, type), CMPI_RC_ERR_INVALID_DATA_TYPE);
    }
    EXPECT_EQ(args->ft->getArgCount(args, nullptr), 0U);
}

TEST_F(BrokerValues, ItemsNeedAName) {
    CMPIValue value{};
    EXPECT_EQ(args->ft->addArg(args, nullptr, &value, CMPI_uint8).rc,
              CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(set(nullptr, &value, CMPI_uint8), CMPI_RC_ERR_INVALID_PARAMETER);
    expect_absent(arg(nullptr), status);
}

// -- Names --

TEST_F(BrokerValues, NamesIgnoreCaseAndTheSameNameIsOverwritten) {
    CMPIValue value{};
    value.uint16 = 1;
    args->ft->addArg(args, "Speed", &value, CMPI_uint16);
    value.uint16 = 2;
    EXPECT_EQ(args->ft->addArg(args, "SPEED", &value, CMPI_uint16).rc, CMPI_RC_OK);
    EXPECT_EQ(args->ft->getArgCount(args, nullptr), 1U);
    EXPECT_EQ(arg("speed").value.uint16, 2);

    path->ft->addKey(path, "Name", chars("a"), CMPI_chars);
    path->ft->addKey(path, "name", chars("b"), CMPI_chars);
    EXPECT_EQ(path->ft->getKeyCount(path, nullptr), 1U);
    EXPECT_EQ(text(key("NAME")), "b");

    set("caption", chars("c"), CMPI_chars);
    EXPECT_EQ(text(property("CAPTION")), "c");
}

TEST_F(BrokerValues, ItemsAreReadByIndexWithTheirNames) {
    args->ft->addArg(args, "First", chars("1"), CMPI_chars);
    args->ft->addArg(args, "Second", chars("2"), CMPI_chars);
    CMPIString *name = nullptr;
    EXPECT_EQ(text(args->ft->getArgAt(args, 1, &name, &status)), "2");
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(text(name), "Second");
}

// -- Replacing with another type --

TEST_F(BrokerValues, PropertyThatHoldsATextKeepsItsType) {
    set("Caption", chars("text"), CMPI_chars);
    CMPIValue value{};
    EXPECT_EQ(set("Caption", &value, CMPI_uint32), CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(text(property("Caption")), "text");
    EXPECT_EQ(set("Caption", chars("other"), CMPI_chars), CMPI_RC_OK);
}

TEST_F(BrokerValues, PropertyThatHoldsAReferenceTimeOrArrayKeepsItsType) {
    CMPIValue value{};
    value.ref = path;
    set("R", &value, CMPI_ref);
    value.dateTime = make().newDateTime(cmpi, nullptr);
    set("T", &value, CMPI_dateTime);
    value.array = make().newArray(cmpi, 1, CMPI_uint16, nullptr);
    set("A", &value, CMPI_uint16A);
    for (const char *name : {"R", "T", "A"}) {
        EXPECT_EQ(set(name, chars("x"), CMPI_chars), CMPI_RC_ERR_TYPE_MISMATCH) << name;
    }
}

TEST_F(BrokerValues, NumbersMayBeReplacedByAnything) {
    CMPIValue value{};
    value.uint32 = 5;
    set("Count", &value, CMPI_uint32);
    EXPECT_EQ(set("Count", chars("five"), CMPI_chars), CMPI_RC_OK);
    EXPECT_EQ(property("Count").type, CMPI_string);
}

TEST_F(BrokerValues, KeysAndArgumentsMayBeReplacedByAnotherType) {
    CMPIValue value{};
    value.uint32 = 5;
    path->ft->addKey(path, "Name", chars("a"), CMPI_chars);
    args->ft->addArg(args, "URI", chars("a"), CMPI_chars);
    EXPECT_EQ(path->ft->addKey(path, "Name", &value, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(args->ft->addArg(args, "URI", &value, CMPI_uint32).rc, CMPI_RC_OK);
    EXPECT_EQ(key("Name").value.uint32, 5U);
    EXPECT_EQ(arg("URI").value.uint32, 5U);
}

}  // namespace
}  // namespace velkhost::broker::testing
