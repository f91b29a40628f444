// Strings and times.
#include "broker_testing.h"

namespace velkhost::broker::testing {
namespace {

class BrokerString : public BrokerTest {
  protected:
    CMPIStatus status{};
};

TEST_F(BrokerString, HandleIsTheTextItself) {
    const CMPIString *string = make().newString(cmpi, "text", &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_STREQ(static_cast<const char *>(string->hdl), "text");
    EXPECT_EQ(string->ft->getCharPtr(string, nullptr), string->hdl);
}

TEST_F(BrokerString, NullTextIsAStringWithoutText) {
    const CMPIString *string = make().newString(cmpi, nullptr, nullptr);
    ASSERT_NE(string, nullptr);
    EXPECT_EQ(string->hdl, nullptr);
    EXPECT_EQ(string->ft->getCharPtr(string, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(BrokerString, TextThatWasCutInPlaceStaysCut) {
    CMPIString *string = make().newString(cmpi, "0x01|Process Completed", nullptr);
    static_cast<char *>(string->hdl)[4] = '\0';
    EXPECT_EQ(text(string), "0x01");
    CMPIString *copy = string->ft->clone(string, nullptr);
    EXPECT_EQ(text(copy), "0x01");
    copy->ft->release(copy);
}

TEST_F(BrokerString, BareTextOfAReleasedStringIsRecognisable) {
    CMPIString *string = make().newString(cmpi, "gone", nullptr);
    string->ft->release(string);
    EXPECT_STREQ(static_cast<const char *>(string->hdl), "(text of a released CMPIString)");
}

// -- Times --

using BrokerDateTime = BrokerString;

TEST_F(BrokerDateTime, TextIsKeptAndCounted) {
    const CMPIDateTime *time =
        make().newDateTimeFromChars(cmpi, "20260102030405.678901+060", &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(time->ft->isInterval(time, nullptr), 0);
    EXPECT_EQ(text(time->ft->getStringFormat(time, nullptr)), "20260102030405.678901+060");
    EXPECT_EQ(time->ft->getBinaryFormat(time, nullptr), 1767319445678901ULL);
}

TEST_F(BrokerDateTime, BinaryBecomesTextInUtc) {
    const CMPIDateTime *time = make().newDateTimeFromBinary(cmpi, 1767319445678901ULL, 0, &status);
    EXPECT_EQ(text(time->ft->getStringFormat(time, nullptr)), "20260102020405.678901+000");
}

TEST_F(BrokerDateTime, IntervalsCountTheirLength) {
    const CMPIDateTime *time = make().newDateTimeFromBinary(cmpi, 93784000006ULL, 1, nullptr);
    EXPECT_EQ(time->ft->isInterval(time, nullptr), 1);
    EXPECT_EQ(text(time->ft->getStringFormat(time, nullptr)), "00000001020304.000006:000");
    EXPECT_EQ(time->ft->getBinaryFormat(time, nullptr), 93784000006ULL);
}

TEST_F(BrokerDateTime, MalformedTextIsRefused) {
    for (const char *text :
         {"", "20260102", "20260102030405.678901x060", "20260102030405.678901+0600"}) {
        EXPECT_EQ(make().newDateTimeFromChars(cmpi, text, &status), nullptr) << text;
        EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
    }
    EXPECT_EQ(make().newDateTimeFromChars(cmpi, nullptr, &status), nullptr);
}

TEST_F(BrokerDateTime, OnlyLengthAndSignAreLookedAt) {
    EXPECT_NE(make().newDateTimeFromChars(cmpi, "abcdefgh******.******-xyz", &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(BrokerDateTime, NowIsAPointInTime) {
    const CMPIDateTime *time = make().newDateTime(cmpi, &status);
    EXPECT_EQ(time->ft->isInterval(time, nullptr), 0);
    EXPECT_GT(time->ft->getBinaryFormat(time, nullptr), 1700000000000000ULL);
}

TEST_F(BrokerDateTime, LargestNumbersGiveATextOfTheRightLength) {
    for (const CMPIBoolean interval : {CMPIBoolean{0}, CMPIBoolean{1}}) {
        const CMPIDateTime *time = make().newDateTimeFromBinary(cmpi, ~0ULL, interval, nullptr);
        EXPECT_EQ(text(time->ft->getStringFormat(time, nullptr)).size(), 25U);
    }
}

}  // namespace
}  // namespace velkhost::broker::testing
