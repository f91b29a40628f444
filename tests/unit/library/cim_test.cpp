// The layer over the broker's tables: readers that take what is not there for nothing.

#include "velk/cim.h"

#include <cstdint>

#include "tests/support/broker_test.h"

namespace {

namespace cim = velk::cim;
using velktest::kit::Text;

class CimLayer : public velktest::BrokerTest {};

CMPIData number(CMPIType type, std::int64_t value) {
    CMPIData data{};
    data.type = type;
    data.value.sint64 = value;
    return data;
}

}  // namespace

TEST_F(CimLayer, IntegersOfEveryWidthAreRead) {
    for (const CMPIType type : {CMPI_uint8, CMPI_uint16, CMPI_uint32, CMPI_uint64, CMPI_sint8,
                                CMPI_sint16, CMPI_sint32, CMPI_sint64}) {
        EXPECT_EQ(cim::int_of(number(type, 77)), 77) << type;
    }
    EXPECT_EQ(cim::int_of(number(CMPI_sint8, -1)), -1);
    EXPECT_EQ(cim::int_of(number(CMPI_uint8, -1)), 255);
    EXPECT_EQ(cim::int_of(number(CMPI_sint32, -5)), -5);
}

TEST_F(CimLayer, WhatIsNoIntegerReadsAsZero) {
    for (const CMPIType type :
         {CMPI_null, CMPI_boolean, CMPI_string, CMPI_chars, CMPI_real32, CMPI_uint16A}) {
        EXPECT_EQ(cim::int_of(number(type, 77)), 0) << type;
    }
}

TEST_F(CimLayer, TextsOfBothFormsAreReadAndNothingElse) {
    EXPECT_EQ(cim::text_of(static_cast<const CMPIString *>(nullptr)), nullptr);
    CMPIData data{};
    EXPECT_EQ(cim::text_of(data), nullptr);
    data.type = CMPI_string;
    EXPECT_EQ(cim::text_of(data), nullptr) << "a null string object";
    char text[] = "text";
    data.type = CMPI_chars;
    data.value.chars = text;
    EXPECT_STREQ(cim::text_of(data), "text");
    data.type = CMPI_uint32;
    EXPECT_EQ(cim::text_of(data), nullptr);
}

TEST_F(CimLayer, ValuesThatAreNullAbsentOrBadAreNotPresent) {
    CMPIData data{};
    EXPECT_TRUE(cim::is_present({CMPI_RC_OK, nullptr}, data));
    EXPECT_FALSE(cim::is_present({CMPI_RC_ERR_NO_SUCH_PROPERTY, nullptr}, data));
    for (const int state : {CMPI_nullValue, CMPI_notFound, CMPI_badValue}) {
        data.state = static_cast<CMPIValueState>(state);
        EXPECT_FALSE(cim::is_present({CMPI_RC_OK, nullptr}, data)) << state;
    }
    data.state = CMPI_keyValue;
    EXPECT_TRUE(cim::is_present({CMPI_RC_OK, nullptr}, data));
}

TEST_F(CimLayer, NullObjectsAreLeftAlone) {
    cim::add_key(nullptr, "a", "b");
    cim::add_text(nullptr, "a", "b");
    cim::add_uint8(nullptr, "a", 1);
    cim::add_reference(nullptr, "a", nullptr);
    cim::set_text(nullptr, "a", "b");
    EXPECT_EQ(cim::make_instance(nullptr), nullptr);
    EXPECT_EQ(cim::argument(nullptr, "a").type, CMPI_null);
    EXPECT_EQ(cim::property(nullptr, "a").type, CMPI_null);
    EXPECT_EQ(cim::clone_reference({}), nullptr);
    EXPECT_EQ(cim::get_instance(nullptr, nullptr), nullptr);
    EXPECT_STREQ(cim::message_of({CMPI_RC_ERR_FAILED, nullptr}), "");
}

TEST_F(CimLayer, ArgumentsAreReadBackByName) {
    in_request([](const CMPIContext *) {
        const cim::Args args = cim::make_args();
        cim::add_text(args, "Text", "value");
        cim::add_text(args, "Null", nullptr);
        cim::add_uint8(args, "Number", 200);
        const cim::Path path = cim::make_path("zeb/cimv2", "ZEB_UpdateJob");
        cim::add_reference(args.get(), "Job", path.get());
        EXPECT_STREQ(cim::text_of(cim::argument(args.get(), "text")), "value");
        EXPECT_EQ(cim::text_of(cim::argument(args.get(), "Null")), nullptr);
        EXPECT_EQ(cim::int_of(cim::argument(args.get(), "Number")), 200);
        EXPECT_EQ(cim::argument(args.get(), "Absent").type, CMPI_null);
        EXPECT_NE(cim::clone_reference(cim::argument(args.get(), "Job")), nullptr);
        EXPECT_EQ(cim::clone_reference(cim::argument(args.get(), "Text")), nullptr);
    });
}

TEST_F(CimLayer, PropertiesAreReadByName) {
    job().show(Text("0x00|Initialization"));
    job().hide();
    in_request([](const CMPIContext *context) {
        const cim::Path path = cim::make_path("zeb/cimv2", "ZEB_UpdateJob");
        const cim::Instance instance = cim::get_instance(context, path);
        ASSERT_NE(instance, nullptr);
        EXPECT_STREQ(cim::text_of(cim::property(instance.get(), "jobstatus")),
                     "0x00|Initialization");
        EXPECT_EQ(cim::int_of(cim::property(instance.get(), "JobState")), 4);
        EXPECT_EQ(cim::property(instance.get(), "Absent").type, CMPI_null);
        EXPECT_EQ(cim::get_instance(context, path), nullptr) << "one that does not exist";
    });
}

TEST_F(CimLayer, CallGivesStatusAndValue) {
    in_request([this](const CMPIContext *context) {
        const cim::Path path = cim::make_path("zeb/cimv2", "ZEB_FileTransferService");
        const cim::Args in = cim::make_args();
        cim::add_text(in, "FileURI", "file:///a");
        transfer().end.value = 12;
        const cim::Call answered =
            cim::invoke(context, path, "DeleteTransferredFile", in, cim::make_args());
        EXPECT_EQ(answered.status.rc, CMPI_RC_OK);
        EXPECT_EQ(answered.value, 12);
        EXPECT_TRUE(answered.returned);
        transfer().end = {CMPI_RC_ERR_ACCESS_DENIED, "why", 12, {}};
        const cim::Call refused =
            cim::invoke(context, path, "DeleteTransferredFile", in, cim::make_args());
        EXPECT_EQ(refused.status.rc, CMPI_RC_ERR_ACCESS_DENIED);
        EXPECT_STREQ(cim::message_of(refused.status), "why");
        EXPECT_EQ(refused.value, 0);
        EXPECT_FALSE(refused.returned) << "a failed call has none";
    });
}

TEST_F(CimLayer, CallOfAnUnknownClassFails) {
    in_request([](const CMPIContext *context) {
        const cim::Path path = cim::make_path("zeb/cimv2", "ZEB_Unknown");
        const cim::Call call =
            cim::invoke(context, path, "Run", cim::make_args(), cim::make_args());
        EXPECT_NE(call.status.rc, CMPI_RC_OK);
        EXPECT_EQ(call.value, 0);
    });
}
