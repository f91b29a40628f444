// The list of payloads that comes of it: adapters in turn, the bounds of the tables, and texts that
// run on inside of them.
#include <cstddef>
#include <span>

#include "tests/unit/library/applicability_fixture.h"

namespace velktest {
namespace {

using ::testing::ElementsAre;
using ::testing::IsEmpty;

constexpr std::size_t kEntry = sizeof(velk::PayloadDevice);
constexpr std::size_t kDevice = offsetof(velk::PayloadDevice, DeviceID);

class ApplicabilityTable : public ApplicabilityTest {
  protected:
    static std::span<char> table() {
        return {reinterpret_cast<char *>(package().PayloadDeviceIDArray),
                sizeof package().PayloadDeviceIDArray};
    }

    static void fill_table(char filler) { std::ranges::fill(table(), filler); }

    // What is left of the record behind the table.
    static std::string rest_of_record() {
        const std::string image = record_image(0);
        return image.substr(offsetof(velk::PackageRecord, PayloadDeviceIDArray) + table().size());
    }

    // A configuration of `count` payloads for each of these adapters.
    void offer(int count, const std::vector<std::string> &dfns) const {
        std::vector<ConfigPayload> payloads;
        for (int i = 0; i < count; ++i) {
            payloads.push_back({"fw" + std::to_string(i), dfns, std::nullopt});
        }
        write_config(payload_config(payloads));
    }
};

TEST_F(ApplicabilityTable, RunIsLoggedStepByStep) {
    add_adapter("1234ABCD", "dev");
    write_config(payload_config({{"fw_a.bin", {"1234ABCD"}, 2}}));
    EXPECT_EQ(parse(), 1);
    const std::string path = std::string(kPayloadConfig) + "\n";
    EXPECT_EQ(log(),
              entries({"Enter parsePayloadDeviceIDArray.\n", "pkgInstance[pkgIdx].dfnnumber=1\n",
                       "current index: 0, last_size=0\n", "filename is "}) +
                  path +
                  entries({"current DFN=\"1234ABCD\"\n", "nothing done for 1st getProp\n",
                           "set order to 2\n", "fw_a.bin\n", "found DFN\n", "found dfn match\n",
                           "nothing done for 1st getProp\n", "end of config file\n", "fw_a.bin\n",
                           "now last_size is:1\n", "before end of parse, last_size is:1\n",
                           "pkgInstance[pkgIdx].payloadnum set to last_size, value is 1\n",
                           "parsePayloadDeviceIDArray finished.\n"}));
    EXPECT_THAT(to_install(), ElementsAre("fw_a.bin for dev"));
}

TEST_F(ApplicabilityTable, WithoutAdaptersTheFileIsNotOpened) {
    package().payloadnum = 5;
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(package().payloadnum, 0);
    EXPECT_FALSE(logged("filename is "));
}

TEST_F(ApplicabilityTable, MissingFileFails) {
    add_adapter("ABCD", "dev");
    package().payloadnum = 5;
    EXPECT_EQ(parse(), 0);
    EXPECT_EQ(package().payloadnum, 5);
    EXPECT_TRUE(log().ends_with(entry("open file failed, return 0\n")));
}

TEST_F(ApplicabilityTable, UnreadableFileFails) {
    add_adapter("ABCD", "dev");
    write_config(payload_config({{"fw", {"ABCD"}, 1}}));
    fail_step(std::string("open:") + kPayloadConfig, EACCES);
    EXPECT_EQ(parse(), 0);
}

TEST_F(ApplicabilityTable, FileThatWasReadAndMatchedNothingLeavesNoPayload) {
    add_adapter("ABCD", "dev");
    add_adapter("ABCE", "dev2");
    package().payloadnum = 5;
    write_config(payload_config({{"fw", {"WXYZ"}, 1}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(package().payloadnum, 0);
    EXPECT_EQ(occurrences(log(), "!has_payload\n"), 2);
    EXPECT_EQ(occurrences(log(), "now last_size is:"), 0);
}

TEST_F(ApplicabilityTable, AdapterWithoutAPayloadAfterOneWithIsTakenWithNone) {
    add_adapter("ABCD", "dev");
    add_adapter("none", "dev2");
    write_config(payload_config({{"fw", {"ABCD"}, 1}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_THAT(to_install(), ElementsAre("fw for dev"));
    EXPECT_EQ(occurrences(log(), "!has_payload\n"), 0);
    EXPECT_EQ(occurrences(log(), "now last_size is:1\n"), 2);
}

TEST_F(ApplicabilityTable, PayloadForTwoAdaptersIsListedTwice) {
    add_adapter("ABCD", "d1");
    add_adapter("ABCD", "d2");
    add_adapter("WXYZ", "d3");
    write_config(payload_config({{"fw", {"WXYZ", "ABCD"}, 1}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_THAT(to_install(), ElementsAre("fw for d1", "fw for d2", "fw for d3"));
}

TEST_F(ApplicabilityTable, FailureAtALaterAdapterKeepsTheCount) {
    add_adapter("ABCD", "d1");
    add_adapter("WXYZ", "d2");
    package().payloadnum = 5;
    offer(10, {"ABCD"});  // with the last of them the first adapter's scan ends
    std::string config = read_file(at(kPayloadConfig));
    config.insert(config.find("</updateConfiguration>"), "<payload></payload>\n");
    write_config(config);
    EXPECT_EQ(parse(), 0);
    EXPECT_EQ(package().payloadnum, 5);
}

TEST_F(ApplicabilityTable, FileIsClosedAfterEveryAdapter) {
    for (int i = 0; i < velk::kMaxDevices; ++i) {
        add_adapter("none", "dev");
    }
    offer(1, {"ABCD"});
    const auto before = open_descriptors();
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(open_descriptors(), before);
    EXPECT_EQ(occurrences(log(), "filename is "), velk::kMaxDevices);
}

TEST_F(ApplicabilityTable, FiftyFirstDeviceIsNotRead) {
    for (int i = 0; i < velk::kMaxDevices; ++i) {
        add_adapter("none", "dev");
    }
    package().dfnnumber = velk::kMaxDevices + 1;
    offer(1, {"ABCD"});
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(occurrences(log(), "current index: "), velk::kMaxDevices);
}

TEST_F(ApplicabilityTable, NegativeCountsReadNothing) {
    package().dfnnumber = -1;
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(package().payloadnum, 0);
}

TEST_F(ApplicabilityTable, IndexOutsideOfTheTableFails) {
    const std::string before = session_image();
    EXPECT_EQ(parsePayloadDeviceIDArray(-1), 0);
    EXPECT_EQ(parsePayloadDeviceIDArray(velk::kMaxPackages), 0);
    EXPECT_EQ(session_image(), before);
}

TEST_F(ApplicabilityTable, TwentyPayloadsWantNoMoreScratchThanTen) {
    for (const char *device : {"d1", "d2", "d3"}) {
        add_adapter("ABCD", device);
    }
    offer(10, {"ABCD"});
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(package().payloadnum, 30);
    EXPECT_EQ(to_install().back(), "fw9 for d3");
}

TEST_F(ApplicabilityTable, ScratchOfTheFormerAdapterIsCleared) {
    add_adapter("ABCD", "d1");
    add_adapter("none", "d2");
    payload_result[9].order = 7;
    write_config(payload_config({{"fw", {"ABCD"}, 4}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(payload_result[0].order, 0);
    EXPECT_STREQ(payload_result[0].payload, "");
    EXPECT_EQ(payload_result[9].order, 7) << "only as many as were collected";
}

TEST_F(ApplicabilityTable, HundredAndFirstPayloadIsDropped) {
    for (int i = 0; i < 10; ++i) {
        add_adapter("ABCD", "d" + std::to_string(i));
    }
    add_adapter("WXYZ", "last");
    offer(10, {"ABCD", "WXYZ"});
    const std::string behind = rest_of_record();
    const std::string next = record_image(1);
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(package().payloadnum, velk::kMaxPayloads);
    EXPECT_EQ(to_install().back(), "fw9 for d9");
    package().payloadnum = 0;
    EXPECT_EQ(rest_of_record(), behind);
    EXPECT_EQ(record_image(1), next);
}

// ---- Names of any length ----

TEST_F(ApplicabilityTable, NameOf199FillsItsField) {
    add_adapter("ABCD", "dev");
    const std::string name(199, 'n');
    write_config(payload_config({{name, {"ABCD"}, 1}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_THAT(to_install(), ElementsAre(name + " for dev"));
}

TEST_F(ApplicabilityTable, LongerNamesRunOnIntoTheDevice) {
    add_adapter("ABCD", "dev");
    for (const std::size_t length : {200U, 201U, 400U, 990U}) {
        write_config(payload_config({{std::string(length, 'n'), {"ABCD"}, 1}}));
        EXPECT_EQ(parse(), 1);
        EXPECT_THAT(to_install(), ElementsAre(std::string(200, 'n') + "dev for dev")) << length;
    }
}

TEST_F(ApplicabilityTable, CopyClearsWhatFollowsUpToItsTerminator) {
    add_adapter("ABCD", "dev");
    fill_table('z');
    write_config(payload_config({{"fw", {"ABCD"}, 1}}));
    EXPECT_EQ(parse(), 1);
    std::string expected(table().size(), 'z');
    expected.replace(0, 1224, 1224, '\0');
    expected.replace(0, 2, "fw");
    expected.replace(kDevice, 3, "dev");
    EXPECT_EQ(std::string(table().data(), table().size()), expected);
}

TEST_F(ApplicabilityTable, LaterEntriesOverwriteWhatRanOn) {
    add_adapter("ABCD", "d1");
    add_adapter("ABCD", "d2");
    fill_table('z');
    const std::string name(900, 'n');
    write_config(payload_config({{name, {"ABCD"}, 1}, {"fw", {"ABCD"}, 2}}));
    EXPECT_EQ(parse(), 1);
    const std::string run_on(200, 'n');
    EXPECT_THAT(to_install(),
                ElementsAre(run_on + "d1 for d1", "fw for d1", run_on + "d2 for d2", "fw for d2"));
    EXPECT_EQ(table()[3 * kEntry + 1223], '\0');
    EXPECT_EQ(table()[3 * kEntry + 1224], 'z');
}

TEST_F(ApplicabilityTable, NothingRunsOutOfTheTable) {
    for (int i = 0; i < 10; ++i) {
        add_adapter("ABCD", std::string(199, 'd'));
    }
    std::vector<ConfigPayload> payloads(10, {std::string(1000, 'n'), {"ABCD"}, std::nullopt});
    write_config(payload_config(payloads));
    fill_table('z');
    package().installer = [](int, const CMPIContext *) { return 7; };
    package().payloadnum = velk::kMaxPayloads;
    const std::string behind = rest_of_record();
    const std::string next = record_image(1);
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(package().payloadnum, velk::kMaxPayloads);
    EXPECT_EQ(rest_of_record(), behind);
    EXPECT_EQ(record_image(1), next);
    const std::size_t last = (velk::kMaxPayloads - 1) * kEntry;
    EXPECT_EQ(std::string(&table()[last]), std::string(200, 'n') + std::string(199, 'd'));
}

TEST_F(ApplicabilityTable, DeviceWithoutATerminatorStaysInTheTable) {
    for (int i = 0; i < 10; ++i) {
        add_adapter("ABCD", "dev");
    }
    std::ranges::fill(package().DFNDeviceIDArray[9].DeviceID, 'd');
    offer(10, {"ABCD"});
    EXPECT_EQ(parse(), 1);
    EXPECT_EQ(to_install().back(), "fw9 for " + std::string(199, 'd'));
    EXPECT_EQ(to_install()[98].substr(0, 8), "fw8 for ");
}

TEST_F(ApplicabilityTable, LongDfnsAreMatchedWhole) {
    const std::string dfn(199, 'D');
    add_adapter(dfn, "dev");
    write_config(payload_config({{"no", {dfn + "D", dfn.substr(1)}, 1}, {"fw", {dfn}, 1}}));
    EXPECT_EQ(parse(), 1);
    EXPECT_THAT(to_install(), ElementsAre("fw for dev"));
    EXPECT_TRUE(logged("current DFN=\"" + dfn + "\"\n"));
}

}  // namespace
}  // namespace velktest
