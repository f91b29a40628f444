// Answers whose bytes the controller's model never sends: both type bits, short answers, headers
// that promise more than is there.
#include <algorithm>
#include <array>

#include "ipmi/transaction.h"
#include "tests/unit/library/ipmi_calls.h"
#include "tests/unit/library/ipmi_fixture.h"

namespace velktest {
namespace {

class IpmiAnswer : public IpmiTest {
  protected:
    IpmiAnswer() {
        attach();
        EXPECT_EQ(connect_kcs("/dev/ipmi0"), 0);
        calls_.change = [this](ipmi_recv &answer) {
            std::ranges::copy(bytes_, answer.msg.data);
            answer.msg.data_len = static_cast<unsigned short>(bytes_.size());
        };
    }

    // What every request is answered from here on.
    void answer(std::vector<unsigned char> bytes) { bytes_ = std::move(bytes); }

    int type_of(std::vector<unsigned char> bytes) {
        answer(std::move(bytes));
        int type = 7;
        EXPECT_EQ(get_bmc_type(&type), 0);
        return type;
    }

    IpmiCalls calls_;
    std::vector<unsigned char> bytes_;
};

TEST_F(IpmiAnswer, SecondGenerationsBitDecidesBeforeTheFirsts) {
    EXPECT_EQ(type_of({0, 0x80, 0x01}), 2);
    EXPECT_EQ(type_of({0, 0xFF, 0xFF}), 2);
    EXPECT_EQ(type_of({0, 0x00, 0x01}), 2);
    EXPECT_EQ(type_of({0, 0x80, 0x00}), 1);
    EXPECT_EQ(type_of({0, 0xFF, 0xFE}), 1);
    EXPECT_EQ(type_of({0, 0x7F, 0xFE}), 0);
}

TEST_F(IpmiAnswer, BytesThatAreNotThereAreZeros) {
    EXPECT_EQ(type_of({0}), 0);
    EXPECT_EQ(type_of({0, 0x80}), 1);
    EXPECT_EQ(type_of({}), 0);
}

TEST_F(IpmiAnswer, OnlyTheLowestBitIsTheResult) {
    answer({0, 0, 0xFE});
    EXPECT_EQ(begin_opt_update(1), -2);
    answer({0, 0, 0xFF});
    EXPECT_EQ(begin_opt_update(1), 0);
    answer({0});
    EXPECT_EQ(begin_opt_update(1), -2);
}

TEST_F(IpmiAnswer, HandleIsTakenFromItsFourBytesAlone) {
    answer({0, 0xAA, 1, 0xBB, 0xCC, 0xDD, 0x80, 0x90, 0xA0, 0xB0, 0xEE});
    int handle = -1;
    EXPECT_EQ(create_ipmi_transaction(&handle), 0);
    EXPECT_EQ(static_cast<unsigned>(handle), 0x8090A0B0U);
}

TEST_F(IpmiAnswer, HandleThatWasCutOffIsZeros) {
    answer({0, 0, 1, 0, 0, 0x44, 0x12});
    int handle = -1;
    EXPECT_EQ(create_ipmi_transaction(&handle), 0);
    EXPECT_EQ(handle, 0x12000000);
}

TEST_F(IpmiAnswer, TextEndsWithItsLength) {
    answer({0, 0, 1, 0, 0, 0x82, 'y', 'e', 's'});
    int secure = 7;
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(secure, 0);
}

TEST_F(IpmiAnswer, TextLengthIsTheHeadersLowSevenBits) {
    answer({0, 0, 1, 0, 0, 0x03, 'y', 'e', 's'});
    int secure = 7;
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(secure, 1);
}

TEST_F(IpmiAnswer, TextThatPromisesMoreEndsWithTheAnswer) {
    std::vector<unsigned char> bytes{0, 0, 1, 0, 0, 0xFF};
    bytes.resize(128, 'x');
    std::ranges::copy(std::string_view("yes"), bytes.end() - 3);
    answer(bytes);
    int secure = 7;
    EXPECT_EQ(get_secure_mode(&secure), 0);
    EXPECT_EQ(secure, 1);
}

}  // namespace
}  // namespace velktest
