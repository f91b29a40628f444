// What the kernel's driver does, on which the library builds and which the stand-in host's device
// repeats: tests/unit/host/shim_device_*_test.cpp state the same of the shim.
#include "tests/integration/kernel/kernel_fixture.h"

namespace velkkernel {
namespace {

using enum ControllerFault;
using ::testing::AllOf;
using ::testing::ElementsAre;
using ::testing::Ge;
using ::testing::Le;
using ::testing::StartsWith;

class DriverOnKernel : public KernelTest {};

constexpr const char *kDeviceId =
    "netfn=07 cmd=01 data=00 20 01 05 01 02 00 00 00 00 00 00 00 00 00 00";

TEST_P(DriverOnKernel, KnowsTheControlCallsOfBothAbis) {
    boot("codes");
    EXPECT_EQ(result_of("codes"), GetParam() == Abi::k64 ? "send=0x8028690D receive=0xC030690B"
                                                         : "send=0x8014690D receive=0xC018690B");
}

TEST_P(DriverOnKernel, AnswersCallByCall) {
    boot(
        "open,fetch,refusals,request:06:99,request:3A:C1,send:7:3A:C1,wait:5000,keep:2,fetch:2,"
        "fetch,close,open,send:8:06:01,wait:5000,fetch");
    EXPECT_EQ(result_of("fetch"), "EAGAIN") << "on a blocking descriptor, too";
    EXPECT_EQ(result_of("refusals"),
              "odd function EINVAL, bad channel EINVAL, short address EINVAL");
    EXPECT_EQ(untimed(result_of("request:06:99")), "0 data=C1");
    EXPECT_EQ(untimed(result_of("request:3A:C1")), "0 data=00 00 01");
    EXPECT_EQ(result_of("keep:2"), "EMSGSIZE");
    EXPECT_EQ(result_of("fetch:2"), "EMSGSIZE id=7 netfn=3B cmd=C1 data=00 00") << "it had stayed";
    EXPECT_EQ(result_of("fetch", 1), "EAGAIN") << "and is gone then";
    EXPECT_EQ(result_of("fetch", 2), std::string("id=8 ") + kDeviceId);
}

TEST_P(DriverOnKernel, ReplacesAnswersOfAnotherFunctionOrCommand) {
    boot("open,request:3A:C1,request:3A:C1",
         {fault("bmc.type", kWrongCommand, 0, 1), fault("bmc.type", kWrongFunction, 0, 1)});
    EXPECT_EQ(untimed(result_of("request:3A:C1")), "0 data=FF");
    EXPECT_EQ(untimed(result_of("request:3A:C1", 1)), "0 data=FF");
}

TEST_P(DriverOnKernel, CutsAnswersAt270Bytes) {
    boot("open,send:1:3A:C1,wait:5000,fetch:300,send:2:3A:C1,wait:5000,fetch:300",
         {fault("bmc.type", kLonger, 270, 1), fault("bmc.type", kLonger, 271, 1)});
    const std::string longest = result_of("fetch:300");
    const std::string cut = result_of("fetch:300", 1);
    EXPECT_THAT(longest, StartsWith("id=1 netfn=3B cmd=C1 data=00 00 01 00"));
    EXPECT_THAT(cut, StartsWith("id=2 netfn=3B cmd=C1 data=C6 00 01 00"));
    EXPECT_EQ(longest.size(), std::string("id=1 netfn=3B cmd=C1 data=").size() + 270 * 3 - 1);
    EXPECT_EQ(cut.size(), longest.size());
}

TEST_P(DriverOnKernel, SendsALateRequestAgain) {
    boot("open,type,send:9:06:01,wait:5000,fetch,wait:5000,fetch",
         {fault("bmc.type", kLate, 7, 1)});
    EXPECT_EQ(untimed(result_of("type")), "-1 type=-1");
    EXPECT_THAT(ms_of(result_of("type")), AllOf(Ge(5000), Le(6900)));
    EXPECT_EQ(result_of("fetch"), "id=22444 netfn=3B cmd=C1 data=00 00 01") << "the old one first";
    EXPECT_EQ(result_of("fetch", 1), std::string("id=9 ") + kDeviceId);
    EXPECT_THAT(outcome_.words(),
                ElementsAre("type query -> second generation, 7 s late",
                            "type query -> second generation", "get device id -> IPMI 2.0"));
}

TEST_P(DriverOnKernel, GivesUpOnASilentControllerAfter55Seconds) {
    boot("open,send:1:3A:C1,wait:70000,fetch", {fault("bmc.type", kNoAnswer)});
    EXPECT_THAT(result_of("wait:70000"), StartsWith("readable"));
    EXPECT_THAT(ms_of(result_of("wait:70000")), AllOf(Ge(54'500), Le(65'000)));
    EXPECT_EQ(result_of("fetch"), "id=1 netfn=3B cmd=C1 data=FF");
    EXPECT_THAT(outcome_.words(), ElementsAre("type query -> no answer"));
}

TEST_P(DriverOnKernel, HandsAnswersOnASharedDescriptorToWhoeverComesFirst) {
    boot("swap,apart");
    EXPECT_EQ(result_of("swap"), "device id got C1, type got 01");
    EXPECT_EQ(result_of("apart"), "device id got 01, type got C1");
}

TEST_P(DriverOnKernel, WakesAWaiterWhoseDescriptorWasClosedWhenTheAnswerComes) {
    boot("closed", {fault("bmc.type", kLate, 2, 1)});
    EXPECT_EQ(result_of("closed"), "readable EBADF");
}

TEST_P(DriverOnKernel, TellsOfADeviceThatGoesAway) {
    boot("open,unbind,send:9:06:01,wait:1000,fetch,close,open");
    EXPECT_EQ(result_of("send:9:06:01"), "ENODEV");
    EXPECT_THAT(result_of("wait:1000"), StartsWith("timeout"));
    EXPECT_EQ(result_of("fetch"), "EAGAIN");
    EXPECT_EQ(result_of("open", 1), "-2 ENOENT");
}

INSTANTIATE_TEST_SUITE_P(Abi, DriverOnKernel, each_abi(), abi_of);

}  // namespace
}  // namespace velkkernel
