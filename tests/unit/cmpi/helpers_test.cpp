// Life of objects, status helpers and tests of values.

#include <cmpi/cmpimacs.h>
#include <gtest/gtest.h>

#include <type_traits>

namespace {

char text_of_string[] = "text";

CMPIString *made_string = nullptr;
const char *asked_text = nullptr;

CMPIString *new_string(const CMPIBroker * /*broker*/, const char *text, CMPIStatus * /*status*/) {
    asked_text = text;
    return made_string;
}

// A broker that can make one string and nothing else.
class StatusHelpers : public ::testing::Test {
  protected:
    void SetUp() override {
        factories_.newString = &new_string;
        made_string = &string_;
        asked_text = nullptr;
    }

    const CMPIBroker *broker() const { return &broker_; }
    CMPIString *string() { return &string_; }

  private:
    CMPIString string_{text_of_string, nullptr};
    CMPIBrokerEncFT factories_{};
    CMPIBroker broker_{nullptr, nullptr, &factories_, nullptr, nullptr};
};

CMPIStatus filled() {
    return {CMPI_RC_ERROR, made_string};
}

// Without braces on purpose: the form must be one statement, also in front of an else.
CMPIStatus return_code(bool failed) {
    // NOLINTBEGIN(readability-braces-around-statements,readability-else-after-return)
    if (failed)
        CMReturn(CMPI_RC_ERR_FAILED);
    else
        CMReturn(CMPI_RC_OK);
    // NOLINTEND(readability-braces-around-statements,readability-else-after-return)
}

CMPIStatus return_string(CMPIString *message) {
    CMReturnWithString(CMPI_RC_ERR_NOT_FOUND, message);
}

CMPIStatus return_chars(const CMPIBroker *broker) {
    CMReturnWithChars(broker, CMPI_RC_ERR_TYPE_MISMATCH, "why");
}

}  // namespace

TEST_F(StatusHelpers, SetStatusFillsTheCodeAndClearsTheMessage) {
    CMPIStatus status = filled();
    CMSetStatus(&status, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(status.msg, nullptr);
}

TEST_F(StatusHelpers, SetStatusWithStringFillsBoth) {
    CMPIStatus status{};
    CMSetStatusWithString(&status, CMPI_RC_ERR_FAILED, string());
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, string());
}

TEST_F(StatusHelpers, SetStatusWithCharsMakesTheMessageWithTheBroker) {
    CMPIStatus status{};
    CMSetStatusWithChars(broker(), &status, CMPI_RC_ERR_FAILED, "why");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, string());
    EXPECT_STREQ(asked_text, "why");
}

TEST_F(StatusHelpers, SetStatusWithCharsWithoutABrokerLeavesOutTheMessage) {
    CMPIStatus status = filled();
    CMSetStatusWithChars(nullptr, &status, CMPI_RC_ERR_FAILED, "why");
    EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(status.msg, nullptr);
}

TEST_F(StatusHelpers, NullStatusIsLeftAlone) {
    CMSetStatus(nullptr, CMPI_RC_OK);
    CMSetStatusWithString(nullptr, CMPI_RC_OK, string());
    CMSetStatusWithChars(broker(), nullptr, CMPI_RC_OK, "why");
    EXPECT_EQ(asked_text, nullptr);
}

TEST_F(StatusHelpers, ReturnFormsReturnFromTheEnclosingFunction) {
    EXPECT_EQ(return_code(true).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(return_code(false).rc, CMPI_RC_OK);
    EXPECT_EQ(return_code(true).msg, nullptr);

    EXPECT_EQ(return_string(string()).rc, CMPI_RC_ERR_NOT_FOUND);
    EXPECT_EQ(return_string(string()).msg, string());

    EXPECT_EQ(return_chars(broker()).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(return_chars(broker()).msg, string());
    EXPECT_EQ(return_chars(nullptr).rc, CMPI_RC_ERR_TYPE_MISMATCH);
    EXPECT_EQ(return_chars(nullptr).msg, nullptr);
}

TEST(CmpiLifetime, ReleaseCallsTheObjectsOwnTable) {
    static const CMPIArgs *released = nullptr;
    CMPIArgsFT table{};
    table.release = [](CMPIArgs *args) {
        released = args;
        return CMPIStatus{CMPI_RC_ERR_FAILED, nullptr};
    };
    CMPIArgs args{nullptr, &table};

    EXPECT_EQ(CMRelease(&args).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(released, &args);
}

TEST(CmpiLifetime, CloneHandsOverTheStatusAndGivesTheSameKind) {
    static CMPIInstance copy{};
    CMPIInstanceFT table{};
    table.clone = [](const CMPIInstance * /*instance*/, CMPIStatus *status) {
        CMSetStatus(status, CMPI_RC_ERROR_SYSTEM);
        return &copy;
    };
    const CMPIInstance instance{nullptr, &table};
    CMPIStatus status{};

    CMPIInstance *clone = CMClone(&instance, &status);

    EXPECT_EQ(clone, &copy);
    EXPECT_EQ(status.rc, CMPI_RC_ERROR_SYSTEM);
}

TEST(CmpiTests, ObjectIsNullWithoutAPointerOrWithoutAHandle) {
    const CMPIString present{text_of_string, nullptr};
    const CMPIString empty{nullptr, nullptr};
    const CMPIString *none = nullptr;

    EXPECT_EQ(CMIsNullObject(&present), 0);
    EXPECT_EQ(CMIsNullObject(&empty), 1);
    EXPECT_EQ(CMIsNullObject(none), 1);
}

// The bits of the state do not fit a CMPIBoolean, so a plain "and" would lose them.
TEST(CmpiTests, BitsOfStateAndTypeAreAnsweredWithZeroOrOne) {
    CMPIData data{};
    EXPECT_EQ(CMIsNullValue(data), 0);
    EXPECT_EQ(CMIsKeyValue(data), 0);
    EXPECT_EQ(CMIsArray(data), 0);

    data.state = CMPI_nullValue | CMPI_keyValue;
    data.type = CMPI_stringA;
    EXPECT_EQ(CMIsNullValue(data), 1);
    EXPECT_EQ(CMIsKeyValue(data), 1);
    EXPECT_EQ(CMIsArray(data), 1);
}

TEST(CmpiTests, AbsentAndBadItemsAreNotNullValues) {
    CMPIData data{};
    data.state = CMPI_notFound;
    EXPECT_EQ(CMIsNullValue(data), 0);
    data.state = CMPI_badValue;
    EXPECT_EQ(CMIsNullValue(data), 0);
}

TEST(CmpiNames, ContextEntryNamesEqualTheirSymbols) {
    EXPECT_STREQ(CMPIInitNameSpace, "CMPIInitNameSpace");
    EXPECT_STREQ(CMPIInvocationFlags, "CMPIInvocationFlags");
    EXPECT_STREQ(CMPIPrincipal, "CMPIPrincipal");
    EXPECT_STREQ(CMPIRole, "CMPIRole");
    EXPECT_STREQ(CMPIAcceptLanguage, "CMPIAcceptLanguage");
    EXPECT_STREQ(CMPIContentLanguage, "CMPIContentLanguage");
}
